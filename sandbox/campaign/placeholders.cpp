// SPDX-License-Identifier: Apache-2.0
#include "campaign/placeholders.h"

#include "journal/smallfile.h"

#include <QCoreApplication>
#include <QFileInfo>
#include <QJsonArray>
#include <QJsonDocument>
#include <QRegularExpression>
#include <QUrl>

#include <pwd.h>
#include <unistd.h>

namespace sandbox {

namespace {

// As the program reads it: nothing of a FIFO, a device or a file that is too long.
QByteArray contentOf(const StateDirectory &state, const char *path)
{
    constexpr qint64 kMaxSize = 1024LL * 1024;
    const QFileInfo file(state.inside(QLatin1String(path)));
    const bool isRead = file.isFile() && file.size() <= kMaxSize;
    return isRead ? smallfile::read(file.filePath()).value_or(QByteArray()) : QByteArray();
}

QString hostName(const StateDirectory &state)
{
    return QString::fromUtf8(contentOf(state, "/etc/hostname")).remove(QLatin1Char('\n'));
}

QString machineId(const StateDirectory &state)
{
    return QString::fromUtf8(contentOf(state, "/usr/share/vesk/machine.txt")).trimmed();
}

QString portOf(const StateDirectory &state, const char *key)
{
    return QString::number(json::number(smallfile::readObject(state.at("server/config.json")), key, 0));
}

// Of the connection that the daemon calls the primary one.
QString hardwareAddress(const StateDirectory &state)
{
    const QByteArray known = smallfile::read(state.connections()).value_or(QByteArray());
    for (const QJsonValue &each : QJsonDocument::fromJson(known).array()) {
        if (each[QLatin1String("IsPrimaryConnection")].toBool())
            return each[QLatin1String("HwAddress")].toString();
    }
    return {};
}

QString orElse(const QString &typed, const QString &otherwise)
{
    return typed.isEmpty() ? otherwise : typed;
}

QString inJson(const QString &value)
{
    const QString list = QString::fromUtf8(QJsonDocument(QJsonArray{value}).toJson(QJsonDocument::Compact));
    return list.mid(2, list.size() - 4);
}

} // namespace

Placeholders::Placeholders(const StateDirectory &state, const QJsonObject &scenario)
{
    const ScenarioInput input = Scenario(scenario).input();
    const QJsonObject record = QJsonDocument::fromJson(contentOf(state, "/etc/vesk/userinfo.json")).object();
    const bool leaves = Scenario(scenario).journey() == Journey::Leave;
    const bool keepsAddress = input.host.isEmpty() || leaves;
    const QString user = QString::fromLocal8Bit(::getpwuid(::getuid())->pw_name);
    const QString prefix =
        QFileInfo(QCoreApplication::applicationDirPath() + QStringLiteral("/..")).canonicalFilePath();
    m_values = {
        {QStringLiteral("prefix"), prefix},
        {QStringLiteral("commands"), state.commands()},
        {QStringLiteral("run"), state.run()},
        {QStringLiteral("enrolment_port"), portOf(state, "enrolment_port")},
        {QStringLiteral("managed_port"), portOf(state, "managed_port")},
        {QStringLiteral("machine"), machineId(state)},
        {QStringLiteral("certificate"), machineId(state)},
        {QStringLiteral("mac"), hardwareAddress(state)},
        {QStringLiteral("login"), QString(user).remove(QLatin1Char('@'))},
        {QStringLiteral("user"), input.user},
        {QStringLiteral("administrator"), input.administrator},
        {QStringLiteral("password"), QStringLiteral("***")},
        {QStringLiteral("alias"),
         orElse(input.alias, record.isEmpty() ? hostName(state) : json::text(record, "terminal_name"))},
        {QStringLiteral("domain_host"), keepsAddress ? json::text(record, "domain_host") : input.host},
        {QStringLiteral("domain_port"), keepsAddress ? json::text(record, "domain_port")
                                                     : orElse(input.port, portOf(state, "enrolment_port"))},
        {QStringLiteral("server_host"),
         leaves ? json::text(record, "server_host") : QStringLiteral("localhost")},
        {QStringLiteral("server_port"),
         leaves ? json::text(record, "server_port") : portOf(state, "managed_port")},
        {QStringLiteral("shown"), QStringLiteral("['accounts', 'network', 'update']")}};
    const QJsonObject own = json::object(json::object(scenario, "expect"), "values");
    for (auto value = own.begin(); value != own.end(); ++value)
        m_values[value.key()] = filled(value.value().toString());
}

QString Placeholders::filled(const QString &text) const
{
    static const QRegularExpression name(QStringLiteral("\\{([a-z_]+)\\}"));
    QString result;
    int from = 0;
    for (auto found = name.globalMatch(text); found.hasNext();) {
        const QRegularExpressionMatch match = found.next();
        const QString value = m_values.value(match.captured(1), match.captured());
        const QChar before = match.capturedStart() > 0 ? text.at(match.capturedStart() - 1) : QChar();
        result += text.mid(from, match.capturedStart() - from);
        if (before == QLatin1Char('=') && text.startsWith(QLatin1String("request ")))
            result += QString::fromLatin1(QUrl::toPercentEncoding(value));
        else
            result += before == QLatin1Char('"') ? inJson(value) : value;
        from = match.capturedEnd();
    }
    return result + text.mid(from);
}

} // namespace sandbox
