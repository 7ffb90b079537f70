// SPDX-License-Identifier: Apache-2.0
#include "campaign/preparation.h"

#include "campaign/jsonfile.h"
#include "campaign/obstacles.h"
#include "campaign/overlay.h"
#include "scenario/strictobject.h"

#include <QFile>

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
    QFile file(state.inside(QStringLiteral("/etc/resolv.conf")));
    if (file.open(QIODevice::WriteOnly))
        file.write("nameserver " + silentServer() + "\noptions timeout:30 attempts:2\n");
}

} // namespace

bool prepareFiles(const StateFolder &state, const QJsonObject &prepare, QString *error)
{
    try {
        StrictObject strict(prepare, QStringLiteral("prepare"));
        const QString record = state.inside(QStringLiteral("/etc/vesk/userinfo.json"));
        if (const auto patch = strict.object("record"))
            jsonfile::write(record, overlaid(jsonfile::read(record), *patch));
        if (strict.choice("resolver", {QStringLiteral("silent")}))
            silenceResolver(state);
        if (const auto places = strict.object("places"))
            obstacles::put(state, *places, error);
        strict.refuseOthers();
    } catch (const JsonTrouble &trouble) {
        *error = trouble.text;
    }
    return error->isEmpty();
}

} // namespace sandbox
