// SPDX-License-Identifier: Apache-2.0
// What the sandbox reads: staged files, requests, the server's configuration.
#include "certificate.h"
#include "programfiles.h"
#include "replies.h"
#include "require.h"
#include "server/frontdesk.h"
#include "services/configinstaller.h"
#include "targets.h"

#include <QDir>
#include <QJsonDocument>

namespace fuzz {

namespace {

const QString kWorld = QStringLiteral("/tmp/world");
const QString kSecret = QStringLiteral("kein Zufall 4711");

constexpr char kCa[] = "/etc/vesk/clientapi_ca.crt";
constexpr char kCertificate[] = "/etc/vesk/MOS_Vesk.pem";
constexpr char kKey[] = "/etc/vesk/.MOS_Vesk.key";
constexpr char kRecord[] = "/etc/vesk/userinfo.json";

// Of the installed side of the world: what the program would see at this path.
QString installed(const char *path)
{
    return sandbox::StateFolder(kWorld).inside(QLatin1String(path));
}

void writePrivately(const QString &path, const QByteArray &content)
{
    programfiles::write(path, content);
    QFile::setPermissions(path, QFile::ReadOwner | QFile::WriteOwner);
}

void checkInstalled()
{
    const QByteArray certificate = programfiles::read(installed(kCertificate));
    require(sandbox::keyFits(certificate, programfiles::read(installed(kKey))),
            "an installed key fits its certificate");
    require(!sandbox::certificateDer(programfiles::read(installed(kCa))).isEmpty(),
            "an installed CA is a certificate");
    require(QJsonDocument::fromJson(programfiles::read(installed(kRecord))).isObject(),
            "an installed record is an object");
}

// "POST /path" or "managed POST /path" in the first line, the body below.
sandbox::Request requestOf(const QByteArray &part)
{
    const int lineEnd = part.indexOf('\n');
    QList<QByteArray> words = part.left(lineEnd).split(' ');
    sandbox::Request request;
    if (words.first() == "managed") {
        words.removeFirst();
        request.door = sandbox::Door::Managed;
        request.certificateName = QStringLiteral("machine-1");
        request.certificateSerial = QStringLiteral("0a");
    }
    request.method = QString::fromUtf8(words.value(0));
    request.target = QUrl(QString::fromUtf8(words.value(1)), QUrl::StrictMode);
    request.body = lineEnd < 0 ? QByteArray() : part.mid(lineEnd + 1);
    request.peerAddress = QStringLiteral("127.0.0.1");
    return request;
}

// With a password that no input can hold by chance.
sandbox::Request withSecret(sandbox::Request request)
{
    QJsonObject body = QJsonDocument::fromJson(request.body).object();
    if (body.contains(QStringLiteral("password"))) {
        body.insert(QStringLiteral("password"), kSecret);
        request.body = QJsonDocument(body).toJson();
    }
    return request;
}

sandbox::ServerConfig officeConfig()
{
    const QByteArray overlay = R"({"known_terminals":[{"machine_id":"machine-1","name":"t-1",
        "username":"liming","mac":"","joined_at":"2026-01-01T00:00:00Z","certificate_serial":"0a"}]})";
    QString error;
    const auto config = sandbox::ServerConfig::fresh(QJsonDocument::fromJson(overlay).object(), &error);
    require(config.has_value(), "a server has a configuration");
    return *config;
}

sandbox::CertificateAuthority officeAuthority()
{
    QDir().mkpath(kWorld + QStringLiteral("/issued"));
    const auto authority = sandbox::CertificateAuthority::create(QStringLiteral("CA"), nullptr);
    require(authority.has_value(), "a server has a CA");
    return *authority;
}

void checkAnswer(const sandbox::Request &request, const sandbox::Answer &answer)
{
    require(QJsonDocument::fromJson(answer.reply.body).isObject(), "the server answers with an object");
    require(answer.reply.status >= 200 && answer.reply.status < 600, "the server answers with a status");
    require(!sandbox::journalText(withSecret(request)).contains(kSecret), "no password in the journal");
    require(!sandbox::journalText(request, answer).contains(QLatin1String("PRIVATE KEY")),
            "no key in the journal");
}

} // namespace

void stagedFiles(const QByteArray &input)
{
    const QVector<QByteArray> parts = partsOf(input);
    const sandbox::StateFolder state(kWorld);
    const QByteArray before = "before";
    int index = 0;
    for (const char *name : {"clientapi_ca.crt", "client.crt", "client.key", "userinfo.json"})
        writePrivately(installed("/tmp/vesk/") + QLatin1String(name), parts.value(index++));
    for (const char *path : {kCa, kCertificate, kKey, kRecord})
        programfiles::write(installed(path), before);

    const sandbox::ConfigInstaller installer(state);
    if (installer.install()) {
        checkInstalled();
    } else {
        for (const char *path : {kCa, kCertificate, kKey, kRecord})
            require(programfiles::read(installed(path)) == before, "a refused set changes no file");
    }
    require(installer.remove() == !QFile::exists(installed(kKey)), "a removal takes the key away");
    const QByteArray journal = programfiles::read(state.at("journal.log"));
    require(!journal.contains("PRIVATE KEY"), "no key in the journal");
    QFile::remove(state.at("journal.log"));
}

void serverRequest(const QByteArray &input)
{
    static const sandbox::CertificateAuthority authority = officeAuthority();
    static const sandbox::ServerConfig config = officeConfig();
    const sandbox::Journal journal(kWorld + QStringLiteral("/server.log"));
    sandbox::Domain domain(config, kWorld + QStringLiteral("/config.json"));
    sandbox::Endpoints endpoints(domain, authority, kWorld + QStringLiteral("/issued"));
    sandbox::FrontDesk desk(domain, endpoints, sandbox::Scenario(), journal);
    const QVector<QByteArray> parts = partsOf(input);
    for (const QByteArray &part : parts) {
        const sandbox::Request request = requestOf(part);
        checkAnswer(request, desk.receive(request));
    }
    QFile::remove(journal.path());
}

void serverConfig(const QByteArray &input)
{
    const QString path = kWorld + QStringLiteral("/loaded.json");
    programfiles::write(path, input);
    QString error;
    const auto config = sandbox::ServerConfig::load(path, &error);
    require(config.has_value() == error.isEmpty(), "a refusal has a reason");
    require(!error.contains(QLatin1Char('\n')), "a reason is one line");
    if (!config)
        return;
    const QString copy = kWorld + QStringLiteral("/saved.json");
    require(config->save(copy, &error), "a configuration can be saved");
    const auto again = sandbox::ServerConfig::load(copy, &error);
    require(again.has_value(), "a saved configuration loads");
    const QByteArray saved = programfiles::read(copy);
    require(again->save(copy, &error) && programfiles::read(copy) == saved, "it loads as the same");
}

} // namespace fuzz
