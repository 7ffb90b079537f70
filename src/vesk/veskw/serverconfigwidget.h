// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QString>
#include <QWidget>

class QPushButton;

namespace Mtk::Widget {
class MLineEdit;
class MSuggestButton;
} // namespace Mtk::Widget

// First page of the wizard: address and port of the management server. Next asks the network daemon whether
// there is a network, fetches the server's CA, puts it in force and asks whether this terminal may join, all
// in one call stack. Made once by Widget; keeps what the user typed. Writes nothing but the fetched CA.
class ServerConfigWidget : public QWidget
{
    Q_OBJECT

public:
    explicit ServerConfigWidget(QWidget *parent);

Q_SIGNALS:
    // The server lets this terminal join.
    void sigJumpUserLogin();
    void sigCancelSetting();

public Q_SLOTS:
    void onIpv4Changed(const QString &text);
    void onJumpLocal();
    void onTextChanged(const QString &text);
    void onServerChecked(const int &statusCode, const QString &strData);
    void onMacheineCheck(const int &statusCode, const QString &data);

public:
    void showMessageBox(QString text);

private:
    // Returns the left button, which no member holds.
    QPushButton *createInterface();
    void createConnections(QPushButton *cancelButton);

    Mtk::Widget::MSuggestButton *m_nextButton = nullptr;
    Mtk::Widget::MLineEdit *m_hostEdit = nullptr;
    Mtk::Widget::MLineEdit *m_portEdit = nullptr;
    QString m_host;
    QString m_port;
};
