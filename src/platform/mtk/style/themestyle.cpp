// SPDX-License-Identifier: Apache-2.0
#include "themestyle.h"

#include "messageicon.h"
#include "paintbutton.h"
#include "paintedit.h"
#include "paintframe.h"
#include "paintprogress.h"
#include "paintscrollbar.h"
#include "theme.h"

#include <QLineEdit>
#include <QPushButton>
#include <QScrollBar>
#include <QStyleOption>

namespace Mtk {

ThemeStyle::ThemeStyle()
    : QProxyStyle(QStringLiteral("Fusion"))
{
}

void ThemeStyle::drawControl(ControlElement element, const QStyleOption *option, QPainter *painter,
                             const QWidget *widget) const
{
    const auto *button = qstyleoption_cast<const QStyleOptionButton *>(option);
    const auto *frame = qstyleoption_cast<const QStyleOptionFrame *>(option);
    const auto *bar = qstyleoption_cast<const QStyleOptionProgressBar *>(option);
    if (element == CE_PushButton && button)
        paintButton(*painter, *button, *this, widget);
    else if (element == CE_ShapedFrame && frame && isSeparator(*frame))
        paintSeparator(*painter, *frame);
    else if (element == CE_ProgressBarGroove && bar)
        paintGroove(*painter, *bar);
    else if (element == CE_ProgressBarContents && bar)
        paintProgress(*painter, *bar, widget);
    else
        QProxyStyle::drawControl(element, option, painter, widget);
}

void ThemeStyle::drawPrimitive(PrimitiveElement element, const QStyleOption *option, QPainter *painter,
                               const QWidget *widget) const
{
    const auto *frame = qstyleoption_cast<const QStyleOptionFrame *>(option);
    if (element == PE_PanelLineEdit && frame)
        paintEdit(*painter, *frame, widget);
    else if (element == PE_FrameFocusRect)
        paintFocus(*painter, *option);
    else if (element == PE_PanelMenu || element == PE_PanelTipLabel)
        paintPopup(*painter, *option);
    else if (element == PE_FrameLineEdit || element == PE_FrameMenu || element == PE_PanelScrollAreaCorner)
        return; // panels have their border already, and scroll areas a clear ground
    else
        QProxyStyle::drawPrimitive(element, option, painter, widget);
}

void ThemeStyle::drawComplexControl(ComplexControl control, const QStyleOptionComplex *option,
                                    QPainter *painter, const QWidget *widget) const
{
    const auto *slider = qstyleoption_cast<const QStyleOptionSlider *>(option);
    if (control == CC_ScrollBar && slider)
        paintScrollBar(*painter, *slider);
    else
        QProxyStyle::drawComplexControl(control, option, painter, widget);
}

QRect ThemeStyle::subControlRect(ComplexControl control, const QStyleOptionComplex *option,
                                 SubControl subControl, const QWidget *widget) const
{
    const auto *slider = qstyleoption_cast<const QStyleOptionSlider *>(option);
    if (control == CC_ScrollBar && slider)
        return scrollBarPart(*slider, subControl);
    return QProxyStyle::subControlRect(control, option, subControl, widget);
}

QRect ThemeStyle::subElementRect(SubElement element, const QStyleOption *option, const QWidget *widget) const
{
    if (element == SE_ProgressBarGroove || element == SE_ProgressBarContents)
        return option->rect;
    if (element == SE_LineEditContents) {
        const auto *frame = qstyleoption_cast<const QStyleOptionFrame *>(option);
        const int padding = frame && frame->lineWidth > 0 ? theme().editPadding : 0;
        // QLineEdit itself keeps two pixels beside the text.
        return option->rect.adjusted(qMax(0, padding - 2), 0, -qMax(0, padding - 2), 0);
    }
    return QProxyStyle::subElementRect(element, option, widget);
}

QSize ThemeStyle::sizeFromContents(ContentsType type, const QStyleOption *option, const QSize &contents,
                                   const QWidget *widget) const
{
    const Theme &t = theme();
    if (type == CT_PushButton)
        return {qMax(t.controlMinimumWidth, contents.width() + 2 * t.controlPadding),
                qMax(t.controlHeight, contents.height())};
    const auto *frame = qstyleoption_cast<const QStyleOptionFrame *>(option);
    if (type == CT_LineEdit && frame && frame->lineWidth > 0)
        return {contents.width() + 2 * t.editPadding, qMax(t.controlHeight, contents.height())};
    return QProxyStyle::sizeFromContents(type, option, contents, widget);
}

int ThemeStyle::pixelMetric(PixelMetric metric, const QStyleOption *option, const QWidget *widget) const
{
    switch (metric) {
    case PM_ScrollBarExtent:
        return theme().scrollBar;
    case PM_ScrollBarSliderMin:
        return theme().scrollHandle;
    case PM_ScrollView_ScrollBarSpacing:
    case PM_ButtonShiftHorizontal:
    case PM_ButtonShiftVertical:
    case PM_ButtonDefaultIndicator:
        return 0;
    case PM_MenuVMargin:
        return theme().menuMargin;
    case PM_MessageBoxIconSize:
        return theme().dialogIcon;
    default:
        return QProxyStyle::pixelMetric(metric, option, widget);
    }
}

int ThemeStyle::styleHint(StyleHint hint, const QStyleOption *option, const QWidget *widget,
                          QStyleHintReturn *returnData) const
{
    switch (hint) {
    case SH_EtchDisabledText:
    case SH_DitherDisabledText:
    case SH_ScrollBar_Transient:
    case SH_DialogButtonBox_ButtonsHaveIcons:
        return 0;
    default:
        return QProxyStyle::styleHint(hint, option, widget, returnData);
    }
}

QIcon ThemeStyle::standardIcon(StandardPixmap icon, const QStyleOption *option, const QWidget *widget) const
{
    return isMessageIcon(icon) ? messageIcon(icon) : QProxyStyle::standardIcon(icon, option, widget);
}

QPixmap ThemeStyle::standardPixmap(StandardPixmap icon, const QStyleOption *option,
                                   const QWidget *widget) const
{
    if (!isMessageIcon(icon))
        return QProxyStyle::standardPixmap(icon, option, widget);
    return messageIcon(icon).pixmap(theme().dialogIcon);
}

QPalette ThemeStyle::standardPalette() const
{
    return themePalette();
}

void ThemeStyle::polish(QWidget *widget)
{
    QProxyStyle::polish(widget);
    const bool hovers = qobject_cast<QPushButton *>(widget) || qobject_cast<QLineEdit *>(widget) ||
                        qobject_cast<QScrollBar *>(widget);
    if (hovers)
        widget->setAttribute(Qt::WA_Hover);
}

} // namespace Mtk
