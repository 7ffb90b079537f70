// SPDX-License-Identifier: Apache-2.0
#include "iamservice.h"

#include "data/data.h"
#include "journal/smallfile.h"

#include <QDBusMessage>
#include <QDBusVariant>

namespace sandbox {

namespace {

const QString kInterface = QStringLiteral("com.morvek.vesk.iam");
const QString kProperty = QStringLiteral("Enable");
const QString kFailed = QStringLiteral("org.freedesktop.DBus.Error.Failed");

} // namespace

// The D-Bus side: the property operations of the one interface.
class IamObject : public QDBusVirtualObject
{
public:
    explicit IamObject(IamService *service)
        : m_service(service)
    {
    }

    QString introspect(const QString & /*path*/) const override { return m_service->interfaceXml(); }

    bool handleMessage(const QDBusMessage &message, const QDBusConnection &bus) override
    {
        if (message.interface() != QLatin1String("org.freedesktop.DBus.Properties"))
            return false;
        const QVariantList arguments = message.arguments();
        if (arguments.value(0).toString() != kInterface)
            return bus.send(
                message.createErrorReply(QDBusError::UnknownInterface, QStringLiteral("unknown")));
        if (message.member() == QLatin1String("GetAll"))
            return bus.send(message.createReply(QVariantMap{{kProperty, m_service->isEnabled()}}));
        if (arguments.value(1).toString() != kProperty)
            return bus.send(message.createErrorReply(QDBusError::UnknownProperty, QStringLiteral("unknown")));
        return bus.send(message.member() == QLatin1String("Set") ? set(message, bus) : get(message));
    }

private:
    QDBusMessage get(const QDBusMessage &message) const
    {
        return message.createReply(QVariant::fromValue(QDBusVariant(m_service->isEnabled())));
    }

    QDBusMessage set(const QDBusMessage &message, const QDBusConnection &bus) const
    {
        const QVariant value = message.arguments().value(2).value<QDBusVariant>().variant();
        if (value.type() != QVariant::Bool)
            return message.createErrorReply(QDBusError::InvalidArgs, QStringLiteral("Enable is a boolean"));
        const std::optional<QString> error = m_service->setEnabled(value.toBool(), bus);
        return error ? message.createErrorReply(*error, QStringLiteral("refused")) : message.createReply();
    }

    IamService *m_service;
};

IamService::IamService(const StateDirectory &state, const QJsonObject &script)
    : Service(state, script, kInterface)
    , m_object(std::make_unique<IamObject>(this))
{
}

IamService::~IamService() = default;

bool IamService::publish(QDBusConnection bus)
{
    return bus.registerVirtualObject(path(), m_object.get());
}

QString IamService::interfaceXml() const
{
    if (!json::flag(script(), "introspect", true))
        return {};
    const QString contract = QString::fromUtf8(data::read("com.morvek.vesk.iam.xml"));
    const auto begin = contract.indexOf(QLatin1String("<interface"));
    QString xml = contract.mid(begin, contract.indexOf(QLatin1String("</node>")) - begin);
    if (json::text(script(), "answer") == QLatin1String("wrong-type"))
        xml.replace(QLatin1String("type=\"b\""), QLatin1String("type=\"s\""));
    return xml;
}

bool IamService::isEnabled() const
{
    return smallfile::readObject(state().identityService()).value(kProperty).toBool();
}

std::optional<QString> IamService::setEnabled(bool enabled, const QDBusConnection &bus)
{
    const QString call =
        QStringLiteral("Enable = %1").arg(enabled ? QStringLiteral("true") : QStringLiteral("false"));
    std::optional<QString> error = enter(kProperty, call);
    if (error) {
        note(call + QStringLiteral(" refused"));
        return error;
    }
    QString reason;
    const bool written = smallfile::writeObject(state().identityService(), {{kProperty, enabled}},
                                                FileAccess::Everyone, &reason);
    note(written ? call : call + QStringLiteral(" failed: ") + reason);
    endIfScripted(kProperty, bus);
    return written ? std::nullopt : std::optional<QString>(kFailed);
}

} // namespace sandbox
