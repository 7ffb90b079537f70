// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QObject>
#include <QString>

class HttpClientApi;
class QUrl;
class ServerReply;

// The two questions that the status endpoint answers.
enum MachineState {
    MachineJoin = 0,  // may this terminal join?
    MachineRemove = 1 // may this terminal be removed, for the named user?
};

// The one client of the management server: builds URL and body of each call, hands them to the transport and
// turns the outcome into a signal. It retries nothing and logs no body; a reply that is not JSON or refuses
// leaves a warning and reaches the listeners like any other.
//
// Every call blocks until the exchange has ended, and its signal is emitted inside the call: the listeners,
// modal dialogs included, run to their end before the call returns. `statusCode` is the HTTP status, 0 when
// there was no HTTP response; `data` is the reply text, empty then. Operations with a result return the same
// text.
class HttpRequest : public QObject
{
    Q_OBJECT

public:
    // The one instance, made at the first call and destroyed at process exit. Starts with the installed CA
    // and the installed client pair as TLS configuration.
    static HttpRequest *GetInstance();

    // Files in PEM form: CA, client certificate, client key; an empty text means that the file is not used.
    // In force for the calls that follow.
    void setSSLConfig(const QString &caPath, const QString &certPath, const QString &keyPath);

    // The CA of the server at `host` and `port` (decimal digits), which are remembered for the alias rule.
    void getCaCert(const QString &host, const QString &port);
    // `userName` counts for MachineRemove only.
    QString getMacheineCheck(MachineState state, const QString &userName);
    void postCheckAccountPwd(const QString &userName, const QString &password);
    void postJoinControl(const QString &userName);
    QString postQuitControl(const QString &userName);
    QString postRemoveStatus(const QString &userName, const QString &password);
    void getCompanyName();
    void getUserInfo(const QString &userName);

    // Whether the server accepts `name` as a terminal alias: by its rule, or, where it has none, by asking
    // it. On a refusal `message` is what to show to the user; it stays untouched for a rule that is nothing
    // but slashes.
    bool checkPcName(const QString &name, QString &message);
    // Asks the server itself. `message` receives the server's words, on acceptance too.
    bool checkTerminalByServer(const QString &name, QString &message);

Q_SIGNALS:
    void sigCaCert(const int &statusCode, const QString &data);
    void sigMacheineCheck(const int &statusCode, const QString &data);
    void sigCheckAccountPwd(const int &statusCode, const QString &data);
    void sigJoinControl(const int &statusCode, const QString &data);
    void sigQuitControl(const int &statusCode, const QString &data);
    void sigRemoveStatus(const int &statusCode, const QString &data);
    void sigCompanyName(const int &statusCode, const QString &data);
    void sigUserInfo(const int &statusCode, const QString &data);

public Q_SLOTS:
    void onCaCert(const int &statusCode, const QString &data);
    void onMacheineCheck(const int &statusCode, const QString &data);
    void onCheckAccountPwd(const int &statusCode, const QString &data);
    void onJoinControl(const int &statusCode, const QString &data);
    void onQuitControl(const int &statusCode, const QString &data);
    void onRemoveStatus(const int &statusCode, const QString &data);
    void onCompanyName(const int &statusCode, const QString &data);
    void onUserInfo(const int &statusCode, const QString &data);

private:
    using Request = int (HttpClientApi::*)(QString &reply, const QString &url, const QString &body, bool);
    using Report = void (HttpRequest::*)(const int &statusCode, const QString &data);
    using Yes = bool (ServerReply::*)() const;

    HttpRequest();

    // Sends `body` to `url` by an operation of the transport, hands the outcome to a slot of this object and
    // returns the reply. A reply that is no yes leaves a warning first. `body` may hold a password: it is
    // overwritten once it has been sent.
    QString exchange(Request request, const QUrl &url, const QString &body, Report report, Yes isYes);

    HttpClientApi *m_httpClient; // child of this object
    QString m_host;              // of the latest getCaCert()
    QString m_port;              // of the latest getCaCert()
};

// The version text that services of this product name in their request headers. No request of this program
// carries it.
class GetHttpHeader : public QObject
{
    Q_OBJECT

public:
    static GetHttpHeader *GetInstance();

    QString header();
};
