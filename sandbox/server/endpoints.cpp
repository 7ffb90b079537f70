// SPDX-License-Identifier: Apache-2.0
#include "server/endpoints.h"

#include "journal/error.h"
#include "scenario/json.h"

#include <QDir>
#include <QJsonDocument>
#include <QRegularExpression>
#include <QUrlQuery>

namespace sandbox {

using json::text;

namespace {

constexpr int kMaxAlias = 32; // characters, what the program's field takes
// Common names in certificates hold 64 characters; the identity is a file name as well.
const char *const kMachineIdPattern = "\\A[A-Za-z0-9][A-Za-z0-9._-]{0,63}\\z";

QJsonObject bodyOf(const Request &request)
{
    const QJsonDocument document = QJsonDocument::fromJson(request.body);
    if (!document.isObject())
        throw Refused{refusals::kNoJson};
    return document.object();
}

QString checked(const QString &text, const char *key)
{
    static const QRegularExpression machineId(QString::fromLatin1(kMachineIdPattern));
    if (text.isEmpty())
        throw Refused{refusals::kFieldMissing, QLatin1String(key)};
    if (QLatin1String(key) == QLatin1String("machine_id") && !machineId.match(text).hasMatch())
        throw Refused{refusals::kFieldWrong, QLatin1String(key)};
    return text;
}

QString field(const QJsonObject &body, const char *key)
{
    return checked(text(body, key), key);
}

QString queryItem(const Request &request, const char *key)
{
    return checked(QUrlQuery(request.target).queryItemValue(QLatin1String(key), QUrl::FullyDecoded), key);
}

// Terminals without a network daemon know no hardware address: it may be empty, but must be there.
void refuseWithoutMac(const QJsonObject &body)
{
    if (!body.value(QLatin1String("mac")).isString())
        throw Refused{refusals::kFieldMissing, QStringLiteral("mac")};
}

void refuseOther(const Request &request, const QString &machineId)
{
    if (request.certificateName != machineId)
        throw Refused{refusals::kCertificateOfOther};
}

void refuseLocked(const QJsonObject &account)
{
    if (account.value(QLatin1String("locked")).toBool())
        throw Refused{refusals::kAccountLocked};
}

Reply verdict(bool result, const char *words)
{
    return {200, envelope(0, QString::fromUtf8(words), {{QStringLiteral("result"), result}})};
}

QString base64(const QByteArray &bytes)
{
    return QString::fromLatin1(bytes.toBase64());
}

} // namespace

Endpoints::Endpoints(Domain &domain, CertificateAuthority authority, QString issuedDirectory)
    : m_domain(domain)
    , m_authority(std::move(authority))
    , m_issuedDirectory(std::move(issuedDirectory))
{
}

Reply Endpoints::caCertificate(const Request & /*request*/)
{
    return success({{QStringLiteral("ca_cert"), base64(m_authority.certificatePem())}});
}

Reply Endpoints::status(const Request &request)
{
    const bool known = !m_domain.terminal(queryItem(request, "machine_id")).isEmpty();
    const QString keyword = queryItem(request, "keyword");
    if (keyword == QLatin1String("remove"))
        return known ? verdict(true, "") : verdict(false, "终端未加域");
    if (keyword != QLatin1String("join"))
        throw Refused{refusals::kFieldWrong, QStringLiteral("keyword")};
    if (known)
        return verdict(false, "终端已加域");
    if (m_domain.isFull())
        throw Refused{refusals::kLimitReached};
    return verdict(true, "");
}

Reply Endpoints::auth(const Request &request)
{
    const QJsonObject body = bodyOf(request);
    const QJsonObject account = m_domain.account(field(body, "username"));
    const QString password = field(body, "password");
    if (account.isEmpty() || text(account, "password") != password)
        throw Refused{refusals::kWrongCredentials};
    refuseLocked(account);
    return success({});
}

Reply Endpoints::join(const Request &request)
{
    const QJsonObject body = bodyOf(request);
    QJsonObject terminal;
    for (const char *key : {"machine_id", "name", "username"})
        terminal.insert(QLatin1String(key), field(body, key));
    refuseWithoutMac(body);
    terminal.insert(QStringLiteral("mac"), text(body, "mac"));
    refuseUnfit(terminal);

    const QString machineId = text(terminal, "machine_id");
    const KeyPair pair = m_authority.issueClient(machineId);
    const QString path = QDir(m_issuedDirectory).filePath(machineId + QLatin1String(".crt"));
    smallfile::save(path, pair.certificatePem);
    terminal.insert(QStringLiteral("certificate_serial"), certificateSerial(pair.certificatePem));
    m_domain.add(terminal);
    QString address = m_domain.text("joined_domain");
    address.replace(QLatin1String("{host}"), m_domain.text("host"));
    address.replace(QLatin1String("{port}"), QString::number(m_domain.number("managed_port")));
    return success({{QStringLiteral("key"), base64(pair.keyPem)},
                    {QStringLiteral("cert"), base64(pair.certificatePem)},
                    {QStringLiteral("joined_domain"), address}});
}

Reply Endpoints::rule(const Request &request)
{
    if (queryItem(request, "key") != QLatin1String("pc_name_rules"))
        throw Refused{refusals::kFieldWrong, QStringLiteral("key")};
    const QJsonObject inner = {{QStringLiteral("regular_expression"), m_domain.text("alias_rule")}};
    const QString message = QString::fromUtf8(QJsonDocument(inner).toJson(QJsonDocument::Compact));
    const QJsonObject object = {{QStringLiteral("code"), 0}, {QStringLiteral("message"), message}};
    return {200, QJsonDocument(object).toJson(QJsonDocument::Compact)};
}

Reply Endpoints::verifyName(const Request &request)
{
    refuseUnfitAlias(field(bodyOf(request), "pc_name"));
    return success({});
}

Reply Endpoints::removeStatus(const Request &request)
{
    const QJsonObject body = bodyOf(request);
    const QString machineId = field(body, "machine_id");
    const QString name = field(body, "username");
    const QString password = field(body, "password");
    refuseOther(request, machineId);

    const QJsonObject administrator = m_domain.administrator(name);
    if (administrator.isEmpty() && text(m_domain.account(name), "password") == password)
        throw Refused{refusals::kNotAdministrator};
    if (text(administrator, "password") != password)
        throw Refused{refusals::kWrongCredentials};
    refuseLocked(administrator);
    m_domain.allowRemoval(machineId, name);
    return verdict(true, "");
}

Reply Endpoints::remove(const Request &request)
{
    const QJsonObject body = bodyOf(request);
    const QString machineId = field(body, "machine_id");
    const QString name = field(body, "username");
    refuseWithoutMac(body);
    refuseOther(request, machineId);

    if (m_domain.administrator(name).isEmpty())
        throw Refused{refusals::kNotAdministrator};
    if (!m_domain.mayRemove(machineId, name))
        throw Refused{refusals::kNotAuthorised};
    m_domain.remove(machineId);
    return verdict(true, "");
}

void Endpoints::refuseUnfit(const QJsonObject &terminal) const
{
    if (!m_domain.terminal(text(terminal, "machine_id")).isEmpty())
        throw Refused{refusals::kMachineKnown};
    if (m_domain.isFull())
        throw Refused{refusals::kLimitReached};
    const QJsonObject account = m_domain.account(text(terminal, "username"));
    if (account.isEmpty())
        throw Refused{refusals::kAccountUnknown};
    refuseLocked(account);
    refuseUnfitAlias(text(terminal, "name"));
}

void Endpoints::refuseUnfitAlias(const QString &alias) const
{
    if (alias.size() > kMaxAlias)
        throw Refused{refusals::kAliasUnfit};
    if (m_domain.isNameTaken(alias))
        throw Refused{refusals::kAliasTaken};
}

} // namespace sandbox
