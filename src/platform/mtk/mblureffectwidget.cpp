// SPDX-License-Identifier: Apache-2.0
#include "mblureffectwidget.h"

#include "mwindowmanagerhelper.h"
#include "parts/windowframe.h"
#include "style/theme.h"
#include "system/xdesktop.h"

#include <QAccessibleWidget>
#include <QEvent>
#include <QGuiApplication>

namespace Mtk::Widget {

namespace {

constexpr unsigned char kOpaque = 255;
constexpr unsigned char kBlurredAlpha = 204; // lets the desktop's colors through and keeps text readable

class AccessibleWindow : public QAccessibleWidget
{
public:
    explicit AccessibleWindow(QWidget *window)
        : QAccessibleWidget(window, QAccessible::Window)
    {
    }

    QString text(QAccessible::Text kind) const override
    {
        const QString own = QAccessibleWidget::text(kind);
        const bool isNameless = kind == QAccessible::Name && own.isEmpty();
        return isNameless ? QGuiApplication::applicationDisplayName() : own;
    }
};

QAccessibleInterface *windowInterface(const QString & /*className*/, QObject *object)
{
    auto *window = qobject_cast<MBlurEffectWidget *>(object);
    return window != nullptr ? new AccessibleWindow(window) : nullptr;
}

} // namespace

MBlurEffectWidget::MBlurEffectWidget(QWidget *parent)
    : QWidget(parent, Qt::Window | Qt::FramelessWindowHint | Qt::WindowTitleHint | Qt::WindowSystemMenuHint |
                          Qt::WindowMinMaxButtonsHint | Qt::WindowCloseButtonHint)
    , m_maskAlpha(kBlurredAlpha)
{
    QAccessible::installFactory(windowInterface);
    WindowFrame::prepare(this);
}

MBlurEffectWidget::~MBlurEffectWidget() = default;

void MBlurEffectWidget::setMaskAlpha(unsigned char alpha)
{
    m_maskAlpha = alpha;
    requestBlur();
    update();
}

bool MBlurEffectWidget::event(QEvent *event)
{
    WindowFrame::shadeWhileBlocked(this, *event);
    return QWidget::event(event);
}

void MBlurEffectWidget::paintEvent(QPaintEvent * /*event*/)
{
    QColor background = palette().color(QPalette::Window);
    if (testAttribute(Qt::WA_TranslucentBackground))
        background.setAlpha(m_maskAlpha);
    WindowFrame::paint(this, background);
}

void MBlurEffectWidget::showEvent(QShowEvent *event)
{
    QWidget::showEvent(event);
    requestBlur();
}

void MBlurEffectWidget::resizeEvent(QResizeEvent *event)
{
    QWidget::resizeEvent(event);
    requestBlur();
}

void MBlurEffectWidget::changeEvent(QEvent *event)
{
    QWidget::changeEvent(event);
    if (event->type() == QEvent::WindowStateChange)
        requestBlur();
}

void MBlurEffectWidget::requestBlur()
{
    const bool shinesThrough = testAttribute(Qt::WA_TranslucentBackground) && m_maskAlpha != kOpaque;
    if (isVisible() && shinesThrough && Gui::MWindowManagerHelper::instance()->hasBlurWindow())
        XDesktop::instance().blurBehind(quint32(winId()), WindowFrame::covered(this));
}

} // namespace Mtk::Widget
