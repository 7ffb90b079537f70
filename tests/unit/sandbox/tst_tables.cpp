// SPDX-License-Identifier: Apache-2.0
#include "campaign/rows.h"
#include "journal/error.h"
#include "scenario/json.h"
#include "scenario/scenario.h"

#include <QDir>
#include <QFile>
#include <QJsonDocument>
#include <QProcess>
#include <QTemporaryDir>
#include <QTest>

using namespace sandbox;

namespace {

const QByteArray kStage = R"({"name": "auth", "journey": "join", "call": "auth", "endpoint": "auth",
    "granted": {"code": 0}, "stop": {"page": "account", "close": "refused", "files": "ca"},
    "outcomes": {"no-reply": {"message": "gone"}, "granted": {"goes_on": true}}})";
const QByteArray kFault = R"({"name": "f", "title": "t", "class": "no-reply"})";

QByteArray group(const QByteArray &stage, const QByteArray &fault, const QByteArray &more = {})
{
    return "{\"stages\": [" + stage + "], \"faults\": [" + fault + "]" + more + "}";
}

} // namespace

// Scenarios and tables as people write them: no slip goes unnoticed. What they do the campaign shows.
class TestTables : public QObject
{
    Q_OBJECT

private Q_SLOTS:
    void slips_data()
    {
        QTest::addColumn<bool>("isScenario");
        QTest::addColumn<QByteArray>("text");
        QTest::addColumn<QString>("complaint");
        const auto scenario = [](const char *name, const QByteArray &text, const char *complaint) {
            QTest::newRow(name) << true << text << QString::fromUtf8(complaint);
        };
        scenario("cut off", "{\n\"title\": \"t\",\n", "line 3 is not JSON");
        scenario("array", "[]", "the top is not an object");
        scenario("no title", "{}", "'title'");
        scenario("unknown key", R"({"title": "t", "server": {"listens": true}})", "\"server\": ");
        scenario("unknown endpoint", R"({"title": "t", "server": {"endpoints": {"joins": {}}}})", "'joins'");
        scenario("out of range", R"({"title": "t", "server": {"endpoints": {"join": {"status": 99}}}})",
                 "\"server.endpoints.join.status\"");
        scenario("two bodies",
                 R"({"title": "t", "server": {"endpoints": {"join": {"body": "", "json": {}}}}})",
                 "\"server.endpoints.join\"");
        scenario("place that climbs out", R"({"title": "t", "prepare": {"places": {"/tmp/../x": "absent"}}})",
                 "\"prepare\": ");
        scenario("key with a control", "{\"title\": \"t\", \"a\\u001bb\": 1}", "'a\\x1bb'");

        const QByteArray good = group(kStage, kFault);
        const auto table = [&good](const char *name, const char *old, const char *changed,
                                   const char *complaint) {
            QTest::newRow(name) << false << QByteArray(good).replace(old, changed)
                                << QString::fromUtf8(complaint);
        };
        table("unknown key of an outcome", "\"message\"", "\"massage\"", "stages.0.outcomes.no-reply");
        table("unknown action", "\"title\"", "\"actions\": [{\"do\": \"dance\"}], \"title\"",
              "faults.0.actions.0.do");
        table("unknown call", "\"call\": \"auth\"", "\"call\": \"third\"", "no call \"third\"");
        table("unknown class", "\"class\": \"no-reply\"", "\"class\": \"odd\"", "class \"odd\"");
        table("outcomes like each other", "{\"message\": \"gone\"}", "{\"like\": \"no-reply\"}",
              "no outcome");
        table("unknown state", "\"files\": \"ca\"", "\"files\": \"nine\"", "unknown state \"nine\"");
        table("next message of no stop", "\"gone\"", "\"gone\", \"next_message\": \"odd\"",
              "journey's stops");
        table("fault at no stage", "\"title\"", "\"only\": [\"t\"], \"title\"", "unknown stage \"t\"");
        table("exception without a row", "]}", R"(], "exceptions": {"s/g": {"note": "n"}}})", "no row");
        table("exception without a note", "]}", R"(], "exceptions": {"auth/f": {"page": "alias"}}})",
              "\"note\"");
    }

    void slips()
    {
        QFETCH(bool, isScenario);
        QFETCH(QByteArray, text);
        QFETCH(QString, complaint);
        QString error;
        QVERIFY(isScenario ? !scenarioOf(text, &error) : rowsOf(text, &error).isEmpty());
        QVERIFY2(error.startsWith(m_directory.path()) && error.contains(complaint) &&
                     !error.contains(QLatin1Char('\n')),
                 qPrintable(error));
    }

    void rowsInherit()
    {
        QString error;
        QByteArray changed = kFault;
        changed.replace("\"f\"", "\"g\"")
            .replace("no-reply\"", "granted\", \"does\": {\"reply\": {\"set\": {\"data.a\": 2}}}");
        const auto rows = rowsOf(group(kStage, kFault + ',' + changed), &error);
        QCOMPARE(rows.size(), 2);
        const QJsonObject stops = json::object(rows.at(0), "expect");
        QCOMPARE(json::texts(stops, "messages"), QStringList{QStringLiteral("gone")});
        QCOMPARE(json::number(json::object(stops, "calls"), "auth", -1), 1);
        QCOMPARE(json::number(json::object(stops, "calls"), "rule", -1), 0);
        QCOMPARE(json::text(stops, "next"), QStringLiteral("press"));
        QCOMPARE(json::text(json::object(rows.at(1), "expect"), "page"), QStringLiteral("success"));
        const QJsonObject reply = json::object(
            json::object(json::object(json::object(rows.at(1), "server"), "endpoints"), "auth"), "json");
        QCOMPARE(json::number(reply, "code", -1), 0);
        QCOMPARE(json::number(json::object(reply, "data"), "a", -1), 2);
    }

    void ourOwnAreGood()
    {
        QString error;
        for (const QString &name : Scenario::names())
            QVERIFY2(attempt(&error, [&name] { Scenario::load(Scenario::pathOf(name)); }), qPrintable(error));
        const QVector<Row> all = Rows::load().all();
        QVERIFY(all.size() >= 900);
        for (const Row &row : all)
            QVERIFY2(!row.isFast || scenarioOf(QJsonDocument(row.scenario).toJson(), &error),
                     qPrintable(row.id + error));
    }

private:
    QString write(const QString &name, const QByteArray &text)
    {
        QFile file(m_directory.filePath(name));
        return file.open(QIODevice::WriteOnly) && file.write(text) == text.size() ? file.fileName()
                                                                                  : QString();
    }

    std::optional<Scenario> scenarioOf(const QByteArray &text, QString *error)
    {
        std::optional<Scenario> scenario;
        attempt(error, [&] { scenario = Scenario::load(write(QStringLiteral("tried.json"), text)); });
        return scenario;
    }

    // Our own journeys and states, and one group.
    QVector<QJsonObject> rowsOf(const QByteArray &text, QString *error)
    {
        const QString campaign = QStringLiteral(VESK_SANDBOX_SOURCES "/campaign/");
        const QString directory = m_directory.filePath(QStringLiteral("tables"));
        QDir().mkpath(directory);
        for (const char *name : {"/journeys.json", "/files.json"})
            QFile::copy(campaign + QStringLiteral("tables") + QLatin1String(name),
                        directory + QLatin1String(name));
        write(QStringLiteral("tables/names.json"), "{}");
        write(QStringLiteral("tables/group.json"), text);
        QProcess make;
        make.start(QStringLiteral(VESK_SANDBOX_SOURCES "/../tools/make-rows"),
                   {directory, directory + QStringLiteral("/none"),
                    QStringLiteral(VESK_SANDBOX_SOURCES "/data/scenario.schema.json")});
        make.waitForFinished();
        *error = QString::fromUtf8(make.readAllStandardError()).trimmed();
        QVector<QJsonObject> scenarios;
        for (const QByteArray &line : make.readAllStandardOutput().split('\n').mid(1)) {
            if (!line.isEmpty())
                scenarios.append(json::object(QJsonDocument::fromJson(line).object(), "scenario"));
        }
        return scenarios;
    }

    QTemporaryDir m_directory;
};

QTEST_GUILESS_MAIN(TestTables)
#include "tst_tables.moc"
