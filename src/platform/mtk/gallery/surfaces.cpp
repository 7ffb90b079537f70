// SPDX-License-Identifier: Apache-2.0
#include "section.h"

#include "mtk/marrowrectangle.h"
#include "mtk/mblureffectwidget.h"
#include "mtk/mdialog.h"
#include "mtk/mframe.h"
#include "mtk/mlabel.h"
#include "mtk/mlineedit.h"
#include "mtk/mpasswordedit.h"
#include "mtk/mstyle.h"
#include "mtk/mtitlebar.h"
#include "mtk/mwindowmanagerhelper.h"

#include <QApplication>
#include <QKeyEvent>
#include <QLineEdit>
#include <QStyle>
#include <QVBoxLayout>

namespace Gallery {

namespace {

using namespace Mtk::Widget;
using Mtk::Gui::MPalette;

QWidget *panel(MPalette::ColorType role, int radius)
{
    auto *frame = new MFrame;
    frame->setFixedSize(160, 62);
    frame->setBackgroundRole(role);
    MStyle::setFrameRadius(frame, radius);
    auto *label = new MLabel(frame);
    label->setText(QStringLiteral("面板"));
    (new QVBoxLayout(frame))->addWidget(label, 0, Qt::AlignCenter);
    return frame;
}

QWidget *separator(int width)
{
    auto *frame = new MFrame;
    frame->setFrameShape(QFrame::VLine);
    frame->setFixedSize(width, 28);
    return frame;
}

QWidget *framePage()
{
    StateGrid grid({QStringLiteral("直角"), QStringLiteral("圆角")});
    grid.addRow(QStringLiteral("条目背景"),
                {panel(MPalette::ItemBackground, 0), panel(MPalette::ItemBackground, 8)});
    grid.addRow(QStringLiteral("提示背景"),
                {panel(MPalette::FrameShadowBorder, 0), panel(MPalette::FrameShadowBorder, 8)});
    grid.addRow(QStringLiteral("分隔线"), {separator(1), separator(2)});
    return grid.page();
}

// A whole window of the toolkit with the hints in `taken` taken away.
QWidget *window(Qt::WindowFlags taken, bool fixed)
{
    auto *widget = new MBlurEffectWidget;
    auto *bar = new MTitlebar(widget);
    bar->setTitle(QStringLiteral("窗口标题"));
    bar->setIcon(QApplication::style()->standardIcon(QStyle::SP_MessageBoxInformation));
    bar->setBackgroundTransparent(true);
    bar->setMenuVisible(!fixed);
    widget->setWindowFlags(widget->windowFlags() & ~taken);
    if (!Mtk::Gui::MWindowManagerHelper::instance()->hasBlurWindow())
        widget->setMaskAlpha(255);
    auto *column = new QVBoxLayout(widget);
    column->setContentsMargins(0, 0, 0, 0);
    column->addWidget(bar);
    auto *text = new MLabel;
    text->setText(QStringLiteral("窗口的边框、标题栏与按钮"));
    text->setAlignment(Qt::AlignCenter);
    column->addWidget(text, 1);
    if (fixed)
        widget->setFixedSize(380, 140);
    else
        widget->resize(380, 140);
    return widget;
}

MDialog *message(const QString &text)
{
    auto *dialog = new MDialog;
    dialog->setMessage(text);
    dialog->addButton(QStringLiteral("确定"));
    return dialog;
}

QWidget *longMessage()
{
    const QString line =
        QStringLiteral("服务器给出的说明很长，对话框随之变高，超过屏幕高度的四分之三时文字可以滚动。");
    return message(line.repeated(40));
}

QWidget *field(const QString &caption, MLineEdit *edit)
{
    auto *row = new QWidget;
    auto *label = new MLabel;
    label->setText(caption);
    label->setFixedWidth(80);
    label->setBuddy(edit);
    auto *layout = new QHBoxLayout(row);
    layout->addWidget(label);
    layout->addWidget(edit);
    return row;
}

QWidget *authorisation()
{
    auto *dialog = new MDialog;
    dialog->setIcon(QApplication::style()->standardIcon(QStyle::SP_MessageBoxWarning));
    dialog->setTitle(QStringLiteral("退出域管系统需要管理员权限"));
    auto *account = new MLineEdit;
    account->setClearButtonEnabled(true);
    dialog->addContent(field(QStringLiteral("管理员帐号"), account));
    dialog->addContent(field(QStringLiteral("密码"), new MPasswordEdit));
    dialog->addButton(QStringLiteral("取消"));
    dialog->addButton(QStringLiteral("授权"), false, MDialog::ButtonRecommended);
    return dialog;
}

QWidget *warning()
{
    auto *dialog = new MDialog;
    dialog->setIcon(QApplication::style()->standardIcon(QStyle::SP_MessageBoxCritical));
    dialog->setTitle(QStringLiteral("恢复出厂设置"));
    dialog->setMessage(QStringLiteral("本机的全部数据将被删除，且无法找回。"));
    dialog->addButton(QStringLiteral("取消"));
    dialog->addButton(QStringLiteral("删除"), false, MDialog::ButtonWarning);
    return dialog;
}

QWidget *popup()
{
    auto *widget = new MArrowRectangle(MArrowRectangle::ArrowTop);
    auto *label = new MLabel;
    label->setText(QStringLiteral("帐号不能为空"));
    label->setMargin(8);
    widget->setContent(label);
    return widget;
}

// Belongs to the field that it was asked for.
QWidget *fieldMenu()
{
    auto *edit = new MLineEdit;
    edit->setText(QStringLiteral("manage.example.org"));
    edit->lineEdit()->selectAll();
    QKeyEvent press(QEvent::KeyPress, Qt::Key_F10, Qt::ShiftModifier);
    QApplication::sendEvent(edit->lineEdit(), &press);
    QWidget *menu = QApplication::activePopupWidget();
    QObject::connect(menu, &QObject::destroyed, edit, &QObject::deleteLater);
    return menu;
}

} // namespace

QVector<Section> surfaceSections()
{
    return {
        {QStringLiteral("frames"), QStringLiteral("面板与分隔线"), framePage},
        {QStringLiteral("window"), QStringLiteral("普通窗口"),
         [] {
             return window({}, false);
         }},
        {QStringLiteral("window-fixed"), QStringLiteral("固定大小的窗口"),
         [] {
             return window(Qt::WindowMinMaxButtonsHint, true);
         }},
        {QStringLiteral("dialog-message"), QStringLiteral("消息"),
         [] {
             return message(QStringLiteral("网络异常，请稍后重试"));
         }},
        {QStringLiteral("dialog-long"), QStringLiteral("长消息"), longMessage},
        {QStringLiteral("dialog-fields"), QStringLiteral("授权"), authorisation},
        {QStringLiteral("dialog-warning"), QStringLiteral("警告"), warning},
        {QStringLiteral("popup"), QStringLiteral("气泡"), popup},
        {QStringLiteral("menu"), QStringLiteral("右键菜单"), fieldMenu},
    };
}

} // namespace Gallery
