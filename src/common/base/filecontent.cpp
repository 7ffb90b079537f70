// SPDX-License-Identifier: Apache-2.0
#include "filecontent.h"

#include "baseutils.h"
#include "fileproxy.h"
#include "logtext.h"
#include "regularfile.h"
#include "wellknownpaths.h"

#include <QDebug>
#include <QJsonDocument>
#include <QJsonObject>

namespace vesk::base {

namespace {

// Static objects, as the contract has them.
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
    if (proxy.open(QString::fromUtf8(path), mode) && (!isRead || regularfile::isWithinLimit(proxy.file)))
        return true;
    BaseUtils::openFailedLog(func);
    return false;
}

// The installed record, as one operation reads and rewrites it.
struct Record
{
    const QString func;       // the operation's name, with which its log lines begin
    FileProxy proxy{nullptr}; // for reading, then again for writing
    QJsonObject values = {};

    // What is no JSON object reads as an empty one.
    bool read()
    {
        if (!openFile(proxy, kUserinfoPath, QIODevice::ReadOnly, func))
            return false;
        values = QJsonDocument::fromJson(regularfile::readAll(proxy.file)).object();
        proxy.file.close();
        return true;
    }

    template <typename T>
    bool get(const QString &key, T &value) const
    {
        return BaseUtils::getJsonObjectValue(values, key, value, func);
    }

    // Logs `failure` when the file was opened but not written.
    bool write(QIODevice::OpenMode mode, const QString &failure)
    {
        if (!openFile(proxy, kUserinfoPath, mode, func))
            return false;
        const QByteArray text = QJsonDocument(values).toJson();
        // The count alone tells what the buffer took, not the file.
        if (proxy.file.write(text) == text.size() && proxy.file.flush())
            return true;
        qInfo().noquote() << failure;
        return false;
    }
};

QString writeFailure(const QString &key)
{
    return QStringLiteral("write value failed, key: ") + logText(key);
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
    Record record{func};
    setFlag(ok, !record.read() || record.get(key, value));
    return value;
}

// "domain_port", for an older record from "server_port", which is then stored under both names.
bool readDomainPort(const Record &record, QString &port)
{
    if (record.get(kDomainPortKey, port))
        return true;
    return record.get(kServerPortKey, port) && updateUserInfo(kDomainPortKey, port);
}

void readHosts(const Record &record, UserInfo &info)
{
    const bool hasFlag = record.get(kIsDomainKey, info.isDomain);
    const bool hasServer = record.get(kServerHostKey, info.serverHost);
    const bool hasDomain = record.get(kDomainHostKey, info.domainHost);
    // Any of the three missing marks an older record, whose "server_ip" then wins over a "domain_host" too.
    if ((!hasFlag || !hasServer || !hasDomain) && record.get(kServerIpKey, info.domainHost))
        updateUserInfo(kDomainHostKey, info.domainHost);
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
    bool known = !m_machineId.isEmpty() && !force;
    if (!known) {
        FileProxy proxy;
        known = openFile(proxy, kMachineidPath, QIODevice::ReadOnly, QStringLiteral("getMachineID"));
        if (known)
            m_machineId = QString::fromUtf8(regularfile::readAll(proxy.file).trimmed().constData());
    }
    setFlag(ok, known);
    return m_machineId;
}

bool FileContent::isDomain(bool *ok)
{
    return readValue(kIsDomainKey, false, ok, QStringLiteral("isDomain"));
}

bool FileContent::saveDomain(bool value)
{
    Record record{QStringLiteral("saveDomain")};
    if (!record.read())
        return false;
    if (!record.values.contains(kIsDomainKey)) {
        qInfo().noquote() << "It is not contain in info file, key:" << kIsDomainKey;
        return false;
    }
    if (record.values.value(kIsDomainKey).toBool(false) == value) {
        qDebug().noquote() << "value is the same in file, key:" << kIsDomainKey;
        return true;
    }
    record.values.insert(kIsDomainKey, value);
    return record.write(QIODevice::WriteOnly, writeFailure(kIsDomainKey));
}

bool FileContent::getHostAndPort(QString &host, QString &port)
{
    Record record{QStringLiteral("getHostAndPort")};
    if (!record.read())
        return false;
    const bool hasHost = record.get(kServerHostKey, host);
    const bool hasPort = record.get(kServerPortKey, port);
    return hasHost && hasPort;
}

QString FileContent::getTerminalAlias(bool *ok)
{
    return readValue(kTerminalNameKey, QString(), ok, QStringLiteral("getTerminalAlias"));
}

UserInfo FileContent::getUserInfo(bool *ok)
{
    UserInfo info;
    Record record{QStringLiteral("getUserInfo")};
    bool complete = true;
    if (record.read()) {
        readHosts(record, info);
        complete = readDomainPort(record, info.domainPort);
        complete = record.get(kServerPortKey, info.serverPort) && complete;
        complete = record.get(kTerminalNameKey, info.terminalName) && complete;
    }
    setFlag(ok, complete);
    return info;
}

bool FileContent::saveUserInfo(const UserInfo &info)
{
    Record record{QStringLiteral("saveUserInfo")};
    record.values = {
        {kIsDomainKey, info.isDomain},     {kServerHostKey, info.serverHost},
        {kServerPortKey, info.serverPort}, {kDomainHostKey, info.domainHost},
        {kDomainPortKey, info.domainPort}, {kTerminalNameKey, info.terminalName},
    };
    return record.write(QIODevice::WriteOnly, QStringLiteral("write info json failed"));
}

template <typename T>
bool updateUserInfo(const QString &key, const T &value)
{
    Record record{QStringLiteral("updateUserInfo")};
    if (!record.read())
        return false;
    record.values.insert(key, value);
    return record.write(QIODevice::WriteOnly | QIODevice::Truncate, writeFailure(key));
}

template bool updateUserInfo<QString>(const QString &key, const QString &value);

} // namespace vesk::base
