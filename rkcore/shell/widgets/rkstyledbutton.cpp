#include "widgets/rkstyledbutton.h"

#include <QStyleOptionButton>
#include <QStyleOptionComboBox>
#include <QStyleOptionToolButton>
#include <QStylePainter>

#include <algorithm>

namespace
{

// Room for a menu button's arrow in the host style (a custom metric); other styles give 0.
constexpr int menuArrowWidthMetric = 62;

int spacingUnit(const QWidget* widget)
{
    const int m = widget->style()->pixelMetric(QStyle::PM_CustomBase);
    return m > 0 ? m : 4;
}

int arrowWidth(const QWidget* widget)
{
    const int w = widget->style()->pixelMetric(
        QStyle::PixelMetric(QStyle::PM_CustomBase + menuArrowWidthMetric));
    return w > 0 ? w : 12;
}

} // namespace

struct RkStyledButton::Private {
    ButtonStyle style = PushStyle;
    bool menuArrow = false;
};

RkStyledButton::RkStyledButton(QWidget* parent, const QString& name, const QString& text)
    : QAbstractButton(parent), d(std::make_unique<Private>())
{
    setObjectName(name);
    setText(text);
    setAttribute(Qt::WA_Hover);
    setSizePolicy(QSizePolicy::Minimum, QSizePolicy::Fixed);
}

RkStyledButton::~RkStyledButton() = default;

RkStyledButton::ButtonStyle RkStyledButton::buttonStyle() const
{
    return d->style;
}

void RkStyledButton::setButtonStyle(ButtonStyle style)
{
    if (d->style == style)
        return;
    d->style = style;
    updateGeometry();
    update();
}

void RkStyledButton::setMenuArrowShown(bool shown)
{
    d->menuArrow = shown;
    updateGeometry();
    update();
}

QSize RkStyledButton::sizeHintForText(const QString& text) const
{
    const QSize textSize = fontMetrics().size(Qt::TextShowMnemonic, text);
    if (d->style == DropDownStyle) {
        QStyleOptionComboBox option;
        option.initFrom(this);
        option.editable = false;
        option.frame = true;
        return style()->sizeFromContents(QStyle::CT_ComboBox, &option, textSize, this);
    }
    const int m = spacingUnit(this);
    QSize size(textSize.width() + 4 * m, textSize.height() + 2 * m);
    if (d->menuArrow)
        size.rwidth() += arrowWidth(this);
    return size;
}

QSize RkStyledButton::sizeHint() const
{
    return sizeHintForText(text());
}

QSize RkStyledButton::minimumSizeHint() const
{
    const QSize hint = sizeHint();
    return QSize(
        std::min(hint.width(), 4 * spacingUnit(this) + (d->menuArrow ? arrowWidth(this) : 0)),
        hint.height());
}

void RkStyledButton::paintEvent(QPaintEvent*)
{
    QStylePainter p(this);
    const bool down = isDown() || isChecked();
    if (d->style == DropDownStyle) {
        QStyleOptionComboBox option;
        option.initFrom(this);
        option.editable = false;
        option.frame = true;
        option.currentText = text();
        option.currentIcon = icon();
        option.iconSize = iconSize();
        if (down)
            option.state |= QStyle::State_On | QStyle::State_Sunken;
        p.drawComplexControl(QStyle::CC_ComboBox, option);
        p.drawControl(QStyle::CE_ComboBoxLabel, option);
        return;
    }

    const bool hovered = isEnabled() && underMouse();
    if (d->style == PushStyle) {
        QStyleOptionButton option;
        option.initFrom(this);
        option.state |= down ? QStyle::State_Sunken : QStyle::State_Raised;
        p.drawControl(QStyle::CE_PushButtonBevel, option);
    } else if (down || (d->style == ToolStyle && hovered)) {
        QStyleOptionToolButton option;
        option.initFrom(this);
        option.state |= QStyle::State_AutoRaise;
        option.state |= down ? QStyle::State_Sunken : QStyle::State_Raised;
        p.drawPrimitive(QStyle::PE_PanelButtonTool, option);
    }

    const int m = spacingUnit(this);
    QRect content = rect().adjusted(2 * m, 0, -2 * m, 0);
    if (d->menuArrow) {
        QStyleOption arrow;
        arrow.initFrom(this);
        arrow.rect = QRect(width() - m - arrowWidth(this), 0, arrowWidth(this), height());
        p.drawPrimitive(QStyle::PE_IndicatorArrowDown, arrow);
        content.setRight(arrow.rect.left() - 1);
    }
    const QString shown = fontMetrics().elidedText(text(), Qt::ElideRight, content.width());
    const int align = (d->menuArrow ? Qt::AlignLeft : Qt::AlignHCenter) | Qt::AlignVCenter;
    p.drawItemText(content, align, palette(), isEnabled(), shown,
                   d->style == FlatStyle ? QPalette::WindowText : QPalette::ButtonText);
}
