// SPDX-License-Identifier: Apache-2.0
#include "play/preparation.h"

#include "certificateauthority.h"
#include "journal/smallfile.h"
#include "play/obstacles.h"

#include <QFileInfo>
#include <QJsonDocument>
#include <QUdpSocket>

namespace sandbox {

namespace {

constexpr quint16 kNameServerPort = 53;

// Without the right to listen there: an address that never answers.
QByteArray silentServer()
{
    static auto *const listener = new QUdpSocket; // as long as this process
    const char ours[] = "127.0.0.200";
    return listener->bind(QHostAddress(QLatin1String(ours)), kNameServerPort) ? ours : "192.0.2.1";
}

void silenceResolver(const StateDirectory &state)
{
    smallfile::write(state.inside(QStringLiteral("/etc/resolv.conf")),
                     "nameserver " + silentServer() + "\noptions timeout:30 attempts:2\n");
}

QString enrolmentPort(const StateDirectory &state)
{
    return QString::number(
        json::number(smallfile::readObject(state.at("server/config.json")), "enrolment_port", 0));
}

// With all placeholders filled in.
QJsonObject filledIn(const StateDirectory &state, const QJsonObject &object)
{
    QByteArray text = QJsonDocument(object).toJson(QJsonDocument::Compact);
    if (!text.contains("{ca}") && !text.contains("{cert}") && !text.contains("key}"))
        return object;
    const auto authority = CertificateAuthority::load(state.at("server/ca.crt"), state.at("server/ca.key"));
    const QString machine = QString::fromUtf8(
        smallfile::read(state.inside(QStringLiteral("/usr/share/vesk/machine.txt"))).value_or("").trimmed());
    const KeyPair pair = authority.issueClient(machine);
    text.replace("{ca}", authority.certificatePem().toBase64());
    text.replace("{cert}", pair.certificatePem.toBase64());
    text.replace("{key}", pair.keyPem.toBase64());
    text.replace("{other_key}", authority.issueClient(machine).keyPem.toBase64());
    return QJsonDocument::fromJson(text).object();
}

// Nothing is abbreviated: what is looked for may stand at the end of a long argument. A leak sanitizer, where
// there is one, cannot do its work in a traced process.
QStringList traced(const QStringList &command, const QString &starts)
{
    const QString options =
        QStringLiteral("-f -qq -s 1000000 -e trace=execve,execveat,connect -e signal=none");
    const QString sanitizer =
        QStringLiteral("ASAN_OPTIONS=%1:detect_leaks=0").arg(qEnvironmentVariable("ASAN_OPTIONS"));
    return QStringList{QStringLiteral("strace")} + options.split(QLatin1Char(' ')) +
           QStringList{QStringLiteral("-E"), sanitizer, QStringLiteral("-o"), starts} + command;
}

} // namespace

void prepareFiles(const StateDirectory &state, const QJsonObject &prepare)
{
    const QString record = state.inside(QStringLiteral("/etc/vesk/userinfo.json"));
    QJsonObject preset = json::object(prepare, "record");
    if (json::text(preset, "domain_port") == QLatin1String("{port}"))
        preset.insert(QStringLiteral("domain_port"), enrolmentPort(state));
    if (!preset.isEmpty())
        smallfile::saveObject(record, json::overlaid(smallfile::readObject(record), preset));
    if (json::text(prepare, "resolver") == QLatin1String("silent"))
        silenceResolver(state);
    obstacles::put(state, json::object(prepare, "places"));
}

void writeScenario(const StateDirectory &state, const QJsonObject &scenario, const QString &file)
{
    const QJsonObject filled = filledIn(state, scenario);
    const QString configFile = state.at("server/config.json");
    const QJsonObject config = smallfile::readObject(configFile);
    const QJsonObject changes = json::object(json::object(filled, "server"), "config");
    smallfile::saveObject(file, filled, FileAccess::OwnerOnly);
    if (!config.isEmpty())
        smallfile::saveObject(configFile, json::overlaid(config, changes), FileAccess::OwnerOnly);
}

ProgramStart programStart(const QJsonObject &start, const QString &program, const StateDirectory &state)
{
    ProgramStart result;
    result.command = json::texts(start, "command");
    if (result.command.isEmpty())
        result.command = QStringList{program};
    else
        result.command.first().prepend(QFileInfo(program).path() + QLatin1Char('/'));
    result.command.replaceInStrings(QStringLiteral("{port}"), enrolmentPort(state));
    if (json::flag(start, "traced"))
        result.command = traced(result.command, state.starts());
    const QString umask = json::text(start, "umask");
    if (!umask.isEmpty())
        result.command =
            QStringList{QStringLiteral("sh"), QStringLiteral("-c"),
                        QStringLiteral("umask %1 && exec \"$@\"").arg(umask), QStringLiteral("sh")} +
            result.command;
    for (const QString &path : json::texts(start, "read_only"))
        result.isolation << QStringLiteral("--read-only") << path;
    return result;
}

} // namespace sandbox
