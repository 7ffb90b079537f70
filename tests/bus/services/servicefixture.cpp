// SPDX-License-Identifier: Apache-2.0
#include "servicefixture.h"

#include "journal/error.h"
#include "world/child.h"
#include "world/worldfiles.h"

using namespace sandbox;

namespace {

const QString kConnection = QStringLiteral("test");

} // namespace

ServiceFixture::ServiceFixture(const QString &service)
    : m_state(m_directory.path())
    , m_runtime(m_state)
    , m_bus(QStringLiteral("session"), QStringLiteral("session-bus"), m_state)
    , m_service(m_state.at("world.log"))
{
    const QString file = m_directory.filePath(QStringLiteral("wanted.json"));
    smallfile::write(file, R"({"title": "Under test"})");
    m_service.setObjectName(service);
    attempt(&m_error, [&] { WorldFiles(m_state, file).prepare(Scenario()); });
}

ServiceFixture::~ServiceFixture()
{
    QDBusConnection::disconnectFromBus(kConnection);
}

QString ServiceFixture::start()
{
    const auto begin = [this] {
        m_runtime.make();
        m_bus.start();
        m_service.setProcessEnvironment(environment());
        m_service.startAndReadLine(
            findTool(QStringLiteral("vesk-sandbox")),
            {QStringLiteral("service"), m_service.objectName(), QStringLiteral("--state"), m_state.path()});
    };
    if (!m_error.isEmpty() || !attempt(&m_error, begin))
        return m_error;
    QDBusConnection::connectToBus(m_bus.address(), kConnection);
    return m_error;
}

QDBusMessage ServiceFixture::call(const char *service, const char *path, const char *interface,
                                  const char *method, const QVariantList &arguments) const
{
    QDBusMessage message = QDBusMessage::createMethodCall(QLatin1String(service), QLatin1String(path),
                                                          QLatin1String(interface), QLatin1String(method));
    message.setArguments(arguments);
    return QDBusConnection(kConnection).call(message);
}

QStringList ServiceFixture::journal() const
{
    QStringList lines;
    const QString text = QString::fromUtf8(smallfile::read(m_state.journal().path()).value_or(""));
    for (const QString &line : text.split(QLatin1Char('\n'), Qt::SkipEmptyParts))
        lines.append(line.mid(24));
    return lines;
}

QProcessEnvironment ServiceFixture::environment() const
{
    QProcessEnvironment environment = QProcessEnvironment::systemEnvironment();
    environment.insert(QStringLiteral("DBUS_SESSION_BUS_ADDRESS"), m_bus.address());
    environment.insert(QStringLiteral("DBUS_SYSTEM_BUS_ADDRESS"), m_bus.address());
    environment.insert(QLatin1String(StateDirectory::kVariable), m_state.path());
    return environment;
}
