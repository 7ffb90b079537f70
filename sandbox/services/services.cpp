// SPDX-License-Identifier: Apache-2.0
#include "configinstaller.h"
#include "servicehost.h"

#include "journal/error.h"
#include "journal/smallfile.h"
#include "state/userunits.h"

#include <QDBusVariant>
#include <QDeadlineTimer>
#include <QJsonDocument>
#include <QThread>

#include <algorithm>

namespace sandbox {

namespace {

const QString kNetwork = QStringLiteral("com.morvek.daemon.Network");
const QString kVeskg = QStringLiteral("com.morvek.vesk.veskg");
const QString kRemove = QStringLiteral("remove");
const QString kIam = QStringLiteral("com.morvek.vesk.iam");
const QString kEnable = QStringLiteral("Enable");
const QString kLogin = QStringLiteral("org.freedesktop.login1");

constexpr int kRemovalLimitMs = 10000;
constexpr int kPollMs = 50;

// The network daemon: reports the connections that stand in the state directory, as they stand there. A new
// world has two, of which the second is the primary one.
class NetworkService : public Service
{
public:
    using Service::Service;

protected:
    std::optional<Call> callIn(const QDBusMessage &message) const override
    {
        if (!calls(message, "GetActiveConnectionInfo", ""))
            return std::nullopt;
        return Call{message.member(), message.member() + QStringLiteral("()")};
    }

    QDBusMessage carryOut(const Call &call, const QDBusMessage &message, const QJsonObject &script) override
    {
        const QString reply = script.value(QLatin1String("reply")).toString(connections());
        note(call, reply);
        return message.createReply(reply);
    }

private:
    // "null" is how the daemon says that there is none.
    QString connections() const
    {
        const auto known = QJsonDocument::fromJson(smallfile::read(state().connections()).value_or(""));
        return known.isArray() ? QString::fromUtf8(known.toJson(QJsonDocument::Compact))
                               : QStringLiteral("null");
    }
};

// The system service that keeps the terminal's record and keys. "join" makes their directory ready,
// "copyConfig" installs what the client has staged, "remove" brings the record in line with the staged one
// and takes the keys away. Returns 0, or -1 when the operation is unknown or could not be carried out.
class VeskgService : public Service
{
public:
    using Service::Service;

    // The user's services use the keys, so they go first. Who asks for the removal has them stopped and
    // disabled by commands that run on their own; where those fail, the removal does not wait endlessly.
    bool handleMessage(const QDBusMessage &message, const QDBusConnection &bus) override
    {
        const std::optional<Call> call = callIn(message);
        const QDeadlineTimer limit(call && call->operation == kRemove ? kRemovalLimitMs : 0);
        while (!limit.hasExpired() && hasUsers())
            QThread::msleep(kPollMs);
        return Service::handleMessage(message, bus);
    }

protected:
    std::optional<Call> callIn(const QDBusMessage &message) const override
    {
        if (!calls(message, "onDomainConfig", "s"))
            return std::nullopt;
        const QString operation = message.arguments().constFirst().toString();
        return Call{operation, QStringLiteral("onDomainConfig(\"%1\")").arg(operation)};
    }

    QDBusMessage carryOut(const Call &call, const QDBusMessage &message, const QJsonObject &script) override
    {
        const int result = json::number(script, "result", configure(call.operation) ? 0 : -1);
        note(call, QString::number(result));
        return message.createReply(result);
    }

private:
    bool hasUsers() const
    {
        const UserUnits units(state());
        const QStringList names = UserUnits::names();
        return std::any_of(names.begin(), names.end(), [&units](const QString &unit) {
            return units.isEnabled(unit) || units.isRunning(unit);
        });
    }

    bool configure(const QString &operation) const
    {
        const ConfigInstaller installer(state());
        if (operation == QLatin1String("join"))
            return installer.prepare();
        if (operation == QLatin1String("copyConfig"))
            return installer.install();
        return operation == kRemove && installer.remove();
    }
};

// The identity service: one property, kept in the state directory. Only writing it is a call that scenarios
// and journal know.
class IamService : public Service
{
public:
    using Service::Service;

    QString introspect(const QString &path) const override
    {
        if (!json::flag(script(), "introspect", true))
            return {};
        QString xml = Service::introspect(path);
        if (json::text(script(), "answer") == QLatin1String("wrong-type"))
            xml.replace(QLatin1String("type=\"b\""), QLatin1String("type=\"s\""));
        return xml;
    }

protected:
    std::optional<Call> callIn(const QDBusMessage &message) const override
    {
        const QVariant value = valueIn(message);
        if (!isWrite(message) || value.type() != QVariant::Bool)
            return std::nullopt;
        return Call{kEnable, QStringLiteral("%1 = %2").arg(kEnable, value.toString())};
    }

    QDBusMessage carryOut(const Call &call, const QDBusMessage &message,
                          const QJsonObject & /*script*/) override
    {
        try {
            smallfile::saveObject(state().identityService(), {{kEnable, valueIn(message).toJsonValue()}});
        } catch (const Error &error) {
            note(call, QStringLiteral("failed: ") + error.text());
            return message.createErrorReply(QDBusError::Failed, error.text());
        }
        note(call);
        return message.createReply();
    }

private:
    static bool isWrite(const QDBusMessage &message)
    {
        return message.interface() == QLatin1String("org.freedesktop.DBus.Properties") &&
               message.member() == QLatin1String("Set") &&
               message.arguments().mid(0, 2) == QVariantList{kIam, kEnable};
    }

    static QVariant valueIn(const QDBusMessage &message)
    {
        return message.arguments().value(2).value<QDBusVariant>().variant();
    }
};

// The login manager: a reboot ends the run of the world, which its launcher learns through standard output.
class LoginService : public Service
{
public:
    using Service::Service;

protected:
    std::optional<Call> callIn(const QDBusMessage &message) const override
    {
        if (!calls(message, "Reboot", "b"))
            return std::nullopt;
        const QString interactive = message.arguments().constFirst().toString(); // "true" or "false"
        return Call{message.member(), QStringLiteral("Reboot(%1)").arg(interactive)};
    }

    QDBusMessage carryOut(const Call &call, const QDBusMessage &message,
                          const QJsonObject & /*script*/) override
    {
        note(call);
        servicehost::tellLauncher(servicehost::kReboot);
        return message.createReply();
    }
};

template <typename T>
std::unique_ptr<Service> make(const StateDirectory &state, const QJsonObject &script,
                              const servicehost::Entry &entry)
{
    return std::make_unique<T>(state, script, entry.busName, entry.interface);
}

} // namespace

const std::array<servicehost::Entry, 4> &servicehost::all()
{
    static const std::array<Entry, 4> entries = {{
        {QStringLiteral("network"), kNetwork, kNetwork, false, make<NetworkService>},
        {QStringLiteral("veskg"), kVeskg, kVeskg, true, make<VeskgService>},
        {QStringLiteral("iam"), kIam, kIam, true, make<IamService>},
        {QStringLiteral("login"), kLogin, kLogin + QStringLiteral(".Manager"), true, make<LoginService>},
    }};
    return entries;
}

} // namespace sandbox
