#pragma once

#include "io/rkbase.h"

#include <QList>

#include <memory>

class RkElementData;
class RkProperty;
class RkPropertyGroupTree;

// Something of the scene that has a label, properties in groups and attached data items.
class RKCORE_EXPORT RkElement : public RkBase
{
    Q_OBJECT
public:
    explicit RkElement(QObject* parent = nullptr, const QString& name = QString());
    ~RkElement() override;

    QString getLabel() const;
    void setLabel(const QString& label);

    // The element's properties, grouped by path. The element owns the tree.
    RkPropertyGroupTree* getPropertyGroups() const;
    // Takes ownership of the property and files it under the group path ("Morphs/Head").
    void addProperty(RkProperty* property, const QString& groupPath);
    // Deletes the property.
    void removeProperty(RkProperty* property);
    RkProperty* findProperty(const QString& name) const;
    int getNumProperties() const;
    RkProperty* getProperty(int index) const;
    QList<RkProperty*> getProperties() const;
    // The element that owns the property, or null. Properties are filed below their element
    // without knowing its class; this is the way back up.
    static RkElement* elementOf(const RkProperty* property);

    // Takes ownership of the item; an item with the same name is replaced (and deleted).
    void addDataItem(RkElementData* item);
    RkElementData* findDataItem(const QString& name) const;
    // Detaches the item and hands it back to the caller.
    RkElementData* takeDataItem(RkElementData* item);
    QList<RkElementData*> getDataItems() const;

    RkElement* getElementParent() const;
    void setElementParent(RkElement* parent);

Q_SIGNALS:
    void labelChanged(const QString& label);
    void propertyTreeChanged();

private:
    struct Private;
    std::unique_ptr<Private> d;
};
