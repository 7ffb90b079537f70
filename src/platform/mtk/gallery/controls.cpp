// SPDX-License-Identifier: Apache-2.0
#include "section.h"

#include "mtk/mlineedit.h"
#include "mtk/mpasswordedit.h"
#include "mtk/mprogressbar.h"
#include "mtk/mspinner.h"
#include "mtk/msuggestbutton.h"
#include "mtk/mswitchbutton.h"

#include <QLineEdit>
#include <QVBoxLayout>

namespace Gallery {

namespace {

using namespace Mtk::Widget;

template <typename Button>
QPushButton *button(const QString &text)
{
    auto *widget = new Button;
    widget->setText(text);
    widget->setFixedSize(170, 36);
    return widget;
}

template <typename Button>
QWidget *buttonPage(const QString &caption, const QString &text)
{
    StateGrid grid({QStringLiteral("常态"), QStringLiteral("悬停"), QStringLiteral("按下"),
                    QStringLiteral("焦点"), QStringLiteral("停用")});
    grid.addRow(caption, {button<Button>(text), hovered(button<Button>(text)), pressed(button<Button>(text)),
                          focused(button<Button>(text)), disabled(button<Button>(text))});
    return grid.page();
}

template <typename Edit>
Edit *edit(const QString &text)
{
    auto *widget = new Edit;
    widget->setFixedSize(270, 36);
    widget->setText(text);
    return widget;
}

template <typename Edit>
QWidget *alerted(const QString &text)
{
    Edit *widget = edit<Edit>(text);
    widget->setAlert(true);
    return widget;
}

QWidget *placeholder()
{
    auto *widget = edit<MLineEdit>(QString());
    widget->lineEdit()->setPlaceholderText(QStringLiteral("域服务器地址"));
    return widget;
}

QWidget *clearable()
{
    auto *widget = edit<MLineEdit>(QStringLiteral("manage.example.org"));
    widget->setClearButtonEnabled(true);
    return widget;
}

QWidget *revealed()
{
    auto *widget = edit<MPasswordEdit>(QStringLiteral("Terminal-7"));
    widget->lineEdit()->setEchoMode(QLineEdit::Normal);
    return widget;
}

QWidget *editPage()
{
    const QString host = QStringLiteral("manage.example.org");
    StateGrid grid(
        {QStringLiteral("常态"), QStringLiteral("悬停"), QStringLiteral("焦点"), QStringLiteral("停用")});
    grid.addRow(QStringLiteral("输入框"), {edit<MLineEdit>(host), hovered(edit<MLineEdit>(host)),
                                           focused(edit<MLineEdit>(host)), disabled(edit<MLineEdit>(host))});
    grid.addRow(QStringLiteral("占位 / 清除"), {placeholder(), clearable()});
    return grid.page();
}

QWidget *alertPage()
{
    StateGrid grid({QStringLiteral("常态"), QStringLiteral("焦点")});
    const QString text = QStringLiteral("终端 01");
    grid.addRow(QStringLiteral("警示"), {alerted<MLineEdit>(text), focused(alerted<MLineEdit>(text))});
    return grid.page();
}

QWidget *passwordPage()
{
    const QString secret = QStringLiteral("Terminal-7");
    StateGrid grid({QStringLiteral("隐藏"), QStringLiteral("显示"), QStringLiteral("停用")});
    grid.addRow(QStringLiteral("密码框"),
                {focused(edit<MPasswordEdit>(secret)), revealed(), disabled(edit<MPasswordEdit>(secret))});
    return grid.page();
}

QWidget *toggle(bool on)
{
    auto *widget = new MSwitchButton;
    widget->setChecked(on);
    widget->setAccessibleName(QStringLiteral("自动登录"));
    return widget;
}

QWidget *switchPage()
{
    StateGrid grid(
        {QStringLiteral("常态"), QStringLiteral("悬停"), QStringLiteral("焦点"), QStringLiteral("停用")});
    grid.addRow(QStringLiteral("关"),
                {toggle(false), hovered(toggle(false)), new QWidget, disabled(toggle(false))});
    grid.addRow(QStringLiteral("开"),
                {toggle(true), hovered(toggle(true)), focused(toggle(true)), disabled(toggle(true))});
    return grid.page();
}

QWidget *bar(int value, int maximum = 100)
{
    auto *widget = new MProgressBar;
    widget->setFixedSize(160, 8);
    widget->setTextVisible(false);
    widget->setRange(0, maximum);
    widget->setValue(value);
    return widget;
}

QWidget *spinner(int side)
{
    auto *widget = new MSpinner;
    widget->setFixedSize(side, side);
    widget->start();
    return widget;
}

QWidget *progressPage()
{
    StateGrid grid({QStringLiteral("0 %"), QStringLiteral("2 %"), QStringLiteral("20 %"),
                    QStringLiteral("70 %"), QStringLiteral("100 %")});
    grid.addRow(QStringLiteral("进度条"), {bar(0), bar(2), bar(20), bar(70), bar(100)});
    grid.addRow(QStringLiteral("停用 / 未知"),
                {new QWidget, bar(0, 0), disabled(bar(20)), disabled(bar(70))});
    grid.addRow(QStringLiteral("等待"), {spinner(20), spinner(32), disabled(spinner(20))});
    return grid.page();
}

} // namespace

QVector<Section> controlSections()
{
    return {
        {QStringLiteral("buttons"), QStringLiteral("按钮"),
         [] {
             return buttonPage<QPushButton>(QStringLiteral("普通"), QStringLiteral("取消"));
         }},
        {QStringLiteral("suggest-buttons"), QStringLiteral("推荐按钮"),
         [] {
             return buttonPage<MSuggestButton>(QStringLiteral("推荐"), QStringLiteral("下一步"));
         }},
        {QStringLiteral("edits"), QStringLiteral("输入框"), editPage},
        {QStringLiteral("edits-alert"), QStringLiteral("输入框的警示"), alertPage},
        {QStringLiteral("password-edits"), QStringLiteral("密码框"), passwordPage},
        {QStringLiteral("switches"), QStringLiteral("开关"), switchPage},
        {QStringLiteral("progress"), QStringLiteral("进度与等待"), progressPage},
    };
}

} // namespace Gallery
