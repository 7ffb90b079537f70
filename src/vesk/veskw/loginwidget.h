// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QString>
#include <QWidget>

class QPushButton;

namespace Mtk::Widget {
class MLineEdit;
class MPasswordEdit;
class MSuggestButton;
} // namespace Mtk::Widget

// Second page of the wizard: a domain account and its password, which Next has the server check. Holds the
// only copy of the account name that the join uses. The password lives in its field alone. Made once by
// Widget.
class LoginWidget : public QWidget
{
    Q_OBJECT

public:
    explicit LoginWidget(QWidget *parent);

    // The account as it stands in its field now.
    QString userName() const;
    // Empties the field, for when nobody can come back to the page. Until then a second attempt needs it.
    void forgetPassword();

Q_SIGNALS:
    // The server knows account and password.
    void sigJumpNewTerminal();
    void sigJumpServerSetting();

public Q_SLOTS:
    void onCheckAccountPwd();
    void onNameChanged(const QString &text);
    void onPwdChanged(const QString &text);
    void onLoginChecked(const int &statusCode, const QString &data);

public:
    void showMessageBox(const QString &text);

private:
    // Returns the left button, which no member holds.
    QPushButton *createInterface();
    void createConnections(QPushButton *backButton);

    Mtk::Widget::MSuggestButton *m_nextButton = nullptr;
    Mtk::Widget::MLineEdit *m_userEdit = nullptr;
    Mtk::Widget::MPasswordEdit *m_passwordEdit = nullptr;
};
