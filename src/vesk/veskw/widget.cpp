// SPDX-License-Identifier: Apache-2.0
#include "widget.h"

#include "fileconfig.h"
#include "finishsettingwidget.h"
#include "httprequest.h"
#include "joingroupsuccesswidget.h"
#include "localselectwidget.h"
#include "loginwidget.h"
#include "newterminalnamewidget.h"
#include "pageparts.h"
#include "serverconfigwidget.h"
#include "settingupwidget.h"
#include "windowparts.h"

#include "mtk/mtitlebar.h"

#include <QCloseEvent>
#include <QIcon>
#include <QPalette>

#include <QDebug>

using Mtk::Widget::MTitlebar;

namespace {

// Makes a page when it is first needed; true when this was now.
template <typename Page>
bool makeOnce(Page *&page, QWidget *parent, const QSize &size)
{
    if (page != nullptr)
        return false;
    page = new Page(parent);
    page->setFixedSize(size);
    return true;
}

// A screen reader says of a window what its page says.
void describe(QWidget *window, const QWidget *page)
{
    window->setAccessibleDescription(page->accessibleDescription());
}

// With the focus where the user will go on, or on the page itself, where Enter does nothing and Tab goes to
// the first button. Qt alone would give it to whatever comes first in the tab chain.
void showFocused(QWidget *page)
{
    page->show();
    describe(page->window(), page);
    page->setFocus(Qt::OtherFocusReason);
}

} // namespace

Widget::Widget(QWidget *parent)
    : MBlurEffectWidget(parent)
    , m_initialSize(windowparts::windowSize(pageparts::kFieldPageSize))
{
    setFixedSize(m_initialSize);
    setFixedWidth(m_initialSize.width());
    setPalette(windowparts::backgroundPalette());

    m_titlebar = windowparts::createTitlebar(this);
    setWindowFlags(windowFlags() & ~(Qt::WindowMinimizeButtonHint | Qt::WindowMaximizeButtonHint));
    m_contentWidget = new QWidget;
    m_contentWidget->setPalette(windowparts::backgroundPalette());
    windowparts::layOut(this, m_titlebar, m_contentWidget);

    connect(HttpRequest::GetInstance(), &HttpRequest::sigJoinControl, this, &Widget::onJoinFinished);
    if (FileConfig::GetInstance()->readIsDomain())
        initRelieveControlUI();
    else
        createInitWidget();
    windowparts::makeOpaqueWithoutBlur(this);
}

Widget::~Widget()
{
    if (m_titlebar != nullptr)
        m_titlebar->deleteLater();
}

void Widget::createInitWidget()
{
    if (makeOnce(m_serverConfigWidget, m_contentWidget, pageparts::kFieldPageSize)) {
        connect(m_serverConfigWidget, &ServerConfigWidget::sigJumpUserLogin, this, &Widget::onUserLogin);
        connect(m_serverConfigWidget, &ServerConfigWidget::sigCancelSetting, this, &Widget::onExit);
    }
    showFocused(m_serverConfigWidget);
    showIcon(false);
}

void Widget::onUserLogin()
{
    qDebug() << "onUserLogin 用户登陆";
    if (makeOnce(m_loginWidget, m_contentWidget, pageparts::kFieldPageSize)) {
        connect(m_loginWidget, &LoginWidget::sigJumpServerSetting, this, &Widget::onServerSetting);
        connect(m_loginWidget, &LoginWidget::sigJumpNewTerminal, this, &Widget::onNewTerminal);
    }
    m_serverConfigWidget->hide();
    windowparts::setFixedWindowSize(this, m_initialSize);
    showFocused(m_loginWidget);
    showIcon(true);
}

void Widget::onServerSetting()
{
    if (m_loginWidget != nullptr)
        m_loginWidget->hide();
    if (m_serverConfigWidget == nullptr)
        return;
    windowparts::setFixedWindowSize(this, m_initialSize);
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
    if (makeOnce(m_terminalNameWidget, m_contentWidget, pageparts::kFieldPageSize)) {
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
    if (makeOnce(m_finishSettingWidget, m_contentWidget, pageparts::kSummarySize)) {
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
    if (makeOnce(m_settingUpWidget, m_contentWidget, pageparts::kProgressSize)) {
        connect(m_settingUpWidget, &SettingUpWidget::sigCancelSetting, this, &Widget::onCancelSetting);
    }
    if (m_finishSettingWidget != nullptr)
        m_finishSettingWidget->hide();
    m_bExit = true;
    m_settingUpWidget->restoreUI();
    fitTo(m_settingUpWidget);
    m_settingUpWidget->show();
    describe(this, m_settingUpWidget);
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
    if (m_loginWidget != nullptr)
        m_loginWidget->forgetPassword();
    setPalette(windowparts::backgroundPalette());

    // A window without a close button; nothing keeps a pointer to it, it lives until the process ends.
    auto *window = new MBlurEffectWidget(nullptr);
    windowparts::makeOpaqueWithoutBlur(window);
    MTitlebar *titlebar = windowparts::createTitlebar(nullptr);
    window->setWindowFlags(windowFlags() & ~(Qt::WindowMinimizeButtonHint | Qt::WindowMaximizeButtonHint |
                                             Qt::WindowCloseButtonHint));
    QPalette palette;
    palette.setBrush(QPalette::All, QPalette::Window, QColor(Qt::transparent));
    titlebar->setPalette(palette);

    auto *page = new JoinGroupSuccessWidget(nullptr);
    windowparts::setFixedWindowSize(window, windowparts::windowSize(page->size()));
    windowparts::layOut(window, titlebar, page);
    describe(window, page);
    window->move(x(), y());
    window->show();
    showFocused(page);
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
    windowparts::setFixedWindowSize(this, windowparts::windowSize(page->size()));
}

void Widget::showIcon(bool on)
{
    m_titlebar->setIcon(on ? windowparts::logo() : QIcon(QString()));
}
