// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "mabstractdialog.h"
#include "mtkglobal.h"

#include <QIcon>
#include <QList>

class QAbstractButton;
class QBoxLayout;

namespace Mtk::Widget {

class DialogIcon;
class DialogText;

// A modal dialog of icon, title, message, contents and a row of buttons; usually built on the stack and run
// with exec(). A press on any button closes it. Title and message are shown as plain text and never cut: the
// dialog grows with them up to three quarters of the screen's height, and scrolls them beyond that. (Only
// past 16,384 characters an ellipsis stands for the rest, and a warning is logged.) The mouse or Ctrl+A
// selects them, and Ctrl+C copies what is selected, or all. Escape closes it without
// an answer; Enter presses the focused button, else the default one, else the recommended one, else the only
// one.
class MTK_EXPORT MDialog : public MAbstractDialog
{
    Q_OBJECT

public:
    // The numbers are part of the binary interface.
    enum ButtonType {
        ButtonNormal = 0,
        ButtonWarning = 1,     // does what cannot be undone
        ButtonRecommended = 2, // drawn as the primary action
    };
    Q_ENUM(ButtonType)

    explicit MDialog(QWidget *parent = nullptr);
    ~MDialog() override;

    void setTitle(const QString &title);
    void setMessage(const QString &message);
    void setIcon(const QIcon &icon);

    // Appends `widget` to the body and takes ownership. No alignment lets it fill the width.
    void addContent(QWidget *widget, Qt::Alignment alignment = {});
    // Appends a button and returns its index, counted from 0.
    int addButton(const QString &text, bool isDefault = false, ButtonType type = ButtonNormal);

    // Runs the dialog. Returns the index of the pressed button, or -1 when it ended in any other way.
    int exec() override;
    void setVisible(bool visible) override;
    void reject() override;

Q_SIGNALS:
    // A button was pressed. Sent before exec() returns: the dialog is hidden by then, but it and its contents
    // still exist.
    void buttonClicked(int index, const QString &text);
    // Sent once each time the dialog closes, however it does; after buttonClicked.
    void closed();

protected:
    void keyPressEvent(QKeyEvent *event) override;

private:
    void press(int index);
    void nameForReaders();
    void limitHeight();
    void placeOverParent();
    void takeInitialFocus();
    QWidget *firstField() const;
    QAbstractButton *answerButton() const;

    DialogIcon *m_icon;
    DialogText *m_text;
    QBoxLayout *m_contents;
    QBoxLayout *m_buttonRow;
    QList<QAbstractButton *> m_buttons;
    QAbstractButton *m_default = nullptr;
    QAbstractButton *m_recommended = nullptr;
    int m_pressed = -1;
    bool m_open = false;
};

} // namespace Mtk::Widget
