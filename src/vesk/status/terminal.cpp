// SPDX-License-Identifier: Apache-2.0
// What the terminal is: its record and its identity.
#include "record.h"

#include "fileaccess.h"
#include "filecontent.h"
#include "wellknownpaths.h"

#include <algorithm>

namespace {

bool isPort(const QString &text)
{
    bool isNumber = false;
    return text.toUShort(&isNumber) != 0 && isNumber;
}

Finding joinedFinding(Joined joined)
{
    const QString key = QStringLiteral("joined");
    if (!joined)
        return Finding::unknown(key, Text::tr("cannot tell whether this terminal has joined"));
    return Finding::none(key, *joined,
                         *joined ? Text::tr("this terminal has joined")
                                 : Text::tr("this terminal has not joined"));
}

Finding recordFinding(const Record &record)
{
    const QString key = QStringLiteral("record");
    const QString path = QString::fromUtf8(vesk::kUserinfoPath);
    const auto fault = [&](const char *value, const QString &text) {
        return Finding::fault(
            key, QLatin1String(value), text.arg(path),
            Text::tr("restore the record; or remove it here and the terminal on the server, and join again"));
    };
    switch (record.state) {
    case Record::State::Missing:
        return Finding::none(key, QStringLiteral("missing"), Text::tr("%1 is not there").arg(path));
    case Record::State::Unreadable:
        return {key, State::Unknown, QStringLiteral("unreadable"),
                Text::tr("this user may not read %1").arg(path),
                Text::tr("let all users read it: mode 0644")};
    case Record::State::Refused:
        return fault("refused", Text::tr("%1 is not a regular file, or is too long"));
    case Record::State::Empty:
        return fault("empty", Text::tr("%1 is empty"));
    case Record::State::Torn:
        return fault("torn", Text::tr("%1 is torn: not a JSON object"));
    case Record::State::Whole:
        break;
    }
    if (!record.joined())
        return fault("incomplete", Text::tr("%1 does not say whether this terminal has joined"));
    if (*record.joined() && (record.text("server_host").isEmpty() || !isPort(record.text("server_port"))))
        return fault("incomplete", Text::tr("%1 names no server of a terminal that has joined"));
    return Finding::ok(key, QStringLiteral("whole"), FileAccess::of(path).toText(path));
}

Finding textFinding(const char *key, const QString &text)
{
    return text.isEmpty() ? Finding::none(QLatin1String(key), QJsonValue::Null, Text::tr("not known"))
                          : Finding::none(QLatin1String(key), text, text);
}

QString address(const QString &host, const QString &port)
{
    return host.isEmpty() ? QString() : QStringLiteral("%1:%2").arg(host, port);
}

// As the program reads and sends it.
Finding identityFinding()
{
    const QString key = QStringLiteral("machine-identity");
    const QString path = QString::fromUtf8(vesk::kMachineidPath);
    if (FileAccess::of(path).presence == FileAccess::Presence::Unreadable)
        return Finding::unknown(key, Text::tr("this user may not read %1").arg(path),
                                Text::tr("let all users read it: mode 0644"));
    bool isThere = false;
    const QString identity = vesk::base::FileContent::instace()->getMachineID(&isThere, true);
    const bool isOneWord = !identity.isEmpty() && std::all_of(identity.begin(), identity.end(), [](QChar c) {
        return c.isPrint() && !c.isSpace();
    });
    if (isThere && isOneWord)
        return Finding::ok(key, identity, identity);
    return Finding::fault(key, isThere ? identity : QJsonValue(),
                          isThere ? Text::tr("%1 does not hold one identity in one line").arg(path)
                                  : Text::tr("%1 is not there or cannot be used").arg(path),
                          Text::tr("have the identity of this machine written there, in one line"));
}

} // namespace

Findings terminalFindings(const Record &record)
{
    Findings findings{joinedFinding(record.joined()), recordFinding(record)};
    if (record.state == Record::State::Whole) {
        findings += textFinding("server", address(record.text("server_host"), record.text("server_port")));
        findings += textFinding("domain", address(record.text("domain_host"), record.text("domain_port")));
        findings += textFinding("alias", record.text("terminal_name"));
    }
    findings += identityFinding();
    return findings;
}
