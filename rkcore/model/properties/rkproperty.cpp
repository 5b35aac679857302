#include "properties/rkproperty.h"

#include "io/rkinfile.h"
#include "log/rklog.h"
#include "properties/rkpropertychangecommand.h"
#include "undo/rkundostack.h"

struct RkProperty::Private {
    QString label;
    QString path;
    bool hidden = false;
    bool favorite = false;
    bool globalFavorite = false;
    bool selected = false;
    bool locked = false;
    bool editing = false;
    // The value beginEdit() found, put back by cancelEdit().
    QVariant editStart;
    bool refusalLogged = false;
};

RkProperty::RkProperty(const QString& name, const QString& label, QObject* parent)
    : RkBase(parent, name), d(std::make_unique<Private>())
{
    d->label = label;
}

RkProperty::~RkProperty() = default;

QString RkProperty::getLabel() const
{
    return d->label;
}

void RkProperty::setLabel(const QString& label)
{
    if (label == d->label)
        return;
    d->label = label;
    Q_EMIT labelChanged(label);
    Q_EMIT changed();
}

QString RkProperty::getPath() const
{
    return d->path;
}

void RkProperty::setPath(const QString& path)
{
    d->path = path;
}

bool RkProperty::isHidden() const
{
    return d->hidden;
}

void RkProperty::setHidden(bool hidden)
{
    if (hidden == d->hidden)
        return;
    d->hidden = hidden;
    Q_EMIT flagsChanged();
    Q_EMIT changed();
}

bool RkProperty::isFavorite() const
{
    return d->favorite;
}

void RkProperty::setIsFavorite(bool on)
{
    if (on == d->favorite)
        return;
    d->favorite = on;
    Q_EMIT flagsChanged();
    Q_EMIT changed();
}

bool RkProperty::isGlobalFavorite() const
{
    return d->globalFavorite;
}

void RkProperty::setIsGlobalFavorite(bool on)
{
    if (on == d->globalFavorite)
        return;
    d->globalFavorite = on;
    Q_EMIT flagsChanged();
    Q_EMIT changed();
}

bool RkProperty::isSelected() const
{
    return d->selected;
}

void RkProperty::setSelected(bool on)
{
    if (on == d->selected)
        return;
    d->selected = on;
    Q_EMIT selectedChanged(on);
}

bool RkProperty::isLocked() const
{
    return d->locked;
}

void RkProperty::setLocked(bool on)
{
    if (on == d->locked)
        return;
    d->locked = on;
    Q_EMIT flagsChanged();
    Q_EMIT changed();
}

QString RkProperty::widgetClassName() const
{
    return QStringLiteral("RkLabelPropertyWgt");
}

void RkProperty::beginEdit()
{
    d->editStart = getValueVariant();
    d->editing = true;
}

void RkProperty::finishEdit()
{
    d->editing = false;
}

void RkProperty::cancelEdit()
{
    if (d->editing)
        setValueVariant(d->editStart);
    d->editing = false;
}

bool RkProperty::isEditing() const
{
    return d->editing;
}

QVariant RkProperty::getValueVariant() const
{
    return QVariant();
}

bool RkProperty::setValueVariant(const QVariant&)
{
    return false;
}

int RkProperty::getFlags() const
{
    return (d->hidden ? Hidden : 0) | (d->favorite ? Favorite : 0) |
           (d->globalFavorite ? GlobalFavorite : 0) | (d->locked ? Locked : 0);
}

void RkProperty::setFlags(int flags)
{
    setHidden(flags & Hidden);
    setIsFavorite(flags & Favorite);
    setIsGlobalFavorite(flags & GlobalFavorite);
    setLocked(flags & Locked);
}

void RkProperty::saveState(RkOutFile*) const {}

void RkProperty::loadState(RkInFile*) {}

void RkProperty::valueChanged(const QVariant& oldValue)
{
    // Only changes made inside a hold are undoable; anything else stays unrecorded.
    if (rkUndoStack && rkUndoStack->canPushItems())
        rkUndoStack->push(
            std::make_unique<RkPropertyChangeCommand>(this, oldValue, getValueVariant()));
    Q_EMIT currentValueChanged();
    Q_EMIT changed();
}

void RkProperty::logRefusedValue(const QString& what)
{
    if (d->refusalLogged)
        return;
    d->refusalLogged = true;
    const QString message = QStringLiteral("Property \"%1\" refused the value %2; it keeps its "
                                           "value")
                                .arg(getName(), what);
    rkLog(message);
}
