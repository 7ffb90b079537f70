// SPDX-License-Identifier: Apache-2.0
#include "widget.h"

#include "fileconfig.h"
#include "finishsettingwidget.h"
#include "httprequest.h"
#include "joingroupsuccesswidget.h"
#include "localselectwidget.h"
#include "loginwidget.h"
#include "newterminalnamewidget.h"
#include "serverconfigwidget.h"
#include "settingupwidget.h"

#include "mtk/mtitlebar.h"
#include "mtk/mwindowmanagerhelper.h"

#include <QBoxLayout>
#include <QCloseEvent>
#include <QIcon>
#include <QPalette>

#include <QDebug>

using Mtk::Gui::MWindowManagerHelper;
using Mtk::Widget::MBlurEffectWidget;
using Mtk::Widget::MTitlebar;

namespace {

constexpr int kWidth = 380;
constexpr int kTitlebarHeight = 50;
constexpr int kFieldPageHeight = 187; // of the three pages with two fields
constexpr int kSummaryHeight = 258;
constexpr int kProgressHeight = 109;
constexpr unsigned char kOpaque = 255;

QIcon logo()
{
    return QIcon(QStringLiteral(":/images/logo.svg"));
}

QPalette backgroundPalette()
{
    QPalette palette;
    palette.setBrush(QPalette::All, QPalette::Window, QColor(247, 247, 247, 255));
    return palette;
}

void dressTitlebar(MTitlebar *titlebar)
{
    titlebar->setMenuVisible(false);
    titlebar->setWindowTitle(QString());
    titlebar->setIcon(logo());
    titlebar->setTitle(QString());
    titlebar->setFixedHeight(kTitlebarHeight);
    titlebar->setBackgroundTransparent(true);
}

// Titlebar and content, from edge to edge.
void stack(QWidget *window, MTitlebar *titlebar, QWidget *content)
{
    auto *layout = new QVBoxLayout;
    layout->setContentsMargins(0, 0, 0, 0);
    layout->setSpacing(0);
    layout->addWidget(titlebar);
    layout->addWidget(content);
    window->setLayout(layout);
    window->setContentsMargins(0, 0, 0, 0);
}

void makeOpaqueWithoutBlur(MBlurEffectWidget *window)
{
    if (!MWindowManagerHelper::instance()->hasBlurWindow())
        window->setMaskAlpha(kOpaque);
}

void setFixedSizeAtOnce(QWidget *window, const QSize &size)
{
    window->setFixedSize(size);
    window->resize(size);
}

// With the focus where the user will go on, which Qt alone would leave wherever the tab chain goes.
void showFocused(QWidget *page)
{
    page->show();
    page->setFocus(Qt::OtherFocusReason);
}

QSize windowSizeFor(const QWidget *page)
{
    return {page->width(), page->height() + kTitlebarHeight};
}

} // namespace

Widget::Widget(QWidget *parent)
    : MBlurEffectWidget(parent)
{
    setFixedSize(kWidth, kFieldPageHeight + kTitlebarHeight);
    setFixedWidth(kWidth);
    m_initialSize = QSize(kWidth, kFieldPageHeight + kTitlebarHeight);
    setPalette(backgroundPalette());

    m_titlebar = new MTitlebar(this);
    dressTitlebar(m_titlebar);
    setWindowFlags(windowFlags() & ~(Qt::WindowMinimizeButtonHint | Qt::WindowMaximizeButtonHint));
    m_contentWidget = new QWidget;
    m_contentWidget->setPalette(backgroundPalette());
    stack(this, m_titlebar, m_contentWidget);

    connect(HttpRequest::GetInstance(), &HttpRequest::sigJoinControl, this, &Widget::onJoinFinished);
    if (FileConfig::GetInstance()->readIsDomain())
        initRelieveControlUI();
    else
        createInitWidget();
    makeOpaqueWithoutBlur(this);
}

Widget::~Widget()
{
    if (m_titlebar != nullptr)
        m_titlebar->deleteLater();
}

void Widget::createInitWidget()
{
    if (m_serverConfigWidget == nullptr) {
        m_serverConfigWidget = new ServerConfigWidget(m_contentWidget);
        m_serverConfigWidget->setFixedSize(kWidth, kFieldPageHeight);
        connect(m_serverConfigWidget, &ServerConfigWidget::sigJumpUserLogin, this, &Widget::onUserLogin);
        connect(m_serverConfigWidget, &ServerConfigWidget::sigCancelSetting, this, &Widget::onExit);
    }
    showFocused(m_serverConfigWidget);
    showIcon(false);
}

void Widget::onUserLogin()
{
    qDebug() << "onUserLogin 用户登陆";
    if (m_loginWidget == nullptr) {
        m_loginWidget = new LoginWidget(m_contentWidget);
        m_loginWidget->setFixedSize(kWidth, kFieldPageHeight);
        connect(m_loginWidget, &LoginWidget::sigJumpServerSetting, this, &Widget::onServerSetting);
        connect(m_loginWidget, &LoginWidget::sigJumpNewTerminal, this, &Widget::onNewTerminal);
    }
    m_serverConfigWidget->hide();
    setFixedSizeAtOnce(this, m_initialSize);
    showFocused(m_loginWidget);
    showIcon(true);
}

void Widget::onServerSetting()
{
    if (m_loginWidget != nullptr)
        m_loginWidget->hide();
    if (m_serverConfigWidget == nullptr)
        return;
    setFixedSizeAtOnce(this, m_initialSize);
    showFocused(m_serverConfigWidget);
    showIcon(false);
}

void Widget::onLocalSetting()
{
    if (m_loginWidget == nullptr)
        return;
    m_loginWidget->hide();
    m_loginWidget->show();
}

void Widget::onNewTerminal()
{
    if (m_terminalNameWidget == nullptr) {
        m_terminalNameWidget = new NewTerminalNameWidget(m_contentWidget);
        m_terminalNameWidget->setFixedSize(kWidth, kFieldPageHeight);
        m_terminalNameWidget->setTerminalName(FileConfig::GetInstance()->readTerminalName());
        connect(m_terminalNameWidget, &NewTerminalNameWidget::sig_jump_login, this, &Widget::onLoginSetting);
        connect(m_terminalNameWidget, &NewTerminalNameWidget::sig_jump_finish_setting, this,
                &Widget::onFinishSetting);
    }
    showInsteadOf(m_loginWidget, m_terminalNameWidget, false);
}

void Widget::onLoginSetting()
{
    showInsteadOf(m_terminalNameWidget, m_loginWidget, true);
}

void Widget::onFinishSetting()
{
    if (m_finishSettingWidget == nullptr) {
        m_finishSettingWidget = new FinishSettingWidget(m_contentWidget);
        m_finishSettingWidget->setFixedSize(kWidth, kSummaryHeight);
        connect(m_finishSettingWidget, &FinishSettingWidget::sigJoinGroup, this, &Widget::onOkJoinGroup);
        connect(m_finishSettingWidget, &FinishSettingWidget::sig_cancel_finish_setting, this,
                &Widget::onCancelFinishSetting);
    }
    FileConfig *config = FileConfig::GetInstance();
    m_finishSettingWidget->setServerIP(config->readDomainHost() + QLatin1Char(':') +
                                       config->readDomainPort());
    m_finishSettingWidget->setTermianlName(config->readTerminalName());
    showInsteadOf(m_terminalNameWidget, m_finishSettingWidget, true);
}

void Widget::onCancelFinishSetting()
{
    showInsteadOf(m_finishSettingWidget, m_terminalNameWidget, false);
}

void Widget::onOkJoinGroup()
{
    if (m_settingUpWidget == nullptr) {
        m_settingUpWidget = new SettingUpWidget(m_contentWidget);
        m_settingUpWidget->setFixedSize(kWidth, kProgressHeight);
        connect(m_settingUpWidget, &SettingUpWidget::sigCancelSetting, this, &Widget::onCancelSetting);
    }
    if (m_finishSettingWidget != nullptr)
        m_finishSettingWidget->hide();
    m_bExit = true;
    m_settingUpWidget->restoreUI();
    fitTo(m_settingUpWidget);
    m_settingUpWidget->show();
    m_settingUpWidget->setProgressValue(20);
    domainConfig(QStringLiteral("join"));
}

void Widget::onCancelSetting() {}

void Widget::onCancelJoinControl()
{
    m_bExit = false;
    m_settingUpWidget->hide();
    if (m_finishSettingWidget != nullptr) {
        fitTo(m_finishSettingWidget);
        m_finishSettingWidget->show();
    }
}

void Widget::createJoinSuccessWidget()
{
    m_bExit = false;
    hide();
    setPalette(backgroundPalette());

    // A window without a close button; nothing keeps a pointer to it, it lives until the process ends.
    auto *window = new MBlurEffectWidget(nullptr);
    makeOpaqueWithoutBlur(window);
    auto *titlebar = new MTitlebar(nullptr);
    dressTitlebar(titlebar);
    window->setWindowFlags(windowFlags() & ~(Qt::WindowMinimizeButtonHint | Qt::WindowMaximizeButtonHint |
                                             Qt::WindowCloseButtonHint));
    QPalette palette;
    palette.setBrush(QPalette::All, QPalette::Window, QColor(Qt::transparent));
    titlebar->setPalette(palette);

    auto *page = new JoinGroupSuccessWidget(nullptr);
    setFixedSizeAtOnce(window, windowSizeFor(page));
    stack(window, titlebar, page);
    window->move(x(), y());
    window->show();
}

void Widget::onExit()
{
    close();
}

void Widget::closeEvent(QCloseEvent *event)
{
    qDebug() << " m_bExit" << (m_bExit ? "true" : "false");
    event->setAccepted(!m_bExit);
}

void Widget::showInsteadOf(QWidget *previous, QWidget *page, bool withIcon)
{
    if (previous != nullptr)
        previous->hide();
    if (page == nullptr)
        return;
    fitTo(page);
    showFocused(page);
    showIcon(withIcon);
}

void Widget::fitTo(const QWidget *page)
{
    setFixedSizeAtOnce(this, windowSizeFor(page));
}

void Widget::showIcon(bool on)
{
    m_titlebar->setIcon(on ? logo() : QIcon(QString()));
}
