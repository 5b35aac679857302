#include "scene/rkelement.h"

#include "properties/rkproperty.h"
#include "properties/rkpropertygrouptree.h"
#include "scene/rkelementdata.h"

#include <QHash>
#include <QPointer>

namespace
{

// Drops a destroyed object from a list by address only: by the time destroyed() arrives the
// object is no longer of its own class.
template <typename T> void dropDestroyed(QList<T*>& list, QObject* object)
{
    for (int i = list.size() - 1; i >= 0; --i) {
        if (static_cast<QObject*>(list.at(i)) == object)
            list.removeAt(i);
    }
}

} // namespace

struct RkElement::Private {
    QString label;
    RkPropertyGroupTree* groups = nullptr; // child of the element
    QList<RkProperty*> properties;
    // Look-up by name for big rigs; checked against the name on use, as names may change.
    QHash<QString, RkProperty*> byName;
    QList<RkElementData*> dataItems;
    QPointer<RkElement> elementParent;
};

RkElement::RkElement(QObject* parent, const QString& name)
    : RkBase(parent, name), d(std::make_unique<Private>())
{
    d->groups = new RkPropertyGroupTree(this);
    connect(d->groups, &RkPropertyGroupTree::treeChanged, this, &RkElement::propertyTreeChanged);
}

RkElement::~RkElement()
{
    // Data items first: they may point at this element's properties.
    const auto items = d->dataItems;
    d->dataItems.clear();
    qDeleteAll(items);
    // The tree goes before the properties so that it does not follow each one out.
    disconnect(d->groups, nullptr, this, nullptr);
    delete d->groups;
    d->groups = nullptr;
    const auto props = d->properties;
    d->properties.clear();
    for (RkProperty* p : props) {
        disconnect(p, nullptr, this, nullptr);
        delete p;
    }
}

QString RkElement::getLabel() const
{
    return d->label.isEmpty() ? getName() : d->label;
}

void RkElement::setLabel(const QString& label)
{
    if (label == d->label)
        return;
    d->label = label;
    Q_EMIT labelChanged(getLabel());
}

RkPropertyGroupTree* RkElement::getPropertyGroups() const
{
    return d->groups;
}

void RkElement::addProperty(RkProperty* property, const QString& groupPath)
{
    if (!property)
        return;
    if (!d->properties.contains(property)) {
        property->setParent(this);
        d->properties.append(property);
        d->byName.insert(property->getName(), property);
        connect(property, &QObject::destroyed, this, [this](QObject* object) {
            dropDestroyed(d->properties, object);
            for (auto it = d->byName.begin(); it != d->byName.end();) {
                if (static_cast<QObject*>(it.value()) == object)
                    it = d->byName.erase(it);
                else
                    ++it;
            }
        });
    }
    d->groups->addProperty(property, groupPath);
}

void RkElement::removeProperty(RkProperty* property)
{
    if (!property || !d->properties.contains(property))
        return;
    d->properties.removeAll(property);
    d->byName.remove(property->getName());
    d->groups->removeProperty(property);
    delete property;
}

RkProperty* RkElement::findProperty(const QString& name) const
{
    RkProperty* hit = d->byName.value(name);
    if (hit && hit->getName() == name)
        return hit;
    for (RkProperty* p : d->properties) {
        if (p->getName() == name)
            return p;
    }
    return nullptr;
}

int RkElement::getNumProperties() const
{
    return d->properties.size();
}

RkProperty* RkElement::getProperty(int index) const
{
    return d->properties.value(index);
}

QList<RkProperty*> RkElement::getProperties() const
{
    return d->properties;
}

RkElement* RkElement::elementOf(const RkProperty* property)
{
    return property ? qobject_cast<RkElement*>(property->parent()) : nullptr;
}

void RkElement::addDataItem(RkElementData* item)
{
    if (!item || d->dataItems.contains(item))
        return;
    if (RkElementData* old = findDataItem(item->getName())) {
        d->dataItems.removeAll(old);
        delete old;
    }
    if (RkElement* previous = item->getElement())
        previous->takeDataItem(item);
    item->setParent(this);
    d->dataItems.append(item);
    connect(item, &QObject::destroyed, this,
            [this](QObject* object) { dropDestroyed(d->dataItems, object); });
}

RkElementData* RkElement::findDataItem(const QString& name) const
{
    for (RkElementData* item : d->dataItems) {
        if (item->getName() == name)
            return item;
    }
    return nullptr;
}

RkElementData* RkElement::takeDataItem(RkElementData* item)
{
    if (!item || !d->dataItems.removeAll(item))
        return nullptr;
    disconnect(item, &QObject::destroyed, this, nullptr);
    item->setParent(nullptr);
    return item;
}

QList<RkElementData*> RkElement::getDataItems() const
{
    return d->dataItems;
}

RkElement* RkElement::getElementParent() const
{
    return d->elementParent;
}

void RkElement::setElementParent(RkElement* parent)
{
    d->elementParent = parent;
}
