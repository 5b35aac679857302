#pragma once

#include "widgets/rkstyledbutton.h"

#include <memory>

// A button that shows the text of its current item and pops up the list of its items when it is
// pressed (or on Space, Return or F4), as a drop-down list does. Items are addressed by index;
// each also carries an id.
class RKCORE_EXPORT RkMenuButton : public RkStyledButton
{
    Q_OBJECT
public:
    // The name is the object name; the text is shown until an item is selected.
    RkMenuButton(QWidget* parent, const QString& name, const QString& text);
    ~RkMenuButton() override;

    // Inserts an item before index (-1 or an index past the end appends). An id of -1 becomes one
    // more than the largest id in use. The current item stays current. Returns the item's id.
    int insertItem(const QString& text, int id = -1, int index = -1);
    int count() const;
    QString itemText(int index) const;
    int itemId(int index) const;
    // -1 until an item is selected.
    int currentIndex() const;

    QSize sizeHint() const override;

public Q_SLOTS:
    // Makes the item current and emits menuIndexSelected(index), also when it was current
    // already. An index out of range does nothing.
    void selectItemAt(int index);
    // Pops up the item list below the button; a pick selects the item as selectItemAt() does.
    void showMenu();

Q_SIGNALS:
    // The current item was chosen, by a pick in the list or by selectItemAt(): both emit, so a
    // receiver connected before the first selectItemAt() hears about the initial item too.
    void menuIndexSelected(int index);

protected:
    void mousePressEvent(QMouseEvent* event) override;
    void keyPressEvent(QKeyEvent* event) override;

private:
    struct Private;
    std::unique_ptr<Private> d;
};
