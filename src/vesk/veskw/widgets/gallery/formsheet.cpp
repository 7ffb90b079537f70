// SPDX-License-Identifier: Apache-2.0
#include "formsheet.h"

#include "mtk/mlineedit.h"
#include "widgets/labels.h"
#include "widgets/lineeditwidget.h"
#include "widgets/switchwidget.h"
#include "widgets/translucentframe.h"

#include <QApplication>
#include <QHBoxLayout>
#include <QPainter>
#include <QPushButton>
#include <QStyle>
#include <QTimer>

using mcc::widgets::LargeLabel;
using mcc::widgets::LineEditWidget;
using mcc::widgets::NormalLabel;
using mcc::widgets::SmallLabel;
using mcc::widgets::SwitchWidget;
using mcc::widgets::TipsLabel;
using mcc::widgets::TranslucentFrame;

namespace {

constexpr int kColumnWidth = 400;
constexpr int kRoomForTips = 300; // which are wider than a row

// Program and desktop select the label classes by type; so does the sheet.
const char kLabelLook[] = "mcc--widgets--LargeLabel { font-size: 20px; }"
                          "mcc--widgets--SmallLabel { font-size: 12px; }"
                          "mcc--widgets--TipsLabel { color: #5b6673; }"
                          "mcc--widgets--TranslucentFrame { background: #e8ecf2; border-radius: 8px; }";

// A column under a heading.
QVBoxLayout *column(QWidget *holder, const QString &heading)
{
    auto *layout = new QVBoxLayout(holder);
    holder->setFixedWidth(kColumnWidth);
    layout->addWidget(new QLabel(QStringLiteral("<h3>%1</h3>").arg(heading)));
    return layout;
}

LineEditWidget *addRow(QVBoxLayout *column, const QString &title, const QString &text, bool password = false)
{
    auto *row = new LineEditWidget(password, nullptr);
    row->setTitle(title);
    row->setText(text);
    column->addWidget(row);
    return row;
}

SwitchWidget *addSwitch(QVBoxLayout *column, const QString &title, bool on)
{
    auto *row = new SwitchWidget(title);
    row->setChecked(on);
    column->addWidget(row);
    return row;
}

QLabel *iconLabel()
{
    auto *label = new QLabel;
    label->setPixmap(label->style()->standardIcon(QStyle::SP_MessageBoxInformation).pixmap(24, 24));
    return label;
}

} // namespace

FormSheet::FormSheet()
{
    setWindowTitle(tr("Form rows"));
    auto *left = new QVBoxLayout;
    left->addWidget(lineEdits());
    left->addWidget(switches());
    left->addStretch();
    auto *right = new QVBoxLayout;
    right->addWidget(alerts());
    right->addWidget(labels());
    right->addStretch();
    auto *columns = new QHBoxLayout(this);
    columns->addLayout(left);
    columns->addLayout(right);
    columns->addSpacing(kRoomForTips);
    columns->setSizeConstraint(QLayout::SetFixedSize);
}

QPixmap FormSheet::picture() const
{
    QPixmap whole = const_cast<FormSheet *>(this)->grab();
    QPainter painter(&whole);
    const QWidgetList windows = QApplication::topLevelWidgets();
    for (QWidget *popup : windows) {
        if (popup == this || !popup->isVisible())
            continue;
        const QPoint place = mapFromGlobal(popup->pos());
        painter.setClipRegion((popup->mask().isEmpty() ? popup->rect() : popup->mask()).translated(place));
        painter.drawPixmap(place, popup->grab());
    }
    return whole;
}

void FormSheet::changeEvent(QEvent *event)
{
    QWidget::changeEvent(event);
    // Tips close when the window manager gives the window its place and the focus.
    if (event->type() == QEvent::ActivationChange && isActiveWindow())
        QTimer::singleShot(0, this, &FormSheet::showTips);
}

QWidget *FormSheet::lineEdits()
{
    auto *holder = new QWidget;
    QVBoxLayout *rows = column(holder, tr("LineEditWidget"));
    addRow(rows, tr("Empty"), QString())->setPlaceholderText(tr("placeholder"));
    addRow(rows, tr("管理员帐号"), QStringLiteral("admin"))->edit()->setClearButtonEnabled(true);
    addRow(rows, tr("密码"), QStringLiteral("not a secret"), true);
    m_focused = addRow(rows, tr("Focused"), tr("text"));
    addRow(rows, tr("Read-only"), tr("text"))->setReadOnly(true);
    addRow(rows, tr("Disabled"), tr("text"))->setEnabled(false);
    addRow(rows, tr("A title that takes more than one line"), tr("text"));
    addRow(rows, tr("管理员帐号"), tr("title of 70 pixels"))->titleLabel()->setFixedWidth(70);
    addRow(rows, tr("Right widget"), tr("text"))->addRightWidget(new QPushButton(tr("Browse")));
    addRow(rows, tr("Background"), tr("text"))->addBackground();
    return holder;
}

QWidget *FormSheet::alerts()
{
    auto *holder = new QWidget;
    QVBoxLayout *rows = column(holder, tr("Alert and ErrorTip"));
    addRow(rows, tr("Alert alone"), tr("text"))->setIsErr(true);
    addAlert(rows, tr("Tip alone"), tr("Something is wrong"), 56)->setIsErr(false);
    addAlert(rows, tr("帐号"), tr("用户名或密码错误"), 56);
    addAlert(rows, tr("Long tip"),
             tr("This name is taken by another terminal of the domain. Choose one that nobody uses yet, or "
                "ask the "
                "administrator to remove the other terminal."),
             100);
    return holder;
}

QWidget *FormSheet::switches()
{
    auto *holder = new QWidget;
    QVBoxLayout *rows = column(holder, tr("SwitchWidget"));
    addSwitch(rows, tr("Off"), false);
    addSwitch(rows, tr("On"), true);
    addSwitch(rows, tr("Disabled, off"), false)->setEnabled(false);
    addSwitch(rows, tr("Disabled, on"), true)->setEnabled(false);
    addSwitch(rows, tr("Background"), true)->addBackground();
    rows->addWidget(new SwitchWidget(nullptr, iconLabel()));
    rows->addWidget(new SwitchWidget);
    return holder;
}

QWidget *FormSheet::labels()
{
    auto *frame = new TranslucentFrame;
    frame->setStyleSheet(QLatin1String(kLabelLook));
    QVBoxLayout *rows = column(frame, tr("Labels in a TranslucentFrame"));
    rows->addWidget(new LargeLabel(tr("LargeLabel")));
    rows->addWidget(new NormalLabel(tr("NormalLabel")));
    rows->addWidget(new SmallLabel(tr("SmallLabel")));
    rows->addWidget(new TipsLabel(tr("TipsLabel")));
    return frame;
}

// A row with an alert, and `room` below it for the popup.
LineEditWidget *FormSheet::addAlert(QVBoxLayout *column, const QString &title, const QString &text, int room)
{
    LineEditWidget *row = addRow(column, title, tr("text"));
    row->setIsErr(true);
    column->addSpacing(room);
    m_alerts.append({row, text});
    return row;
}

void FormSheet::showTips()
{
    for (const Alert &alert : qAsConst(m_alerts))
        alert.row->showAlertMessage(alert.text);
    activateWindow();
    m_focused->edit()->setFocus();
}
