#pragma once

#include "rkcoreglobal.h"

#include <QList>
#include <QObject>

class RkProperty;
class RkPropertyGroup;

// The property groups of one element. The tree owns its groups, not the properties: a property
// deleted elsewhere leaves its group by itself, and a group left empty is removed.
class RKCORE_EXPORT RkPropertyGroupTree : public QObject
{
    Q_OBJECT
public:
    explicit RkPropertyGroupTree(QObject* parent = nullptr);
    ~RkPropertyGroupTree() override;

    RkPropertyGroup* getFirstChild() const;
    QList<RkPropertyGroup*> getTopGroups() const;
    // The group with this path ("Morphs/Head/Face"), or null. A leading "/" is ignored.
    RkPropertyGroup* findChild(const QString& path) const;
    // The group with this path, created with every missing level.
    RkPropertyGroup* findOrCreateGroup(const QString& path);

    // Files the property under the path (and sets its path); it leaves any group it was in.
    void addProperty(RkProperty* property, const QString& path);
    void removeProperty(RkProperty* property);
    // Every property of the tree, group by group, depth first.
    QList<RkProperty*> getAllProperties() const;

Q_SIGNALS:
    void treeChanged();

private:
    friend class RkPropertyGroup;
    void dropEmptyGroups(RkPropertyGroup* group);

    QList<RkPropertyGroup*> m_top;
};
