// SPDX-License-Identifier: Apache-2.0
#include "aliaspattern.h"

#include <QElapsedTimer>
#include <QRegExp>
#include <QTest>

namespace {

// `part` written `count` times.
QString times(int count, const char *part)
{
    return QString::fromLatin1(part).repeated(count);
}

QString nested(int depth, const char *opening, const char *closing)
{
    return times(depth, opening) + QLatin1Char('a') + times(depth, closing);
}

} // namespace

// Rules that servers send, and rules that would take the program's stack, memory or time.
class TestAliasPattern : public QObject
{
    Q_OBJECT

private Q_SLOTS:
    void judges_data()
    {
        QTest::addColumn<QString>("pattern");
        QTest::addColumn<bool>("bearable");

        const auto row = [](const char *name, const QString &pattern, bool bearable) {
            QTest::newRow(name) << pattern << bearable;
        };
        row("empty", QString(), true);
        row("length", QStringLiteral("^[A-Za-z0-9_-]{1,255}$"), true);
        row("two lengths", QStringLiteral("[a-z]{1,255}(-[0-9]{1,255})?"), true);
        row("look-aheads in a row", QStringLiteral("(?=.*[a-z])(?=.*[0-9])(?!.*--).{4,32}"), true);
        row("bracket in a class", QStringLiteral("[]{9}(\\]]{32}"), true);
        row("escaped brackets", times(500, "\\(\\{"), true);
        row("nested repetitions", QStringLiteral("((a*)*)*b"), true);
        row("as many as there may be", QStringLiteral("(a?){1000}"), true);
        row("too many closed", QStringLiteral(")))a"), true);

        row("one more", QStringLiteral("(a?){1000}a"), false);
        row("multiplied", QStringLiteral("((a{100}){100}){100}"), false);
        row("a repetition that swallows a group", QStringLiteral("(((a{(b)*){50}){50}){50}"), false);
        row("a number that overflows", QStringLiteral("a\\2147483648"), false);
        row("multiplied behind an error", QStringLiteral("a{=(((a{50=)0}){500}){50}"), false);
        row("from a number on", QStringLiteral("(a{40}){40,}"), false);
        row("a number beyond all", QStringLiteral("a{99999999999999999999}"), false);
        row("a thousand optional", times(1001, "a?"), false);
        row("deep", nested(60000, "(", ")"), false);
        row("deep in a short pattern", nested(200, "(", ")*"), false);
        row("look-aheads within each other", nested(10, "(?=.*", ")"), false);
        row("long", QLatin1Char('[') + times(5000, "a") + QLatin1Char(']'), false);
    }

    void judges()
    {
        QFETCH(QString, pattern);
        QTEST(aliaspattern::isBearable(pattern), "bearable");
        if (!aliaspattern::isBearable(pattern))
            return;
        QElapsedTimer timer;
        timer.start();
        QRegExp(pattern, Qt::CaseSensitive, QRegExp::RegExp).indexIn(QString(32, QLatin1Char('a')));
        QVERIFY(timer.elapsed() < 10000); // a second, on a machine that does much else
    }

    // The two have to read numbers alike: a rule that works must not be refused, and a reader that went on
    // behind an error would count other groups than the expression class builds.
    void readsNumbersAsTheExpressionClassDoes()
    {
        for (const char *text :
             {"a{}",         "a{5}",  "a{,}",  "a{,5}", "a{5,}",  "a{5,6}", "a{",       "a{5",
              "a{5,",        "a{5,6", "a{x}",  "a{5x}", "a{ 5}",  "a{5 }",  "a{5,6,7}", "a{(a)",
              "a{\xd9\xa5}", "a\\1",  "a\\14", "a\\15", "a\\100", "a\\015", "(a)\\1{2}"}) {
            const QString pattern = QString::fromUtf8(text);
            const bool isValid = QRegExp(pattern, Qt::CaseSensitive, QRegExp::RegExp).isValid();
            QVERIFY2(aliaspattern::isBearable(pattern) == isValid, qPrintable(pattern));
        }
    }
};

QTEST_GUILESS_MAIN(TestAliasPattern)
#include "tst_aliaspattern.moc"
