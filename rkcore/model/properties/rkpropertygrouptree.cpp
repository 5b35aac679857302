#include "properties/rkpropertygrouptree.h"

#include "properties/rkproperty.h"
#include "properties/rkpropertygroup.h"

namespace
{

QStringList splitPath(const QString& path)
{
    return path.split(QLatin1Char('/'), Qt::SkipEmptyParts);
}

RkPropertyGroup* findIn(const QList<RkPropertyGroup*>& groups, const QString& name)
{
    for (RkPropertyGroup* g : groups) {
        if (g->getName() == name)
            return g;
    }
    return nullptr;
}

} // namespace

RkPropertyGroupTree::RkPropertyGroupTree(QObject* parent) : QObject(parent) {}

RkPropertyGroupTree::~RkPropertyGroupTree()
{
    // Properties that outlive the tree must not call back into it.
    for (RkProperty* p : getAllProperties())
        disconnect(p, nullptr, this, nullptr);
}

RkPropertyGroup* RkPropertyGroupTree::getFirstChild() const
{
    return m_top.value(0);
}

QList<RkPropertyGroup*> RkPropertyGroupTree::getTopGroups() const
{
    return m_top;
}

RkPropertyGroup* RkPropertyGroupTree::findChild(const QString& path) const
{
    const QStringList parts = splitPath(path);
    if (parts.isEmpty())
        return nullptr;
    RkPropertyGroup* group = findIn(m_top, parts.first());
    for (int i = 1; group && i < parts.size(); ++i)
        group = group->findChild(parts.at(i));
    return group;
}

RkPropertyGroup* RkPropertyGroupTree::findOrCreateGroup(const QString& path)
{
    QStringList parts = splitPath(path);
    if (parts.isEmpty())
        parts << QStringLiteral("General");
    RkPropertyGroup* group = findIn(m_top, parts.first());
    if (!group) {
        group = new RkPropertyGroup(parts.first(), nullptr, this);
        m_top.append(group);
    }
    for (int i = 1; i < parts.size(); ++i) {
        RkPropertyGroup* child = group->findChild(parts.at(i));
        if (!child) {
            child = new RkPropertyGroup(parts.at(i), group, this);
            group->m_children.append(child);
        }
        group = child;
    }
    return group;
}

static RkPropertyGroup* groupHolding(const QList<RkPropertyGroup*>& groups, const QObject* p)
{
    for (RkPropertyGroup* g : groups) {
        for (RkProperty* q : g->getProperties()) {
            if (static_cast<QObject*>(q) == p)
                return g;
        }
        if (RkPropertyGroup* found = groupHolding(g->getChildren(), p))
            return found;
    }
    return nullptr;
}

void RkPropertyGroupTree::addProperty(RkProperty* property, const QString& path)
{
    if (!property)
        return;
    RkPropertyGroup* old = groupHolding(m_top, property);
    RkPropertyGroup* group = findOrCreateGroup(path);
    if (old == group)
        return;
    if (old) {
        old->m_properties.removeAll(property);
    } else {
        connect(property, &QObject::destroyed, this, [this](QObject* object) {
            if (RkPropertyGroup* g = groupHolding(m_top, object)) {
                for (int i = g->m_properties.size() - 1; i >= 0; --i) {
                    if (static_cast<QObject*>(g->m_properties.at(i)) == object)
                        g->m_properties.removeAt(i);
                }
                dropEmptyGroups(g);
                Q_EMIT treeChanged();
            }
        });
    }
    group->m_properties.append(property);
    property->setPath(group->getPath());
    if (old)
        dropEmptyGroups(old);
    Q_EMIT treeChanged();
}

void RkPropertyGroupTree::removeProperty(RkProperty* property)
{
    RkPropertyGroup* group = groupHolding(m_top, property);
    if (!group)
        return;
    disconnect(property, &QObject::destroyed, this, nullptr);
    group->m_properties.removeAll(property);
    dropEmptyGroups(group);
    Q_EMIT treeChanged();
}

void RkPropertyGroupTree::dropEmptyGroups(RkPropertyGroup* group)
{
    while (group && group->m_properties.isEmpty() && group->m_children.isEmpty()) {
        RkPropertyGroup* parentGroup = group->m_parentGroup;
        if (parentGroup)
            parentGroup->m_children.removeAll(group);
        else
            m_top.removeAll(group);
        // Someone may be walking the groups right now; the tree keeps owning it until then.
        group->m_parentGroup = nullptr;
        group->setParent(this);
        group->deleteLater();
        group = parentGroup;
    }
}

static void collect(const QList<RkPropertyGroup*>& groups, QList<RkProperty*>& out)
{
    for (RkPropertyGroup* g : groups) {
        out += g->getProperties();
        collect(g->getChildren(), out);
    }
}

QList<RkProperty*> RkPropertyGroupTree::getAllProperties() const
{
    QList<RkProperty*> out;
    collect(m_top, out);
    return out;
}
