// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QByteArray>
#include <QJsonObject>
#include <QMap>
#include <QMetaEnum>
#include <QString>
#include <QStringList>

#include <optional>

// In the schema's words: CloseBeforeReply is "close-before-reply" there.
namespace sandbox {
Q_NAMESPACE

// How a reply goes wrong below HTTP, once the request has been read.
enum class Fault {
    None,
    CloseBeforeReply, // an orderly end of the connection in place of the reply
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
    Refused,         // nobody listens
    Mute,            // accepted, then nothing is ever said
    Plain,           // an answer in plain HTTP
    HandshakeClosed, // an orderly end of the connection in place of the server's part of the handshake
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

// What a scenario says about one endpoint of the management server. What it leaves out is the server's own.
struct EndpointScript
{
    // HTTP status, 100 to 599, and body. With either of them the server's own logic does not run, and the
    // other one is 200 or empty. With neither, delay and fault befall the server's own reply.
    std::optional<int> status;
    std::optional<QByteArray> body;
    bool bodyIsJson = false; // decides the content type of `body`
    QString location;        // header "Location"; empty: none
    int delayMs = 0;         // wait between request and reply, 0 to 600000
    bool isHeld = false;     // wait there until it is released, see Hold
    Fault fault = Fault::None;
    int times = -1; // the script serves this many requests, then the server is itself again; -1: always
};

// What a call of a service is answered with in place of what its contract says.
enum class OddAnswer { None, WrongType, Nothing };
Q_ENUM_NS(OddAnswer)

// What a scenario says about one D-Bus service, or about one operation of it.
struct ServiceScript
{
    bool present = true;          // false: nobody owns the bus name
    std::optional<QString> reply; // text that a text call returns
    std::optional<int> result;    // number that a number call returns
    std::optional<QString>
        error;             // name of the D-Bus error that a call, or the write of a property, answers with
    int delayMs = 0;       // wait before the answer, 0 to 600000
    bool isHeld = false;   // wait there until it is released, see Hold
    int spared = 0;        // so many calls go well before all this begins
    bool vanish = false;   // the service ends in the middle of a call, without an answer
    bool ends = false;     // the service ends after its answer
    bool restarts = false; // the service ends after its answer and is started anew
    OddAnswer answer = OddAnswer::None;      // a call is carried out, but answered like this
    bool introspect = true;                  // false: introspection does not show the property
    bool isDenied = false;                   // the bus lets nobody call it
    bool activationFails = false;            // the bus would start it, but what it starts ends at once
    QMap<QString, ServiceScript> operations; // by operation; what they say goes before the above

    // The script of one operation: its own, or else that of the service.
    ServiceScript operation(const QString &name) const;
};

// What a scenario says about one of the commands that the program starts.
struct CommandScript
{
    std::optional<int> exitCode;   // 0 to 255
    std::optional<QString> output; // standard output in place of the command's own
    int delayMs = 0;               // 0 to 600000
    bool isHeld = false;           // until it is released, see Hold
};

// What is typed into the program. An empty port stands for the world's, an empty alias for the one offered.
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
    QStringList boxes; // exact texts of the message boxes in their order; "" is a box without text
};

QString wordOf(const char *key);

// The schema's word for a value of one of these; empty for None.
template <typename Enum>
QString wordOf(Enum value)
{
    return value == Enum::None ? QString()
                               : wordOf(QMetaEnum::fromType<Enum>().valueToKey(static_cast<int>(value)));
}

// A situation that a world can be started in, read from a file: how server, services and commands behave,
// which files lie on the terminal, what is typed, and what the program is expected to come to. Launcher,
// server, services, stand-in commands and autopilot read the same file, each takes its part. A value: cheap
// to copy, never changes. A scenario without a file (default constructed) is the one where all goes well.
class Scenario
{
public:
    Scenario() = default;

    // Reads a file. On failure returns nothing and sets `error` to one line that names the file and, where
    // one is at fault, the key.
    static std::optional<Scenario> load(const QString &path, QString *error);

    // Path of what a user names: a file (what ends in ".json"), or a scenario in standardFolder(). Empty
    // where there is no such scenario.
    static QString pathOf(const QString &nameOrPath);

    // Where the scenarios of this build or installation lie: "../share/vesk-sandbox/scenarios" beside the
    // folder of the running program.
    static QString standardFolder();

    // Names of all scenarios there, sorted.
    static QStringList names();

    QString name() const { return m_name; }   // file name without ".json"
    QString title() const { return m_title; } // one line in English

    bool serverListens() const { return m_serverListens; } // false: nothing listens at the enrolment address
    bool serverSpeaksTls() const
    {
        return m_serverSpeaksTls;
    } // false: the enrolment address speaks plain HTTP
    ConnectionScript serverConnections() const { return m_connections; }
    QJsonObject serverConfig() const { return m_serverConfig; } // laid over the configuration of a new server

    // Of `endpoint` (a name of the schema: ca_cert, status, ...), `service` (network, veskg, iam, login),
    // `command` (gsettings, systemctl, killall, id): what the scenario says, or the script of one that
    // behaves.
    EndpointScript endpoint(const QString &endpoint) const { return m_endpoints.value(endpoint); }
    bool hasService(const QString &service) const { return m_services.contains(service); } // says something
    ServiceScript service(const QString &service) const { return m_services.value(service); }
    CommandScript command(const QString &command) const { return m_commands.value(command); }

    // Whether the program finds the bus ("session" or "system") where its environment says it is.
    bool hasBus(const QString &bus) const { return !m_missingBuses.contains(bus); }

    // Dashed key names that the settings schema of this world lacks.
    QStringList schemaWithout() const { return m_schemaWithout; }

    // Files of a new world by the absolute path that the program sees; a null string: the file is absent, an
    // empty one: it is there and empty.
    QMap<QString, QString> files() const { return m_files; }

    // A scenario that leaves needs a world in which the terminal has joined.
    Journey journey() const { return m_journey; }
    ScenarioInput input() const { return m_input; }
    ScenarioExpectation expectation() const { return m_expectation; }

    // The whole of it, for what only the campaign looks at; see scenario.schema.json.
    QJsonObject json() const { return m_json; }

private:
    void read(const QJsonObject &json);
    void readServer(const QJsonObject &server);
    void readTerminal();
    void readExpectation();

    QJsonObject m_json;
    QString m_name = QStringLiteral("join-ok");
    QString m_title;
    bool m_serverListens = true;
    bool m_serverSpeaksTls = true;
    QJsonObject m_serverConfig;
    ConnectionScript m_connections;
    QMap<QString, EndpointScript> m_endpoints;
    QMap<QString, ServiceScript> m_services;
    QMap<QString, CommandScript> m_commands;
    QStringList m_missingBuses;
    QStringList m_schemaWithout;
    QMap<QString, QString> m_files;
    Journey m_journey = Journey::Join;
    ScenarioInput m_input;
    ScenarioExpectation m_expectation;
};

} // namespace sandbox
