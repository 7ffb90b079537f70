// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QObject>
#include <QString>

#include <memory>

#if defined(HTTPCLIENTAPI_LIBRARY)
#define HTTPCLIENTAPI_EXPORT Q_DECL_EXPORT
#else
#define HTTPCLIENTAPI_EXPORT Q_DECL_IMPORT
#endif

// HTTPS client of the terminal's services: one synchronous call, one exchange with the server.
//
// A call puts its request on the wire at most once, over a connection of its own, and nothing below it sends
// the request again. It never follows a redirect, keeps no cookie, asks for no compression, inflates nothing
// and never consults the system's CA bundle. TLS 1.2 is the minimum; the usual proxy variables are honoured
// (https_proxy, all_proxy, no_proxy); SSLKEYLOGFILE has no effect.
//
// Each call that fails leaves one qWarning line, which starts with method and address (never with query or
// body) and keeps three cases apart: "nothing was sent", "sent, outcome unknown", "answered". No line holds
// user information of an address or a proxy; characters that steer a terminal or turn the direction of
// writing are replaced.
//
// An object is used from one thread. A call that is made while another one of the same object is in progress
// returns 0 at once. The object may be deleted while its call is in progress; the call then ends as usual.
class HTTPCLIENTAPI_EXPORT HttpClientApi : public QObject
{
    Q_OBJECT

public:
    // `parent`, which may be null, owns the object. `shareConnection` is reserved: a connection outlives the
    // TLS configuration that it was opened under, so every request has one of its own. True leaves a warning
    // and has no other effect.
    HttpClientApi(QObject *parent, bool shareConnection);
    ~HttpClientApi() override;

    // Limit of the whole call in minutes, 1 to 60; the default is 2. Any other value is refused with a
    // warning and the limit stays. Reaching the server (name, TCP, TLS, with a proxy in between its part,
    // too) has a limit of its own of 10 seconds. A call ends within a second after its limit, whatever the
    // other end sends.
    void setReplyTimer(const int &minutes);

    // Files in PEM form: the CA (or the server's own certificate), the client certificate, the client key. An
    // empty string means that this file is not used. They are read here, so that the same path with new
    // contents is another configuration; what cannot be read yet is tried again at each request. Takes effect
    // for the following requests.
    //
    //   CA    certificate, key     a request is
    //   there both there           verified, made with the client certificate
    //   there not named or absent  verified, made without client certificate
    //   absent both named, absent  first contact: made unverified, with a warning that holds host and
    //                              certificate fingerprint; only a GET without body, so that no secret goes
    //                              out
    //   all else                   refused: status 0, nothing sent
    //
    // Verified means chain, validity and host name. A file is trusted only when it is a regular file (no
    // symbolic link) of at most 1 MiB, owned by root or the user and not writable by group or others; any
    // other file that is there gets the request refused, an empty one too. A key should be readable by as few
    // as possible: one of root's with mode 0640 and a group of few, or one of the user's with mode 0600. One
    // that others can read is used as well; the first request that is made with it leaves one warning with
    // path and mode. A CA file without a certificate is refused, and so is a key of another certificate.
    void setSSLConfig(const QString &caFile, const QString &certificateFile, const QString &keyFile);

    // Sends a GET or POST to `url` (https, with a host) and returns when the exchange has ended. A body that
    // is not empty goes out as UTF-8 with the content type application/json, with GET too. It may hold a
    // password: what is made of `body` on the way is overwritten before the call returns.
    //
    // Returns the HTTP status, redirects and errors included, and stores the reply's body in `reply`, decoded
    // as UTF-8: bad bytes become replacement characters, NUL bytes stay, a byte order mark at the start goes.
    // Returns 0 with an empty `reply` when there is no complete reply: refused address or configuration,
    // server not reached or not trusted, time limit exceeded, reply cut off, of contradictory lengths or
    // longer than 4 MiB. A reply of which only the end of the connection tells the length is complete when
    // TLS ended in order.
    //
    // `keepWindowAlive` true, in the application's thread: events are processed during the wait, so that
    // windows repaint and timers run; the application's property "busy" is true; mouse, keyboard, touch,
    // tablet and drag input is discarded, also what is still queued at the end, and windows refuse to close.
    // A call of QCoreApplication::quit() takes effect after the call. False, or in any other thread, or
    // without an application object: the calling thread just waits.
    int getRequest(QString &reply, const QString &url, const QString &body, bool keepWindowAlive);
    int postRequest(QString &reply, const QString &url, const QString &body, bool keepWindowAlive);

private:
    struct Private;
    std::shared_ptr<Private> m_private; // shared with a call in progress

    int request(const char *method, QString &reply, const QString &url, const QString &body,
                bool keepWindowAlive);
};
