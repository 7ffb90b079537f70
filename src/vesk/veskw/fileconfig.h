// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QObject>
#include <QString>
#include <QUrl>

// The program's view of the terminal record, in memory. Read once from /etc/vesk/userinfo.json, when the
// instance is made; the pages change it through the setters, which touch memory only; writeServerConfig()
// stages a copy that the service veskg installs. Beside that it turns the record into server URLs, stores
// certificate files and knows host name and hardware address. Every failure is logged and shows as an empty
// value; nothing throws. Ports are strings of decimal digits.
class FileConfig : public QObject
{
    Q_OBJECT

public:
    explicit FileConfig(QObject *parent);

    // The one instance, made at the first call and destroyed, without a write, at process exit.
    static FileConfig *GetInstance();

    QString readServerHost() const { return m_serverHost; }
    QString readDomainHost() const { return m_domainHost; }
    QString readServerPort() const { return m_serverPort; }
    QString readDomainPort() const { return m_domainPort; }
    QString readTerminalName() { return m_terminalName; }
    bool readIsDomain() { return m_isDomain; }

    void setServerHost(const QString &host) { m_serverHost = host; }
    void setServerPort(const QString &port) { m_serverPort = port; }
    void setDomainHost(const QString &host) { m_domainHost = host; }
    void setDomainPort(const QString &port) { m_domainPort = port; }
    void setTerminalName(const QString &name) { m_terminalName = name; }
    void setIsDomain(const bool &isDomain) { m_isDomain = isDomain; }

    // https URL of `path` at the address that the user entered. A port that is no number becomes 0; nothing
    // checks that the result is usable.
    QUrl getDomainUrl(const QString &path) const;
    // The same at the address that the server named when the terminal joined.
    QUrl getServerUrl(const QString &path) const;

    // Decodes the Base64 text `cert` into the file `path`, which replaces what stood there; missing
    // directories are made. Only the owner can read file and new directories, from the first moment on, and a
    // link at `path` is replaced, not followed. Bad Base64 is not noticed. A failed open leaves no file.
    void saveCert(const QString &cert, const QString &path);

    // Content of /etc/hostname without line feeds; empty when it cannot be read.
    QString readHostName() const;

    // Stages the record as "vesk/userinfo.json" in the temporary directory.
    void writeServerConfig();

    // Whether the record of this terminal would be short enough for its readers if it had joined at that
    // server.
    bool hasRoomFor(const QString &serverHost, const QString &serverPort) const;

    // Hardware address of the primary network connection, as the network daemon reports it; a null string
    // when the daemon does not answer or has no primary connection. Blocks until it has answered.
    QString getMacAddress() const;

private:
    void readServerConfig(const QString &path);
    QByteArray recordOf(bool isDomain, const QString &serverHost, const QString &serverPort) const;
    static QUrl buildUrl(const QString &host, const QString &port, const QString &path);

    QString m_serverHost;
    QString m_domainHost;
    QString m_domainPort;
    QString m_serverPort;
    QString m_terminalName;
    bool m_isDomain = false;
};
