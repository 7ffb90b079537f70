// SPDX-License-Identifier: Apache-2.0
#include "servicefixture.h"

#include "world/worldfiles.h"

#include <QFile>

using namespace sandbox;

namespace {

const QString kConnection = QStringLiteral("test");

} // namespace

ServiceFixture::ServiceFixture(const QByteArray &scenario)
    : m_state(m_folder.path())
    , m_runtime(m_state)
    , m_bus(QStringLiteral("session"), QStringLiteral("session-bus"), m_state)
{
    const QString file = m_folder.filePath(QStringLiteral("wanted.json"));
    QByteArray json = scenario;
    json.replace(0, 1, json.size() > 2 ? R"({"title": "Under test", )" : R"({"title": "Under test")");
    write(file, json);
    const auto loaded = Scenario::load(file, &m_trouble);
    if (loaded)
        WorldFiles(m_state, file).prepare(*loaded, &m_trouble);
}

ServiceFixture::~ServiceFixture()
{
    QDBusConnection::disconnectFromBus(kConnection);
    for (const auto &service : m_services)
        service->stop();
}

QString ServiceFixture::start(const QStringList &services)
{
    if (!m_trouble.isEmpty() || !m_runtime.make(&m_trouble) || !m_bus.start(&m_trouble))
        return m_trouble;
    for (const QString &name : services) {
        m_services.push_back(std::make_unique<ServiceProcess>(name, m_state.at("world.log")));
        if (!m_services.back()->start(m_state.path(), environment(), &m_trouble))
            return m_trouble;
    }
    QDBusConnection::connectToBus(m_bus.address(), kConnection);
    return {};
}

QDBusConnection ServiceFixture::bus() const
{
    return QDBusConnection(kConnection);
}

QDBusMessage ServiceFixture::call(const char *service, const char *path, const char *interface,
                                  const char *method, const QVariantList &arguments) const
{
    QDBusMessage message = QDBusMessage::createMethodCall(QLatin1String(service), QLatin1String(path),
                                                          QLatin1String(interface), QLatin1String(method));
    message.setArguments(arguments);
    return bus().call(message);
}

QStringList ServiceFixture::journal() const
{
    QStringList lines;
    for (const QString &line :
         QString::fromUtf8(read(m_state.journal().path())).split(QLatin1Char('\n'), Qt::SkipEmptyParts))
        lines.append(line.mid(24));
    return lines;
}

QProcessEnvironment ServiceFixture::environment() const
{
    QProcessEnvironment environment = QProcessEnvironment::systemEnvironment();
    const auto set = [&environment](const char *name, const QString &value) {
        environment.insert(QLatin1String(name), value);
    };
    set("DBUS_SESSION_BUS_ADDRESS", m_bus.address());
    set("DBUS_SYSTEM_BUS_ADDRESS", m_bus.address());
    set(StateFolder::kVariable, m_state.path());
    set("XDG_CONFIG_HOME", m_state.home() + QStringLiteral("/.config"));
    set("GSETTINGS_BACKEND", QStringLiteral("keyfile"));
    set("GSETTINGS_SCHEMA_DIR", m_state.schemas());
    return environment;
}

QByteArray ServiceFixture::read(const QString &path)
{
    QFile file(path);
    return file.open(QIODevice::ReadOnly) ? file.readAll() : QByteArray();
}

bool ServiceFixture::write(const QString &path, const QByteArray &content)
{
    QFile file(path);
    return file.open(QIODevice::WriteOnly) && file.write(content) == content.size();
}
