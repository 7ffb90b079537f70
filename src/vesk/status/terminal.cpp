// SPDX-License-Identifier: Apache-2.0
// What the terminal is: its record and its identity.
#include "record.h"

#include "fileaccess.h"
#include "filecontent.h"
#include "wellknownpaths.h"

#include <algorithm>

namespace {

constexpr int kMaxPort = 65535;

const QString kRecordPath = QString::fromUtf8(vesk::kUserinfoPath);

bool isPort(const QString &text)
{
    const bool hasDigits = std::all_of(
        text.begin(), text.end(), [](QChar c) { return c >= QLatin1Char('0') && c <= QLatin1Char('9'); });
    return hasDigits && text.toInt() >= 1 && text.toInt() <= kMaxPort;
}

QString restoreAdvice()
{
    return Text::tr("restore the record; or remove it here and the terminal on the server, and join again");
}

Finding joinedFinding(Joined joined)
{
    const QString key = QStringLiteral("joined");
    if (!joined)
        return {key,
                State::Unknown,
                QJsonValue::Null,
                Text::tr("cannot tell whether this terminal has joined"),
                {}};
    return {key,
            State::None,
            *joined,
            *joined ? Text::tr("this terminal has joined") : Text::tr("this terminal has not joined"),
            {}};
}

// Of a record that can be read as one.
Finding wholeRecord(const Record &record, const QString &key)
{
    const Joined joined = record.joined();
    if (!joined)
        return {key, State::Fault, QStringLiteral("incomplete"),
                Text::tr("%1 does not say whether this terminal has joined").arg(kRecordPath),
                restoreAdvice()};
    if (*joined && (record.text("server_host").isEmpty() || !isPort(record.text("server_port"))))
        return {key, State::Fault, QStringLiteral("incomplete"),
                Text::tr("%1 names no server of a terminal that has joined").arg(kRecordPath),
                restoreAdvice()};
    return {key, State::Ok, QStringLiteral("whole"), FileAccess::of(kRecordPath).toText(kRecordPath), {}};
}

Finding recordFinding(const Record &record)
{
    const QString key = QStringLiteral("record");
    const QString restore = restoreAdvice();
    switch (record.state) {
    case Record::State::Missing:
        return {
            key, State::None, QStringLiteral("missing"), Text::tr("%1 is not there").arg(kRecordPath), {}};
    case Record::State::Unreadable:
        return {key, State::Unknown, QStringLiteral("unreadable"),
                Text::tr("this user may not read %1").arg(kRecordPath),
                Text::tr("let all users read the record: mode 0644")};
    case Record::State::Refused:
        return {key, State::Fault, QStringLiteral("refused"),
                Text::tr("%1 is not a regular file, or is too long").arg(kRecordPath), restore};
    case Record::State::Empty:
        return {key, State::Fault, QStringLiteral("empty"), Text::tr("%1 is empty").arg(kRecordPath),
                restore};
    case Record::State::Torn:
        return {key, State::Fault, QStringLiteral("torn"),
                Text::tr("%1 is torn: not a JSON object").arg(kRecordPath), restore};
    case Record::State::Whole:
        break;
    }
    return wholeRecord(record, key);
}

Finding address(const char *key, const QString &host, const QString &port)
{
    if (host.isEmpty() && port.isEmpty())
        return {QLatin1String(key), State::None, QJsonValue::Null, Text::tr("not known"), {}};
    const QString text = QStringLiteral("%1:%2").arg(host, port);
    return {QLatin1String(key), State::None, text, text, {}};
}

bool isSound(const QString &identity)
{
    return !identity.isEmpty() &&
           std::all_of(identity.begin(), identity.end(), [](QChar c) { return c.isPrint() && !c.isSpace(); });
}

// As the program reads and sends it.
Finding identityFinding()
{
    const QString key = QStringLiteral("machine-identity");
    const QString path = QString::fromUtf8(vesk::kMachineidPath);
    if (FileAccess::of(path).presence == FileAccess::Presence::Unreadable)
        return {key, State::Unknown, QJsonValue::Null, Text::tr("this user may not read %1").arg(path),
                Text::tr("let all users read it: mode 0644")};
    bool isThere = false;
    const QString identity = vesk::base::FileContent::instace()->getMachineID(&isThere, true);
    const QString advice = Text::tr("have the identity of this machine written there, in one line");
    if (!isThere)
        return {key, State::Fault, QJsonValue::Null, Text::tr("%1 is not there or cannot be used").arg(path),
                advice};
    if (!isSound(identity))
        return {key, State::Fault, identity, Text::tr("%1 does not hold one identity in one line").arg(path),
                advice};
    return {key, State::Ok, identity, identity, {}};
}

} // namespace

Findings terminalFindings(const Record &record)
{
    Findings findings{joinedFinding(record.joined()), recordFinding(record)};
    if (record.state == Record::State::Whole) {
        findings += address("server", record.text("server_host"), record.text("server_port"));
        findings += address("domain", record.text("domain_host"), record.text("domain_port"));
        const QString alias = record.text("terminal_name");
        findings += Finding{QStringLiteral("alias"), State::None, alias, alias, {}};
    }
    findings += identityFinding();
    return findings;
}
