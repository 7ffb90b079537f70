// SPDX-License-Identifier: Apache-2.0
#include "play/preparation.h"

#include "journal/smallfile.h"
#include "play/obstacles.h"
#include "play/placeholders.h"
#include "scenario/json.h"

#include <arpa/inet.h>
#include <netinet/in.h>
#include <sys/socket.h>

namespace sandbox {

namespace {

constexpr quint16 kNameServerPort = 53;

// Who may not listen there takes an address of which nothing ever comes back.
QByteArray silentServer()
{
    constexpr char ours[] = "127.0.0.200";
    const int listener = ::socket(AF_INET, SOCK_DGRAM | SOCK_CLOEXEC, 0); // as long as this process
    sockaddr_in address = {};
    address.sin_family = AF_INET;
    address.sin_port = htons(kNameServerPort);
    ::inet_pton(AF_INET, ours, &address.sin_addr);
    const bool listens = ::bind(listener, reinterpret_cast<const sockaddr *>(&address), sizeof address) == 0;
    return listens ? ours : "192.0.2.1";
}

void silenceResolver(const StateFolder &state)
{
    smallfile::write(state.inside(QStringLiteral("/etc/resolv.conf")),
                     "nameserver " + silentServer() + "\noptions timeout:30 attempts:2\n");
}

} // namespace

bool prepareFiles(const StateFolder &state, const QJsonObject &prepare, QString *error)
{
    const QString record = state.inside(QStringLiteral("/etc/vesk/userinfo.json"));
    if (prepare.contains(QLatin1String("record")))
        smallfile::writeObject(
            record, json::overlaid(smallfile::readObject(record), json::object(prepare, "record")));
    if (json::text(prepare, "resolver") == QLatin1String("silent"))
        silenceResolver(state);
    return obstacles::put(state, json::object(prepare, "places"), error);
}

bool writeScenario(const StateFolder &state, const QJsonObject &scenario, const QString &file, QString *error)
{
    const auto filled = Placeholders(state).fill(scenario, error);
    if (!filled)
        return false;
    const QString configFile = state.at("server/config.json");
    const QJsonObject config = smallfile::readObject(configFile);
    const QJsonObject changes = json::object(json::object(*filled, "server"), "config");
    if (smallfile::writeObject(file, *filled, FileAccess::OwnerOnly) &&
        (config.isEmpty() ||
         smallfile::writeObject(configFile, json::overlaid(config, changes), FileAccess::OwnerOnly)))
        return true;
    *error = QStringLiteral("cannot write %1").arg(file);
    return false;
}

} // namespace sandbox
