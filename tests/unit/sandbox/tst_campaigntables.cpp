// SPDX-License-Identifier: Apache-2.0
#include "campaign/campaigntables.h"

#include <QDir>
#include <QFile>
#include <QTemporaryDir>
#include <QTest>

using sandbox::CampaignTables;
using sandbox::NextAttempt;

namespace {

const QByteArray kJourneys = R"({"join": {"pages": ["one", "two"], "calls": [
    {"name": "first", "page": "one", "line": "GET first"},
    {"name": "maybe", "page": "one", "line": "GET maybe", "optional": true},
    {"name": "second", "page": "two", "line": "GET second"}],
    "end": {"page": "success", "close": "possible", "files": "none"}}})";
const QByteArray kFiles = R"({"states": {"none": {}, "some": {"/tmp/vesk/a": "0600 key"}}})";
const QByteArray kStage = R"({"name": "s", "call": "first", "endpoint": "auth",
    "granted": {"code": 0, "data": {"a": 1}}, "stop": {"page": "one", "close": "refused", "files": "none"},
    "outcomes": {"no-reply": {"message": "gone"}, "refusal": {"message": "@msg"}, "granted": {"goes_on": true}}})";
const QByteArray kFault = R"({"name": "f", "title": "t", "class": "no-reply"})";

} // namespace

// The tables as people write them: what a row inherits, and that no slip goes unnoticed.
class TestCampaignTables : public QObject
{
    Q_OBJECT

private:
    std::optional<CampaignTables> load(const QByteArray &group, const QByteArray &files = kFiles)
    {
        m_error.clear();
        const QList<QPair<QString, QByteArray>> all{{QStringLiteral("journeys.json"), kJourneys},
                                                    {QStringLiteral("files.json"), files},
                                                    {QStringLiteral("group.json"), group}};
        for (const auto &each : all) {
            QFile file(m_folder.filePath(each.first));
            if (!file.open(QIODevice::WriteOnly) || file.write(each.second) < 0)
                return std::nullopt;
        }
        return CampaignTables::load(m_folder.path(), &m_error);
    }

    static QByteArray group(const QByteArray &stage, const QByteArray &fault, const QByteArray &more = {})
    {
        return "{\"stages\": [" + stage + "], \"faults\": [" + fault + "]" + more + "}";
    }

    QTemporaryDir m_folder;
    QString m_error;

private Q_SLOTS:
    void stopsAtItsStage()
    {
        const auto tables = load(group(kStage, kFault));
        QVERIFY2(tables && tables->rows().size() == 1, qPrintable(m_error));
        const sandbox::Expectation expect = tables->row(QStringLiteral("group/s/f"))->expect;
        QCOMPARE(expect.boxes, QStringList{QStringLiteral("gone")});
        QVERIFY(!expect.mayClose);
        QCOMPARE(expect.asked.times.value(QStringLiteral("first")), 1);
        QCOMPARE(expect.asked.times.value(QStringLiteral("second")), 0);
        QVERIFY(expect.next.how == NextAttempt::How::Press);
        QCOMPARE(expect.next.page, QStringLiteral("success"));
    }

    void goesOnAndChangesTheReply()
    {
        QByteArray fault = kFault;
        fault.replace("no-reply\"",
                      "granted\", \"seen\": false, \"does\": {\"reply\": {\"set\": {\"data.a\": 2}}}");
        const auto tables = load(group(kStage, fault));
        QVERIFY2(tables, qPrintable(m_error));
        const sandbox::Row row = tables->rows().constFirst();
        QCOMPARE(row.expect.page, QStringLiteral("success"));
        QCOMPARE(row.expect.asked.times.value(QStringLiteral("first")), 0);
        QCOMPARE(row.expect.asked.times.value(QStringLiteral("second")), 1);
        QVERIFY(row.expect.next.how == NextAttempt::How::None);
        const QJsonObject json = row.scenario.value(QLatin1String("server"))
                                     .toObject()
                                     .value(QLatin1String("endpoints"))
                                     .toObject()
                                     .value(QLatin1String("auth"))
                                     .toObject()
                                     .value(QLatin1String("json"))
                                     .toObject();
        QCOMPARE(json.value(QLatin1String("data")).toObject().value(QLatin1String("a")).toInt(), 2);
        QVERIFY(json.contains(QLatin1String("code")));
    }

    void refuses_data()
    {
        QTest::addColumn<QByteArray>("text");
        QTest::addColumn<QString>("complaint");
        const auto row = [](const char *name, QByteArray text, const char *old, const char *changed,
                            const char *complaint) {
            QTest::newRow(name) << text.replace(old, changed) << QString::fromLatin1(complaint);
        };
        const QByteArray good = group(kStage, kFault);
        row("unknown key of a stage", good, "\"endpoint\"", "\"endpiont\"",
            "\"stages[0].endpiont\" is unknown");
        row("unknown key of a fault", good, "\"title\"", "\"seem\": 1, \"title\"",
            "\"faults[0].seem\" is unknown");
        row("unknown key of an outcome", good, "\"message\": \"gone\"", "\"massage\": \"gone\"",
            "\"group/s/f.massage\" is unknown");
        row("unknown call", good, "\"call\": \"first\"", "\"call\": \"third\"", "no call \"third\"");
        row("unknown class", good, "\"class\": \"no-reply\"", "\"class\": \"odd\"",
            "no outcome for the class \"odd\"");
        row("unknown state", good, "\"files\": \"none\"", "\"files\": \"nine\"", "unknown state \"nine\"");
        row("next message of no stop", good, "\"message\": \"gone\"",
            "\"message\": \"gone\", \"next_message\": \"odd\"", "none of the journey's stops");
        row("unknown action", good, "\"title\"", "\"actions\": [{\"do\": \"dance\"}], \"title\"",
            "is none of");
        row("fault at no stage", good, "\"title\"", "\"only\": [\"t\"], \"title\"", "unknown stage \"t\"");
        row("outcomes like each other", good, "{\"message\": \"gone\"}", "{\"like\": \"no-reply\"}",
            "no outcome for the class");
        row("exception without a row", group(kStage, kFault, R"(, "exceptions": {"s/g": {"note": "n"}})"), "",
            "", "belongs to no row");
        row("exception without a note", group(kStage, kFault, R"(, "exceptions": {"s/f": {"page": "two"}})"),
            "", "", "has no \"note\"");
        row("no JSON", "{", "", "", "is no JSON");
    }

    void refuses()
    {
        QFETCH(QByteArray, text);
        QFETCH(QString, complaint);
        QVERIFY(!load(text));
        QVERIFY2(m_error.contains(complaint) && m_error.contains(QStringLiteral("group.json")),
                 qPrintable(m_error));
    }

    void realTablesAreGood()
    {
        QString error;
        const auto tables = CampaignTables::load(QStringLiteral(VESK_CAMPAIGN_TABLES), &error);
        QVERIFY2(tables, qPrintable(error));
        int fast = 0;
        for (const sandbox::Row &row : tables->rows())
            fast += row.isFast ? 1 : 0;
        QVERIFY(tables->rows().size() >= 300);
        QVERIFY2(fast > 0 && fast <= 80, qPrintable(QString::number(fast)));
    }
};

QTEST_GUILESS_MAIN(TestCampaignTables)
#include "tst_campaigntables.moc"
