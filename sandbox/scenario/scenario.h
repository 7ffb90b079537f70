// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "scenario/json.h"

#include <QJsonObject>
#include <QMetaEnum>
#include <QStringList>

// In the schema's words: CloseBeforeReply is "close-before-reply" there.
namespace sandbox {
Q_NAMESPACE

// How a reply goes wrong below HTTP, once the request has been read.
enum class Fault {
    None,
    CloseBeforeReply, // a regular end of the connection in place of the reply
    Reset,            // TCP reset in place of the reply
    HalfHeader,       // the connection ends in the middle of the header
    Truncate,         // the connection ends in the middle of the body that the header announced
    Drip,             // one byte a second, for as long as the peer listens
    Garbage,          // bytes that are no HTTP
    Flood             // a body of a gigabyte, for as long as the peer takes it
};
Q_ENUM_NS(Fault)

// How a connection goes wrong before the request that it was opened for has been read.
enum class ConnectionFault {
    None,
    Refused,         // nothing listens
    Mute,            // accepted, then nothing is ever said
    Plain,           // an answer in plain HTTP
    HandshakeClosed, // a regular end of the connection in place of the server's part of the handshake
    HandshakeReset,  // a TCP reset there
    HandshakeGarbage,
    OldTls, // nothing newer than TLS 1.1
    NoCommonCipher,
    Expired, // the certificates of these are all that is wrong with them
    NotYetValid,
    OtherHost,
    OtherCa,
    OtherCaOfThatName,
    SelfSigned,
    ClientPurpose,
    ClosedBeforeRequest, // after the handshake
    ResetBeforeRequest,
    ClosedDuringRequest
};
Q_ENUM_NS(ConnectionFault)

// From which connection on (counted over both addresses, from 1) the server's connections go wrong.
struct ConnectionScript
{
    int from = 1;
    ConnectionFault fault = ConnectionFault::None;
};

// What is typed into the program. An empty port stands for the world's, an empty alias for the one offered;
// with an empty host, host and port stay as the record has filled them in.
struct ScenarioInput
{
    QString host = QStringLiteral("localhost");
    QString port;
    QString user = QStringLiteral("liming");
    QString password = QStringLiteral("Terminal-7");
    QString alias;
    QString administrator = QStringLiteral("admin");
    QString administratorPassword = QStringLiteral("Control-9");
    bool authorise = true; // false: the administrator's dialog is cancelled
};

// Which way a scenario goes through the program.
enum class Journey { Join, Leave };

// Where a walk through the program ends.
struct ScenarioExpectation
{
    QString page = QStringLiteral("success"); // server, account, alias, summary, progress, success or leave
    QStringList messages; // exact texts of the message boxes in their order; "" is one without text
};

QString wordOf(const char *key);

// The schema's word for a value of one of these; empty for None.
template <typename Enum>
QString wordOf(Enum value)
{
    return value == Enum::None ? QString()
                               : wordOf(QMetaEnum::fromType<Enum>().valueToKey(static_cast<int>(value)));
}

// What the word at `key` stands for; None where none is there.
template <typename Enum>
Enum valueOf(const QJsonObject &object, const char *key)
{
    const auto words = QMetaEnum::fromType<Enum>();
    int index = 0;
    while (index < words.keyCount() && wordOf(words.key(index)) != json::text(object, key))
        ++index;
    return index < words.keyCount() ? static_cast<Enum>(words.value(index)) : Enum::None;
}

// A situation that a world can be started in, read from a file: how server, services and commands behave,
// which files lie on the terminal, what is typed, and what the program is expected to come to. Launcher,
// server, services, stand-in commands and autopilot read the same file, each takes its part. A value: cheap
// to copy, never changes. A scenario without a file (default constructed) is the one where all goes well.
class Scenario
{
public:
    Scenario() = default;
    // json: as the schema has it.
    explicit Scenario(QJsonObject json)
        : m_json(std::move(json))
    {
    }

    // Reads a file. Throws an Error that names the file and, where one is at fault, the key.
    static Scenario load(const QString &path);

    // Path of what a user names: a file (what ends in ".json"), or a scenario in standardDirectory(). Empty
    // where there is no such scenario.
    static QString pathOf(const QString &nameOrPath);

    // Where the scenarios of this build or installation lie: "../share/vesk-sandbox/scenarios" beside the
    // directory of the running program.
    static QString standardDirectory();

    // Names of all scenarios there, sorted.
    static QStringList names();

    QString title() const { return json::text(m_json, "title"); } // one line in English

    ConnectionScript serverConnections() const;
    // Laid over the configuration of a new server.
    QJsonObject serverConfig() const { return json::object(json::object(m_json, "server"), "config"); }

    // What the schema has as "endpoint", "service" and "command", of those of the name; empty where the
    // scenario says nothing about them.
    QJsonObject endpoint(const QString &name) const
    {
        return json::object(json::object(m_json, "server"), "endpoints").value(name).toObject();
    }
    QJsonObject service(const QString &name) const
    {
        return json::object(m_json, "services").value(name).toObject();
    }
    QJsonObject command(const QString &name) const
    {
        return json::object(m_json, "commands").value(name).toObject();
    }

    // Whether the program finds the bus ("session" or "system") where its environment says it is.
    bool hasBus(const char *bus) const { return json::flag(json::object(m_json, "buses"), bus, true); }

    // Dashed key names that the settings schema of this world lacks.
    QStringList schemaWithout() const { return json::texts(json::object(m_json, "schema"), "without"); }

    // A scenario that leaves needs a world in which the terminal has joined.
    Journey journey() const
    {
        return json::text(m_json, "journey") == QLatin1String("leave") ? Journey::Leave : Journey::Join;
    }
    ScenarioInput input() const;
    ScenarioExpectation expectation() const;

    // The whole of it, for what only the campaign looks at; see scenario.schema.json.
    QJsonObject json() const { return m_json; }

private:
    QJsonObject m_json;
};

} // namespace sandbox
