// SPDX-License-Identifier: Apache-2.0
#include "campaign/checks/worldchecks.h"

#include "journal/smallfile.h"

#include <QRegularExpression>

#include <algorithm>

namespace sandbox {

namespace {

// "execve("PATH", ...", "execveat(3, "PATH", ..."
QString programIn(const QString &line)
{
    static const QRegularExpression start(QStringLiteral("^\\d+ +execve(?:at)?\\([^\"]*\"([^\"]*)\""));
    const bool hasFailed = line.contains(QLatin1String(" = -1 E"));
    return hasFailed ? QString() : start.match(line).captured(1);
}

// "connect(3, {sa_family=AF_UNIX, sun_path="PATH"}, ...", "... sin_port=htons(1),
// sin_addr=inet_addr("ADDRESS")}",
// "... sin6_port=htons(1), ..., inet_pton(AF_INET6, "ADDRESS", ..."
QString peerIn(const QString &line)
{
    static const QRegularExpression local(QStringLiteral("^\\d+ +connect\\(.*sun_path=(@?)\"([^\"]*)\""));
    static const QRegularExpression remote(
        QStringLiteral("^\\d+ +connect\\(.*port=htons\\((\\d+)\\).*\"([^\"]*)\""));
    const auto path = local.match(line);
    const auto address = remote.match(line);
    if (path.hasMatch())
        return path.captured(1) + path.captured(2);
    return address.hasMatch() ? address.captured(2) + QLatin1Char(':') + address.captured(1) : QString();
}

bool isOneOf(const QString &seen, const QStringList &patterns)
{
    return std::any_of(patterns.begin(), patterns.end(), [&seen](const QString &pattern) {
        return QRegularExpression(QRegularExpression::wildcardToRegularExpression(pattern))
            .match(seen)
            .hasMatch();
    });
}

} // namespace

QStringList worldchecks::trace(const QString &record, const JourneyPlan &plan)
{
    QStringList result;
    for (const QByteArray &line : smallfile::load(record).split('\n')) {
        const QString program = programIn(QString::fromUtf8(line));
        const QString peer = peerIn(QString::fromUtf8(line));
        if (!program.isEmpty() && !isOneOf(program, plan.programs))
            result.append(QStringLiteral("not planned: the start of %1").arg(program));
        if (!peer.isEmpty() && !isOneOf(peer, plan.peers))
            result.append(QStringLiteral("not planned: a connection to %1").arg(peer));
    }
    result.removeDuplicates();
    return result;
}

} // namespace sandbox
