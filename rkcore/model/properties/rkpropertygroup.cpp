#include "properties/rkpropertygroup.h"

#include "properties/rkpropertygrouptree.h"

RkPropertyGroup::RkPropertyGroup(const QString& name, RkPropertyGroup* parentGroup,
                                 RkPropertyGroupTree* tree)
    : QObject(parentGroup ? static_cast<QObject*>(parentGroup) : tree), m_name(name),
      m_parentGroup(parentGroup), m_tree(tree)
{
}

RkPropertyGroup::~RkPropertyGroup() = default;

QString RkPropertyGroup::getName() const
{
    return m_name;
}

QString RkPropertyGroup::getPath() const
{
    return m_parentGroup ? m_parentGroup->getPath() + QLatin1Char('/') + m_name : m_name;
}

RkPropertyGroup* RkPropertyGroup::getParentGroup() const
{
    return m_parentGroup;
}

RkPropertyGroup* RkPropertyGroup::getFirstChild() const
{
    return m_children.value(0);
}

RkPropertyGroup* RkPropertyGroup::getNextSibling() const
{
    const QList<RkPropertyGroup*>& siblings =
        m_parentGroup ? m_parentGroup->m_children : m_tree->m_top;
    const int i = siblings.indexOf(const_cast<RkPropertyGroup*>(this));
    return i >= 0 ? siblings.value(i + 1) : nullptr;
}

QList<RkPropertyGroup*> RkPropertyGroup::getChildren() const
{
    return m_children;
}

RkPropertyGroup* RkPropertyGroup::findChild(const QString& name) const
{
    for (RkPropertyGroup* g : m_children) {
        if (g->m_name == name)
            return g;
    }
    return nullptr;
}

int RkPropertyGroup::getNumProperties() const
{
    return m_properties.size();
}

RkProperty* RkPropertyGroup::getProperty(int index) const
{
    return m_properties.value(index);
}

QList<RkProperty*> RkPropertyGroup::getProperties() const
{
    return m_properties;
}

bool RkPropertyGroup::getCollapsed() const
{
    return m_collapsed;
}

void RkPropertyGroup::setCollapsed(bool collapsed)
{
    if (collapsed == m_collapsed)
        return;
    m_collapsed = collapsed;
    Q_EMIT collapsedChanged(collapsed);
}
