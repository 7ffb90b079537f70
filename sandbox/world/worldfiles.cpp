// SPDX-License-Identifier: Apache-2.0
#include "worldfiles.h"

#include "child.h"
#include "data/data.h"
#include "isolation/rundirectory.h"
#include "journal/error.h"
#include "journal/smallfile.h"
#include "schemas.h"

#include <QCryptographicHash>
#include <QDir>
#include <QFileInfo>
#include <QJsonArray>
#include <QJsonDocument>
#include <QUuid>

#include <sys/stat.h>

namespace sandbox {

namespace {

constexpr char kMachine[] = "/usr/share/vesk/machine.txt";

// What the image of a terminal brings beside its record: the control centre's settings from before a join,
// ...
constexpr char kBackup[] = "[config]\nControlCenterList=accounts, network, update\n";
// ... the same settings as they are, an identity service that is off, and no service of the user's.
constexpr char kSettings[] =
    "[com/morvek/mde/control-center]\nauto-login-visable=true\nnopasswd-login-visable=true\n";
constexpr char kIdentity[] = "{\n    \"Enable\": false\n}\n";

void write(const QString &path, const QByteArray &content, FileAccess access = FileAccess::Everyone)
{
    QDir().mkpath(QFileInfo(path).absolutePath());
    smallfile::save(path, content, access);
}

// A locally administered address that stays the same for a machine identity. The first connection is not the
// primary one, so that a program which takes any shows it.
QByteArray connectionsOf(const QByteArray &machineId)
{
    const QByteArray digits = QCryptographicHash::hash(machineId, QCryptographicHash::Sha256).toHex(':');
    const auto connection = [&](const char *device, const char *first, bool isPrimary) {
        return QJsonObject{
            {QStringLiteral("Device"), QLatin1String(device)},
            {QStringLiteral("HwAddress"), QString::fromLatin1(first + digits.left(14)).toUpper()},
            {QStringLiteral("IsPrimaryConnection"), isPrimary}};
    };
    return QJsonDocument(QJsonArray{connection("wlan0", "06:", false), connection("eth0", "02:", true)})
        .toJson();
}

} // namespace

void WorldFiles::refuseUnusable(const QString &path)
{
    const QDir directory(path);
    if (directory.exists() && !directory.isEmpty() && !directory.exists(QStringLiteral("journal.log")))
        throw Error(
            QStringLiteral("%1 is neither empty nor a world: choose an empty or a new directory").arg(path));
}

void WorldFiles::prepare(const Scenario &scenario) const
{
    const bool isNew = !QDir(m_state.root()).exists();
    makeDirectories();
    if (isNew)
        populate();
    compileSchemas(m_state.schemas(), scenario.schemaWithout());
    linkCommands();
    write(m_state.scenarioFile(), smallfile::load(m_scenarioFile));
}

void WorldFiles::emptyTmp() const
{
    const QDir tmp(m_state.inside(QStringLiteral("/tmp")));
    const auto all = QDir::AllEntries | QDir::Hidden | QDir::System | QDir::NoDotAndDotDot;
    for (const QFileInfo &entry : tmp.entryInfoList(all))
        smallfile::removeAll(entry.filePath());
}

void WorldFiles::makeDirectories() const
{
    for (const char *directory : {"root/etc/vesk", "root/usr/share/vesk", "root/tmp", "home/.config",
                                  "server", "schemas", "commands", "screenshots"}) {
        if (!QDir().mkpath(m_state.at(directory)))
            throw Error(QStringLiteral("cannot create %1").arg(m_state.at(directory)));
    }
}

void WorldFiles::populate() const
{
    const QByteArray machineId = QUuid::createUuid().toByteArray(QUuid::WithoutBraces);
    RunDirectory::writeTerminalFiles(m_state.root());
    write(m_state.inside(QLatin1String(kMachine)), machineId + '\n');
    write(m_state.connections(), connectionsOf(machineId));
    write(m_state.inside(QStringLiteral("/etc/vesk/userinfo.json")), data::read("userinfo.json"));
    write(m_state.inside(QStringLiteral("/etc/vesk/config.ini")), kBackup);
    write(m_state.identityService(), kIdentity);
    writeSettings();
}

// With the modes that the settings service gives.
void WorldFiles::writeSettings() const
{
    const QString glib = m_state.home() + QStringLiteral("/.config/glib-2.0");
    const QString settings = glib + QStringLiteral("/settings");
    for (const QString &directory : {glib, settings}) {
        QDir().mkpath(directory);
        ::chmod(QFile::encodeName(directory).constData(), 0700);
    }
    write(settings + QStringLiteral("/keyfile"), kSettings, FileAccess::OwnerOnly);
}

void WorldFiles::linkCommands() const
{
    const QString program = findTool(QStringLiteral("vesk-sandbox-command"));
    for (const char *command : {"gsettings", "systemctl", "killall", "id", "vesks", "mmcs"}) {
        const QString link = m_state.commands() + QLatin1Char('/') + QLatin1String(command);
        QFile::remove(link);
        if (!QFile::link(program, link))
            throw Error(QStringLiteral("cannot create %1").arg(link));
    }
}

void WorldFiles::forgetScenario() const
{
    write(m_state.scenarioFile(), "{\"title\": \"All goes well from now on\"}\n");
}

} // namespace sandbox
