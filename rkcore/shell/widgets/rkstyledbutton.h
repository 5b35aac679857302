#pragma once

#include "rkcoreglobal.h"

#include <QAbstractButton>

#include <memory>

// A button for tool bars and panes, drawn in one of a few looks. It clicks as any
// QAbstractButton does.
class RKCORE_EXPORT RkStyledButton : public QAbstractButton
{
    Q_OBJECT
public:
    enum ButtonStyle {
        PushStyle = 0,     // a raised panel, as a push button
        FlatStyle = 1,     // the text on the background; sunk while pressed
        ToolStyle = 2,     // a panel only under the mouse and while pressed, as a tool-bar button
        DropDownStyle = 3, // a framed field with an arrow at its right, as a drop-down list
    };

    // The name is the object name.
    RkStyledButton(QWidget* parent, const QString& name, const QString& text);
    ~RkStyledButton() override;

    ButtonStyle buttonStyle() const;
    void setButtonStyle(ButtonStyle style);

    QSize sizeHint() const override;
    QSize minimumSizeHint() const override;

protected:
    void paintEvent(QPaintEvent* event) override;
    // A menu button shows a down arrow at its right in every look (the drop-down look has one).
    void setMenuArrowShown(bool shown);
    // The size the button asks for to show the text in its current look.
    QSize sizeHintForText(const QString& text) const;

private:
    struct Private;
    std::unique_ptr<Private> d;
};
