// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QPixmap>
#include <QVector>
#include <QWidget>

class QVBoxLayout;

namespace mcc::widgets {
class LineEditWidget;
class SettingsItem;
} // namespace mcc::widgets

// One window with each form row in each of its states, for people to look at.
class FormSheet : public QWidget
{
    Q_OBJECT

public:
    FormSheet();

    // The window as it is on the screen, with the popups that float over it.
    QPixmap picture() const;

protected:
    void changeEvent(QEvent *event) override;

private:
    QWidget *lineEdits();
    QWidget *alerts();
    QWidget *switches();
    QWidget *labels();
    mcc::widgets::LineEditWidget *addAlert(QVBoxLayout *column, const QString &title, const QString &text,
                                           int room);
    void showTips();

    struct Alert
    {
        mcc::widgets::LineEditWidget *row;
        QString text;
    };
    QVector<Alert> m_alerts;
    mcc::widgets::LineEditWidget *m_focused = nullptr;
};
