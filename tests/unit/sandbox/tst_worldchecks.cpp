// SPDX-License-Identifier: Apache-2.0
#include "campaign/checks/worldchecks.h"

#include <QTest>

using namespace sandbox;

namespace {

JourneyPlan plan()
{
    JourneyPlan plan;
    const auto add = [&plan](const char *name, const char *line, bool isDetached = false) {
        plan.calls.append({QLatin1String(name), QLatin1String(line), isDetached});
    };
    add("look", "net Look()");
    add("ask", "request GET /a");
    add("stop", "ctl stop", true);
    add("again", "net Look()");
    add("send", "request POST /b");
    plan.ignored = QStringList{QStringLiteral("server reply ")};
    plan.incomplete = QStringList{QStringLiteral("server TLS ")};
    return plan;
}

} // namespace

// The order of calls, as the journal shows it.
class TestWorldChecks : public QObject
{
    Q_OBJECT

private Q_SLOTS:
    void calls_data()
    {
        QTest::addColumn<QStringList>("lines"); // source and text
        QTest::addColumn<QString>("complaint"); // the first; empty: there is none
        const auto row = [](const char *name, const char *lines, const char *complaint) {
            QTest::newRow(name) << QString::fromLatin1(lines).split(QLatin1Char('|'))
                                << QString::fromLatin1(complaint);
        };
        row("as planned",
            "bus net Look() -> x|server request GET /a|server reply 200|command ctl stop|bus net Look()|"
            "server request POST /b|world no call",
            "");
        row("runs on its own",
            "bus net Look()|server request GET /a|bus net Look()|server request POST /b|command ctl stop",
            "");
        row("on its own, too early",
            "bus net Look()|command ctl stop|server request GET /a|bus net Look()|server request POST /b",
            "not in order: command ctl stop");
        row("exchanged",
            "server request GET /a|bus net Look()|command ctl stop|bus net Look()|server request POST /b",
            "not in order: server request GET /a");
        row("held, and answered late",
            "bus net: \"Look\" is held for now|server request GET /a|command ctl stop|bus net Look()|"
            "bus net Look()|server request POST /b",
            "");
        row("one too many",
            "bus net Look()|server request GET /a|command ctl stop|bus net Look()|server request POST /b|"
            "server request POST /b",
            "call send: expected 1 times, seen 2 times: request POST /b");
        row("one is missing", "bus net Look()|server request GET /a|bus net Look()|server request POST /b",
            "call stop: expected 1 times, seen 0 times: ctl stop");
        row("of nobody's plan",
            "bus net Look()|server request GET /a|command ctl stop|bus net Look()|server request POST /b|"
            "command ctl start",
            "not planned: command ctl start");
        row("a connection of nobody's plan",
            "bus net Look()|server request GET /a|command ctl stop|bus net Look()|server request POST /b|"
            "server TLS fails",
            "not planned: server TLS fails");
    }

    void calls()
    {
        QFETCH(QStringList, lines);
        QByteArray journal;
        for (const QString &line : lines)
            journal += "2026-11-24 13:00:00.123 " + line.toLatin1() + '\n';
        ExpectedCalls expected;
        for (const Call &call : plan().calls)
            expected.times.insert(call.name, 1);
        const QStringList complaints = worldchecks::calls(plan(), expected, journal);
        QTEST(complaints.value(0), "complaint");
        expected.incomplete = 1;
        const bool mayLack = complaints.value(0).contains(QLatin1String("TLS"));
        QCOMPARE(worldchecks::calls(plan(), expected, journal).isEmpty(), complaints.isEmpty() || mayLack);
    }
};

QTEST_GUILESS_MAIN(TestWorldChecks)
#include "tst_worldchecks.moc"
