// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "userinfo.h"

#include <QObject>
#include <QString>

namespace vesk::base {

// The base layer's view of the installed terminal record (vesk::kUserinfoPath) and of the machine identity
// (vesk::kMachineidPath). The enrolment client asks it for the identity only; the sibling services use the
// rest. The record is read again on each call and rewritten in place, without lock or rename; nothing throws.
//
// `ok` of the readers may be null. It is not a plain success flag: a record that cannot be opened counts as
// "not joined, nothing known" and reports true; false means that the record lacks a key. Only getMachineID()
// reports false when its file cannot be opened. Callers depend on both.
class FileContent : public QObject
{
    Q_OBJECT

public:
    // `parent`, which may be null, owns the object.
    explicit FileContent(QObject *parent = nullptr);

    // The one instance, made at the first call and destroyed at process exit.
    static FileContent *instace();

    // The machine identity without white space at its ends. A non-empty identity is read once for a process
    // unless `force` is true. When the file cannot be opened the identity known so far is returned and `ok`
    // is false.
    QString getMachineID(bool *ok, bool force);

    static bool isDomain(bool *ok);
    // Rewrites "is_Domain" of a record that has the key. True when the file holds `value` afterwards; what is
    // no boolean there counts as false, so it stays when `value` is false. A write that fails, in part too,
    // may leave a damaged record.
    static bool saveDomain(bool value);

    // The server pair. False when the record cannot be opened or lacks one of the two keys; arguments whose
    // key is absent stay as they were.
    static bool getHostAndPort(QString &host, QString &port);

    static QString getTerminalAlias(bool *ok);

    // The whole record. An older record is repaired on the way: the legacy key "server_ip" fills
    // "domain_host" and "server_port" fills a missing "domain_port", in the result and in the file.
    static UserInfo getUserInfo(bool *ok);
    // Replaces the whole record; keys that UserInfo does not know are gone afterwards.
    static bool saveUserInfo(const UserInfo &info);

private:
    QString m_machineId;
};

// Sets one key of the installed record and keeps the others; a file that is no JSON is replaced by one that
// holds this key alone. False when the file could not be opened or written. Instantiated for QString.
template <typename T>
bool updateUserInfo(const QString &key, const T &value);

} // namespace vesk::base
