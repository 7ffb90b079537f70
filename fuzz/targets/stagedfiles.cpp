// SPDX-License-Identifier: Apache-2.0
// What the client stages for installation.
#include "certificate.h"
#include "programfiles.h"
#include "replies.h"
#include "require.h"
#include "services/configinstaller.h"
#include "targets.h"

#include <QDir>
#include <QJsonDocument>

namespace fuzz {

namespace {

const QString kWorld = QStringLiteral("/tmp/world");

constexpr char kCa[] = "/etc/vesk/clientapi_ca.crt";
constexpr char kCertificate[] = "/etc/vesk/MOS_Vesk.pem";
constexpr char kKey[] = "/etc/vesk/.MOS_Vesk.key";
constexpr char kRecord[] = "/etc/vesk/userinfo.json";

// Of the installed side of the world: what the program would see at this path.
QString installed(const char *path)
{
    return sandbox::StateDirectory(kWorld).inside(QLatin1String(path));
}

void checkInstalled()
{
    const QByteArray certificate = isolatedfiles::read(installed(kCertificate));
    require(sandbox::keyFits(certificate, isolatedfiles::read(installed(kKey))),
            "an installed key fits its certificate");
    require(!sandbox::certificateDer(isolatedfiles::read(installed(kCa))).isEmpty(),
            "an installed CA is a certificate");
    require(QJsonDocument::fromJson(isolatedfiles::read(installed(kRecord))).isObject(),
            "an installed record is an object");
}

} // namespace

void stagedFiles(const QByteArray &input)
{
    const QVector<QByteArray> parts = partsOf(input);
    const sandbox::StateDirectory state(kWorld);
    const QByteArray before = "before";
    int index = 0;
    QDir().mkpath(installed("/tmp/vesk"));
    for (const char *name : {"clientapi_ca.crt", "client.crt", "client.key", "userinfo.json"})
        require(
            sandbox::smallfile::write(installed("/tmp/vesk/") + QLatin1String(name), parts.value(index++)),
            "a file of the isolated view can be written");
    for (const char *path : {kCa, kCertificate, kKey, kRecord})
        programfiles::write(installed(path), before);

    const sandbox::ConfigInstaller installer(state);
    if (installer.install()) {
        checkInstalled();
    } else {
        for (const char *path : {kCa, kCertificate, kKey, kRecord})
            require(isolatedfiles::read(installed(path)) == before, "a refused set changes no file");
    }
    require(installer.remove() == !QFile::exists(installed(kKey)), "a removal takes the key away");
    const QByteArray journal = isolatedfiles::read(state.at("journal.log"));
    require(!journal.contains("PRIVATE KEY"), "no key in the journal");
    QFile::remove(state.at("journal.log"));
}

} // namespace fuzz
