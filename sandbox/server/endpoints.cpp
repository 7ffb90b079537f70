// SPDX-License-Identifier: Apache-2.0
#include "server/endpoints.h"

#include <QDir>
#include <QJsonDocument>
#include <QRegularExpression>
#include <QUrlQuery>

namespace sandbox {

namespace {

constexpr int kLongestAlias = 32; // characters, what the program's field takes
// Common names in certificates hold 64 characters; the identity is a file name as well.
const char *const kMachineIdPattern = "\\A[A-Za-z0-9][A-Za-z0-9._-]{0,63}\\z";

QJsonObject bodyOf(const Request &request)
{
    const QJsonDocument document = QJsonDocument::fromJson(request.body);
    if (!document.isObject())
        throw Refused{refusals::kNoJson};
    return document.object();
}

QString field(const QJsonObject &body, const QString &key)
{
    QString text = body.value(key).toString();
    if (text.isEmpty())
        throw Refused{refusals::kFieldMissing, key};
    return text;
}

QString checkedMachineId(const QString &machineId)
{
    static const QRegularExpression pattern(QString::fromLatin1(kMachineIdPattern));
    if (!pattern.match(machineId).hasMatch())
        throw Refused{refusals::kFieldWrong, QStringLiteral("machine_id")};
    return machineId;
}

QString machineIdField(const QJsonObject &body)
{
    return checkedMachineId(field(body, QStringLiteral("machine_id")));
}

// Terminals without a network daemon know no hardware address: it may be empty, but must be there.
QString macField(const QJsonObject &body)
{
    const QJsonValue mac = body.value(QStringLiteral("mac"));
    if (!mac.isString())
        throw Refused{refusals::kFieldMissing, QStringLiteral("mac")};
    return mac.toString();
}

QString queryItem(const Request &request, const QString &key)
{
    QString text = QUrlQuery(request.target).queryItemValue(key, QUrl::FullyDecoded);
    if (text.isEmpty())
        throw Refused{refusals::kFieldMissing, key};
    return text;
}

void refuseOther(const Request &request, const QString &machineId)
{
    if (request.certificateName != machineId)
        throw Refused{refusals::kCertificateOfOther};
}

Reply verdict(bool result, const char *words)
{
    const QJsonObject object = {{QStringLiteral("code"), 0},
                                {QStringLiteral("msg"), QString::fromUtf8(words)},
                                {QStringLiteral("data"), QJsonObject{{QStringLiteral("result"), result}}}};
    return {200, QJsonDocument(object).toJson(QJsonDocument::Compact)};
}

QString base64(const QByteArray &bytes)
{
    return QString::fromLatin1(bytes.toBase64());
}

} // namespace

Endpoints::Endpoints(Domain &domain, CertificateAuthority authority, QString issuedFolder)
    : m_domain(domain)
    , m_authority(std::move(authority))
    , m_issuedFolder(std::move(issuedFolder))
{
}

Reply Endpoints::caCertificate(const Request & /*request*/)
{
    return success({{QStringLiteral("ca_cert"), base64(m_authority.certificatePem())}});
}

Reply Endpoints::status(const Request &request)
{
    const QString machineId = checkedMachineId(queryItem(request, QStringLiteral("machine_id")));
    const QString keyword = queryItem(request, QStringLiteral("keyword"));
    const bool known = m_domain.terminal(machineId) != nullptr;
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
    const Account *account = m_domain.account(field(body, QStringLiteral("username")));
    if (account == nullptr || account->password != field(body, QStringLiteral("password")))
        throw Refused{refusals::kWrongCredentials};
    if (account->locked)
        throw Refused{refusals::kAccountLocked};
    return success({});
}

Reply Endpoints::join(const Request &request)
{
    const QJsonObject body = bodyOf(request);
    Terminal terminal;
    terminal.machineId = machineIdField(body);
    terminal.name = field(body, QStringLiteral("name"));
    terminal.userName = field(body, QStringLiteral("username"));
    terminal.mac = macField(body);
    refuseUnfit(terminal);

    QString error;
    const auto pair = m_authority.issueClient(terminal.machineId, &error);
    const QString path = QDir(m_issuedFolder).filePath(terminal.machineId + QLatin1String(".crt"));
    if (!pair || !smallfile::write(path, pair->certificatePem, FileAccess::Everyone, &error))
        throw Refused{refusals::kOwnTrouble, {}, error};
    terminal.certificateSerial = certificateSerial(pair->certificatePem);
    terminal.joinedAt = timeStamp();
    if (!m_domain.add(terminal, &error))
        throw Refused{refusals::kOwnTrouble, {}, error};
    return success(joinData(*pair));
}

Reply Endpoints::rule(const Request &request)
{
    if (queryItem(request, QStringLiteral("key")) != QLatin1String("pc_name_rules"))
        throw Refused{refusals::kFieldWrong, QStringLiteral("key")};
    const QJsonObject inner = {{QStringLiteral("regular_expression"), m_domain.config().aliasRule}};
    const QString message = QString::fromUtf8(QJsonDocument(inner).toJson(QJsonDocument::Compact));
    const QJsonObject object = {{QStringLiteral("code"), 0}, {QStringLiteral("message"), message}};
    return {200, QJsonDocument(object).toJson(QJsonDocument::Compact)};
}

Reply Endpoints::verifyName(const Request &request)
{
    const QString name = field(bodyOf(request), QStringLiteral("pc_name"));
    if (name.size() > kLongestAlias)
        throw Refused{refusals::kAliasUnfit};
    if (m_domain.isNameTaken(name))
        throw Refused{refusals::kAliasTaken};
    return success({});
}

Reply Endpoints::removeStatus(const Request &request)
{
    const QJsonObject body = bodyOf(request);
    const QString machineId = machineIdField(body);
    const QString name = field(body, QStringLiteral("username"));
    const QString password = field(body, QStringLiteral("password"));
    refuseOther(request, machineId);

    const Account *ordinary = m_domain.account(name);
    const Account *administrator = m_domain.administrator(name);
    if (administrator == nullptr && ordinary != nullptr && ordinary->password == password)
        throw Refused{refusals::kNotAdministrator};
    if (administrator == nullptr || administrator->password != password)
        throw Refused{refusals::kWrongCredentials};
    if (administrator->locked)
        throw Refused{refusals::kAccountLocked};
    m_domain.allowRemoval(machineId, name);
    return verdict(true, "");
}

Reply Endpoints::remove(const Request &request)
{
    const QJsonObject body = bodyOf(request);
    const QString machineId = machineIdField(body);
    const QString name = field(body, QStringLiteral("username"));
    macField(body);
    refuseOther(request, machineId);

    if (m_domain.administrator(name) == nullptr)
        throw Refused{refusals::kNotAdministrator};
    if (!m_domain.mayRemove(machineId, name))
        throw Refused{refusals::kNotAuthorised};
    QString error;
    if (!m_domain.remove(machineId, &error))
        throw Refused{refusals::kOwnTrouble, {}, error};
    return verdict(true, "");
}

Reply Endpoints::department(const Request &request)
{
    const Department *department = m_domain.department(queryItem(request, QStringLiteral("id")));
    if (department == nullptr)
        throw Refused{refusals::kDepartmentUnknown};
    return success({{QStringLiteral("id"), department->id}, {QStringLiteral("name"), department->name}});
}

Reply Endpoints::account(const Request &request)
{
    const QJsonObject body = bodyOf(request);
    refuseOther(request, machineIdField(body));
    const Account *account = m_domain.account(field(body, QStringLiteral("username")));
    if (account == nullptr)
        throw Refused{refusals::kAccountUnknown};
    return success({{QStringLiteral("username"), account->name},
                    {QStringLiteral("display_name"), account->displayName},
                    {QStringLiteral("locked"), account->locked}});
}

void Endpoints::refuseUnfit(const Terminal &terminal) const
{
    if (m_domain.terminal(terminal.machineId) != nullptr)
        throw Refused{refusals::kMachineKnown};
    if (m_domain.isFull())
        throw Refused{refusals::kLimitReached};
    const Account *account = m_domain.account(terminal.userName);
    if (account == nullptr)
        throw Refused{refusals::kAccountUnknown};
    if (account->locked)
        throw Refused{refusals::kAccountLocked};
    if (terminal.name.size() > kLongestAlias)
        throw Refused{refusals::kAliasUnfit};
    if (m_domain.isNameTaken(terminal.name))
        throw Refused{refusals::kAliasTaken};
}

QJsonObject Endpoints::joinData(const KeyPair &pair) const
{
    const ServerConfig &config = m_domain.config();
    QString address = config.joinedDomain;
    address.replace(QLatin1String("{host}"), config.host);
    address.replace(QLatin1String("{port}"), QString::number(config.managedPort));
    return {{QStringLiteral("key"), base64(pair.keyPem)},
            {QStringLiteral("cert"), base64(pair.certificatePem)},
            {QStringLiteral("joined_domain"), address}};
}

} // namespace sandbox
