// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QString>
#include <QWidget>

class QPushButton;

namespace Mtk::Widget {
class MLabel;
class MLineEdit;
class MSuggestButton;
} // namespace Mtk::Widget

// Third page of the wizard: the alias under which the server will know this terminal. Next has the alias
// checked and keeps an accepted one in FileConfig. Made once by Widget; the address that it shows is the one
// at that moment.
class NewTerminalNameWidget : public QWidget
{
    Q_OBJECT

public:
    explicit NewTerminalNameWidget(QWidget *parent);

    void setTerminalName(const QString &name);

Q_SIGNALS:
    // The alias is accepted and stored.
    void sig_jump_finish_setting();
    void sig_jump_login();

public Q_SLOTS:
    void on_edit_changed(const QString &text);
    void onNext();

public:
    void showMessageBox(const QString &text);

private:
    // Returns the left button, which no member holds.
    QPushButton *createInterface();
    void createConnections(QPushButton *backButton);

    Mtk::Widget::MLineEdit *m_aliasEdit = nullptr;
    Mtk::Widget::MSuggestButton *m_nextButton = nullptr;
    Mtk::Widget::MLabel *m_addressLabel = nullptr;
    QString m_terminalName; // kept for the layout of the class; nothing reads it
};
