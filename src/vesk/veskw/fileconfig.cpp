// SPDX-License-Identifier: Apache-2.0
#include "fileconfig.h"

#include "dbusservices.h"
#include "logtext.h"
#include "regularfile.h"

#include <QDir>
#include <QFile>
#include <QJsonArray>
#include <QJsonDocument>
#include <QJsonObject>
#include <QTextStream>

#include <QDebug>

namespace regularfile = vesk::base::regularfile;
using vesk::base::logText;

namespace {

// Nobody above looks at what came of a write, but the log tells that something is left half done.
void warnOfLoss(const QString &path, const QFile &file)
{
    qWarning().noquote() << logText(path) << "is not written whole:" << file.errorString();
}

} // namespace

FileConfig::FileConfig(QObject *parent)
    : QObject(parent)
{
    readServerConfig(QStringLiteral("/etc/vesk/userinfo.json"));
}

FileConfig *FileConfig::GetInstance()
{
    static FileConfig instance(nullptr);
    return &instance;
}

QUrl FileConfig::getDomainUrl(const QString &path) const
{
    return buildUrl(readDomainHost(), readDomainPort(), path);
}

QUrl FileConfig::getServerUrl(const QString &path) const
{
    return buildUrl(readServerHost(), readServerPort(), path);
}

QUrl FileConfig::buildUrl(const QString &host, const QString &port, const QString &path)
{
    QUrl url;
    url.setScheme(QStringLiteral("https"));
    url.setHost(host);
    url.setPath(path);
    url.setPort(port.toInt());
    qDebug() << "url:" << url;
    return url;
}

void FileConfig::saveCert(const QString &cert, const QString &path)
{
    QFile file(path);
    if (!regularfile::createPrivate(file)) {
        qInfo() << "writeCERT open error! ";
        return;
    }
    const QByteArray content = QByteArray::fromBase64(cert.toLocal8Bit());
    if (file.write(content) != content.size() || !file.flush())
        warnOfLoss(path, file);
}

QString FileConfig::readHostName() const
{
    const QString path = QStringLiteral("/etc/hostname");
    if (!QFile::exists(path)) {
        qInfo().noquote() << " not found :" << path;
        return QString();
    }
    QFile file(path);
    if (!regularfile::openToRead(file, QIODevice::ReadOnly | QIODevice::Text)) {
        qInfo().noquote() << " open filed :" << path;
        return QString();
    }
    return QString::fromUtf8(regularfile::readAll(file)).remove(QLatin1Char('\n'));
}

void FileConfig::readServerConfig(const QString &path)
{
    m_isDomain = false;
    if (!QFile::exists(path)) {
        m_terminalName = readHostName();
        qInfo() << " not found userinfo.json";
        return;
    }
    QFile file(path);
    if (!regularfile::openToRead(file, QIODevice::ReadOnly | QIODevice::Text)) {
        qInfo() << "fail to open file userinfo.json !";
        m_terminalName = readHostName();
        return;
    }

    QJsonParseError error{};
    const QJsonObject record = QJsonDocument::fromJson(regularfile::readAll(file), &error).object();
    if (error.error != QJsonParseError::NoError) {
        qInfo() << "userinfo.json Json error";
        return;
    }
    m_serverHost = record.value(QStringLiteral("server_host")).toString();
    m_serverPort = record.value(QStringLiteral("server_port")).toString();
    m_domainHost = record.value(QStringLiteral("domain_host")).toString();
    m_domainPort = record.value(QStringLiteral("domain_port")).toString();
    m_terminalName = record.value(QStringLiteral("terminal_name")).toString();
    m_isDomain = record.value(QStringLiteral("is_Domain")).toBool(false);
}

QByteArray FileConfig::recordOf(bool isDomain, const QString &serverHost, const QString &serverPort) const
{
    const QJsonObject record{
        {QStringLiteral("server_host"), serverHost},       {QStringLiteral("server_port"), serverPort},
        {QStringLiteral("domain_host"), readDomainHost()}, {QStringLiteral("domain_port"), readDomainPort()},
        {QStringLiteral("terminal_name"), m_terminalName}, {QStringLiteral("is_Domain"), isDomain},
    };
    return QJsonDocument(record).toJson();
}

bool FileConfig::hasRoomFor(const QString &serverHost, const QString &serverPort) const
{
    return recordOf(true, serverHost, serverPort).size() <= regularfile::kMaxSize;
}

void FileConfig::writeServerConfig()
{
    const QByteArray record = recordOf(readIsDomain(), readServerHost(), readServerPort());
    const QString text = QString::fromUtf8(record.constData());

    QDir directory(QDir::tempPath() + QStringLiteral("/vesk"));
    if (!directory.exists()) {
        directory.cdUp();
        regularfile::makePrivateDirectory(directory, QStringLiteral("vesk"));
    }
    const QString path = QDir::tempPath() + QStringLiteral("/vesk/userinfo.json");
    qDebug().noquote() << "FileConfig::writeServerInfo---strConfig:" << logText(path);

    QFile file(path);
    if (!regularfile::replace(file, QIODevice::WriteOnly | QIODevice::Truncate | QIODevice::Text)) {
        qInfo() << "file open error";
        return;
    }
    qDebug() << "write json success";
    QTextStream stream(&file);
    stream << text << Qt::flush;
    if (stream.status() != QTextStream::Ok || !file.flush())
        warnOfLoss(path, file);
}

QString FileConfig::getMacAddress() const
{
    const std::optional<QString> reply = dbusservices::activeConnections();
    if (!reply) {
        qCritical() << "GetActiveConnectionInfo error";
        return QString();
    }

    const QJsonArray connections = QJsonDocument::fromJson(reply->toUtf8()).array();
    for (const QJsonValue connection : connections) {
        const QJsonObject details = connection.toObject();
        if (details.value(QStringLiteral("IsPrimaryConnection")).toBool(false)) {
            QString address = details.value(QStringLiteral("HwAddress")).toString();
            qInfo() << logText(address);
            return address;
        }
    }
    return QString();
}
