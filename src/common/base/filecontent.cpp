// SPDX-License-Identifier: Apache-2.0
#include "filecontent.h"

#include "baseutils.h"
#include "fileproxy.h"
#include "logtext.h"
#include "plainfile.h"
#include "wellknownpaths.h"

#include <QDebug>
#include <QJsonDocument>
#include <QJsonObject>

namespace vesk {
namespace base {

namespace {

const QString kIsDomainKey = QStringLiteral("is_Domain");
const QString kServerHostKey = QStringLiteral("server_host");
const QString kServerPortKey = QStringLiteral("server_port");
const QString kServerIpKey = QStringLiteral("server_ip"); // older records' name of "domain_host"
const QString kDomainHostKey = QStringLiteral("domain_host");
const QString kDomainPortKey = QStringLiteral("domain_port");
const QString kTerminalNameKey = QStringLiteral("terminal_name");

bool openFile(FileProxy &proxy, const char *path, QIODevice::OpenMode mode, const QString &func)
{
    const bool isRead = mode == QIODevice::ReadOnly;
    if (proxy.open(QString::fromUtf8(path), mode) && (!isRead || plainfile::isWithinLimit(proxy.file)))
        return true;
    BaseUtils::openFailedLog(func);
    return false;
}

// Opens the record for reading and takes its object; what is no JSON object reads as an empty one.
bool readRecord(FileProxy &proxy, QJsonObject &record, const QString &func)
{
    if (!openFile(proxy, kUserinfoPath, QIODevice::ReadOnly, func))
        return false;
    record = QJsonDocument::fromJson(plainfile::readAll(proxy.file)).object();
    return true;
}

bool writeRecord(FileProxy &proxy, const QJsonObject &record)
{
    const QByteArray text = QJsonDocument(record).toJson();
    // The count alone tells what the buffer took, not the file.
    return proxy.file.write(text) == text.size() && proxy.file.flush();
}

void setFlag(bool *ok, bool value)
{
    if (ok != nullptr)
        *ok = value;
}

// One value of the record, by the readers' convention of `ok`.
template <typename T>
T readValue(const QString &key, T value, bool *ok, const QString &func)
{
    FileProxy proxy;
    QJsonObject record;
    bool found = true;
    if (readRecord(proxy, record, func))
        found = BaseUtils::getJsonObjectValue(record, key, value, func);
    setFlag(ok, found);
    return value;
}

// "domain_port", for an older record from "server_port", which is then stored under both names.
bool readDomainPort(const QJsonObject &record, QString &port, const QString &func)
{
    if (BaseUtils::getJsonObjectValue(record, kDomainPortKey, port, func))
        return true;
    QString serverPort;
    if (!BaseUtils::getJsonObjectValue(record, kServerPortKey, serverPort, func))
        return false;
    port = serverPort;
    return updateUserInfo(kDomainPortKey, serverPort);
}

void readHosts(const QJsonObject &record, UserInfo &info, const QString &func)
{
    const bool hasFlag = BaseUtils::getJsonObjectValue(record, kIsDomainKey, info.isDomain, func);
    const bool hasServer = BaseUtils::getJsonObjectValue(record, kServerHostKey, info.serverHost, func);
    const bool hasDomain = BaseUtils::getJsonObjectValue(record, kDomainHostKey, info.domainHost, func);
    if (hasFlag && hasServer && hasDomain)
        return;

    // Any of the three missing marks an older record, whose "server_ip" then wins over a "domain_host" too.
    QString legacyHost;
    if (BaseUtils::getJsonObjectValue(record, kServerIpKey, legacyHost, func)) {
        info.domainHost = legacyHost;
        updateUserInfo(kDomainHostKey, legacyHost);
    }
}

} // namespace

FileContent::FileContent(QObject *parent)
    : QObject(parent)
{
}

FileContent *FileContent::instace()
{
    static FileContent instance(nullptr);
    return &instance;
}

QString FileContent::getMachineID(bool *ok, bool force)
{
    if (!m_machineId.isEmpty() && !force) {
        setFlag(ok, true);
        return m_machineId;
    }

    FileProxy proxy;
    if (!openFile(proxy, kMachineidPath, QIODevice::ReadOnly, QStringLiteral("getMachineID"))) {
        setFlag(ok, false);
        return m_machineId;
    }
    // Through the character pointer, so that the identity ends at the first NUL byte.
    m_machineId = QString::fromUtf8(plainfile::readAll(proxy.file).trimmed().constData());
    setFlag(ok, true);
    return m_machineId;
}

bool FileContent::isDomain(bool *ok)
{
    return readValue(kIsDomainKey, false, ok, QStringLiteral("isDomain"));
}

bool FileContent::saveDomain(bool value)
{
    const QString func = QStringLiteral("saveDomain");
    FileProxy proxy;
    QJsonObject record;
    if (!readRecord(proxy, record, func))
        return false;
    if (!record.contains(kIsDomainKey)) {
        qInfo().noquote() << "It is not contain in info file, key:" << kIsDomainKey;
        return false;
    }
    if (record.value(kIsDomainKey).toBool(false) == value) {
        qDebug().noquote() << "value is the same in file, key:" << kIsDomainKey;
        return true;
    }

    if (!openFile(proxy, kUserinfoPath, QIODevice::WriteOnly, func))
        return false;
    record.insert(kIsDomainKey, value);
    if (writeRecord(proxy, record))
        return true;
    qInfo().noquote() << "write value failed, key:" << kIsDomainKey;
    return false;
}

bool FileContent::getHostAndPort(QString &host, QString &port)
{
    const QString func = QStringLiteral("getHostAndPort");
    FileProxy proxy;
    QJsonObject record;
    if (!readRecord(proxy, record, func))
        return false;
    const bool hasHost = BaseUtils::getJsonObjectValue(record, kServerHostKey, host, func);
    const bool hasPort = BaseUtils::getJsonObjectValue(record, kServerPortKey, port, func);
    return hasHost && hasPort;
}

QString FileContent::getTerminalAlias(bool *ok)
{
    return readValue(kTerminalNameKey, QString(), ok, QStringLiteral("getTerminalAlias"));
}

UserInfo FileContent::getUserInfo(bool *ok)
{
    const QString func = QStringLiteral("getUserInfo");
    UserInfo info;
    QJsonObject record;
    {
        FileProxy proxy;
        if (!readRecord(proxy, record, func)) {
            setFlag(ok, true);
            return info;
        }
    }

    readHosts(record, info, func);
    bool complete = readDomainPort(record, info.domainPort, func);
    complete = BaseUtils::getJsonObjectValue(record, kServerPortKey, info.serverPort, func) && complete;
    complete = BaseUtils::getJsonObjectValue(record, kTerminalNameKey, info.terminalName, func) && complete;
    setFlag(ok, complete);
    return info;
}

bool FileContent::saveUserInfo(const UserInfo &info)
{
    FileProxy proxy;
    if (!openFile(proxy, kUserinfoPath, QIODevice::WriteOnly, QStringLiteral("saveUserInfo")))
        return false;
    const QJsonObject record{
        {kIsDomainKey, info.isDomain},     {kServerHostKey, info.serverHost},
        {kServerPortKey, info.serverPort}, {kDomainHostKey, info.domainHost},
        {kDomainPortKey, info.domainPort}, {kTerminalNameKey, info.terminalName},
    };
    if (writeRecord(proxy, record))
        return true;
    qInfo() << "write info json failed";
    return false;
}

template <typename T>
bool updateUserInfo(const QString &key, const T &value)
{
    const QString func = QStringLiteral("updateUserInfo");
    FileProxy proxy;
    QJsonObject record;
    if (!readRecord(proxy, record, func))
        return false;
    if (!openFile(proxy, kUserinfoPath, QIODevice::WriteOnly | QIODevice::Truncate, func))
        return false;
    record.insert(key, value);
    if (writeRecord(proxy, record))
        return true;
    qInfo().noquote() << "write value failed, key:" << logText(key);
    return false;
}

template bool updateUserInfo<QString>(const QString &key, const QString &value);

} // namespace base
} // namespace vesk
