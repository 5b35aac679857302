#pragma once

#include "rkcoreglobal.h"

#include <QList>
#include <QWidget>

#include <functional>
#include <memory>

class RkProperty;

// Base of the widgets that edit properties. A widget may hold several properties: the same
// property of several selected nodes. It shows the first and a change sets them all. Properties
// are watched, not owned: one that is destroyed drops out of the widget.
//
// A right-button press is left to the parent (the list selects and offers its menu with it).
class RKCORE_EXPORT RkPropertyWgt : public QWidget
{
    Q_OBJECT
public:
    explicit RkPropertyWgt(QWidget* parent = nullptr);
    ~RkPropertyWgt() override;

    virtual void addProperty(RkProperty* property);
    // Empties the widget for reuse. It keeps its look until it gets a property again (a pool
    // refills or hides it at once); edits made meanwhile go nowhere.
    virtual void removeAllProperties();
    // A selected widget is drawn in the palette's highlight.
    virtual void setSelected(bool selected);
    virtual bool isSelected() const;

    // Null when the widget holds no property.
    RkProperty* getFirstProperty() const;
    QList<RkProperty*> getProperties() const;

protected:
    void mousePressEvent(QMouseEvent* event) override;
    void paintEvent(QPaintEvent* event) override;

    // Brings the widget up to date with its properties: called when one is added or destroyed
    // and when a property's value, label or flags change.
    virtual void updateFromProperties();

    // Whether the user may change the property: not while it is locked. The widgets show a
    // property that is not editable as disabled.
    bool isPropertyEditable(const RkProperty* property) const;
    // True when there is a property and every one is editable.
    bool arePropertiesEditable() const;
    // True when the properties do not all hold the same value (the widget shows them mixed).
    bool arePropertiesMixed() const;

    // Runs the write on every property, then updates the widget once.
    void writeProperties(const std::function<void(RkProperty*)>& write);
    // For a subclass's own connections to its properties' signals: updates unless a write of
    // writeProperties() is running.
    void propertyChanged();

private:
    void dropDestroyedProperties();

    struct Private;
    std::unique_ptr<Private> d;
};
