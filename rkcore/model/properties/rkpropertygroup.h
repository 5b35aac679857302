#pragma once

#include "rkcoreglobal.h"

#include <QList>
#include <QObject>

class RkProperty;
class RkPropertyGroupTree;

// One level of an element's property groups: a name, the properties filed directly under it
// and its sub-groups. The path joins the names from the top with "/".
class RKCORE_EXPORT RkPropertyGroup : public QObject
{
    Q_OBJECT
public:
    ~RkPropertyGroup() override;

    QString getName() const;
    QString getPath() const;
    RkPropertyGroup* getParentGroup() const;
    RkPropertyGroup* getFirstChild() const;
    RkPropertyGroup* getNextSibling() const;
    QList<RkPropertyGroup*> getChildren() const;
    RkPropertyGroup* findChild(const QString& name) const;

    int getNumProperties() const;
    RkProperty* getProperty(int index) const;
    QList<RkProperty*> getProperties() const;

    bool getCollapsed() const;

public Q_SLOTS:
    void setCollapsed(bool collapsed);

Q_SIGNALS:
    void collapsedChanged(bool collapsed);

private:
    friend class RkPropertyGroupTree;
    RkPropertyGroup(const QString& name, RkPropertyGroup* parentGroup, RkPropertyGroupTree* tree);

    QString m_name;
    RkPropertyGroup* m_parentGroup = nullptr;
    RkPropertyGroupTree* m_tree = nullptr;
    QList<RkPropertyGroup*> m_children;
    QList<RkProperty*> m_properties;
    bool m_collapsed = false;
};
