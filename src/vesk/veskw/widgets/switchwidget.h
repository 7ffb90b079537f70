// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "widgets/settingsitem.h"

class QHBoxLayout;

namespace Mtk::Widget {
class MSwitchButton;
} // namespace Mtk::Widget

namespace mcc::widgets {

// A form row with something on the left, usually a label, and an on-off switch on the right. A click beside
// the switch is only reported; it toggles nothing.
class SwitchWidget : public SettingsItem
{
    Q_OBJECT

public:
    // The row becomes the parent of `leftWidget`; null stands for an empty label, which setTitle() can fill.
    explicit SwitchWidget(QWidget *parent = nullptr, QWidget *leftWidget = nullptr);
    explicit SwitchWidget(const QString &title, QWidget *parent = nullptr);

    // Doesn't emit checkedChanged().
    void setChecked(bool checked);
    bool checked() const;

    // Empty where the left widget is no label.
    QString title() const;
    // The label's text, where there is a label; in any case the name of row and switch for a screen reader.
    void setTitle(const QString &title);

Q_SIGNALS:
    // The user toggled the switch.
    void checkedChanged(bool checked) const;
    // A mouse button, whichever it is, was released beside the switch.
    void clicked();

protected:
    void mouseReleaseEvent(QMouseEvent *event) override;

private:
    QWidget *m_leftWidget;
    Mtk::Widget::MSwitchButton *m_switchBtn;
    QHBoxLayout *m_mainLayout;
};

} // namespace mcc::widgets
