#pragma once

#include "io/rkbase.h"

#include <QVariant>

#include <memory>

// A named value of a scene element (its QObject parent; RkElement::elementOf finds it), shown to
// the user under its label in the group its path names. Every value change made while an undo hold
// is open is recorded on rkUndoStack.
class RKCORE_EXPORT RkProperty : public RkBase
{
    Q_OBJECT
public:
    RkProperty(const QString& name, const QString& label, QObject* parent = nullptr);
    ~RkProperty() override;

    QString getLabel() const;
    void setLabel(const QString& label);
    // Path of the group the property is filed under ("Morphs/Head/Face").
    QString getPath() const;
    void setPath(const QString& path);

    bool isHidden() const;
    void setHidden(bool hidden);
    // Local favourite: kept on this property only.
    bool isFavorite() const;
    void setIsFavorite(bool on);
    // Figure favourite: listed with the figure the property's node belongs to.
    bool isGlobalFavorite() const;
    void setIsGlobalFavorite(bool on);
    bool isSelected() const;
    void setSelected(bool on);
    // A locked property refuses changes through its value setters, which is what the user's
    // widgets and scripts use; loading, undo and redo (setValueVariant) still set it. Stored with
    // the scene as a flag.
    bool isLocked() const;
    void setLocked(bool on);

    // Class name of the widget that edits the property.
    virtual QString widgetClassName() const;

    // An interactive edit: cancelEdit() puts back the value that beginEdit() found.
    virtual void beginEdit();
    virtual void finishEdit();
    virtual void cancelEdit();
    bool isEditing() const;

    // The value as a variant, for undo and the scene file. setValueVariant answers false for a
    // value the property refuses.
    virtual QVariant getValueVariant() const;
    virtual bool setValueVariant(const QVariant& value);

    // Flags as stored in a scene file.
    enum Flag { Hidden = 1, Favorite = 2, GlobalFavorite = 4, Locked = 8 };
    int getFlags() const;
    void setFlags(int flags);

    // The definition beyond name, label, path and flags, and the value, as stored by the node.
    virtual void saveState(RkOutFile* file) const;
    virtual void loadState(RkInFile* file);

Q_SIGNALS:
    void currentValueChanged();
    void labelChanged(const QString& label);
    void flagsChanged();
    void selectedChanged(bool on);
    // After each of the signals above but selectedChanged(), and after the subclasses' signals of
    // their definition: one connection for whoever shows the whole property.
    void changed();

protected:
    // Call after the value changed: records the change in the open undo hold, if any, and emits
    // currentValueChanged().
    void valueChanged(const QVariant& oldValue);
    // Logs a refused value, once per property.
    void logRefusedValue(const QString& what);

private:
    struct Private;
    std::unique_ptr<Private> d;
};
