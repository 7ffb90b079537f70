// SPDX-License-Identifier: Apache-2.0
#include "localselectwidget.h"
#include "logcapture.h"

#include <QPushButton>
#include <QTest>

#include <pwd.h>

// In this program everybody has a name that the server knows without its "@".
extern "C" passwd *getpwuid(uid_t /*id*/)
{
    static char name[] = "wang@li@";
    static passwd record = {};
    record.pw_name = name;
    return &record;
}

class TestWhetherCloseGuard : public QObject
{
    Q_OBJECT

private Q_SLOTS:
    void asksForTheUserWithoutTheAt()
    {
        whetherCloseGuard panel(nullptr, true);
        const LogCapture log;
        panel.findChild<QPushButton *>()->click(); // no server is configured
        QVERIFY2(log.lines().contains(QStringLiteral("info: userName  \"wangli\"")),
                 qUtf8Printable(log.text()));
    }
};

QTEST_MAIN(TestWhetherCloseGuard)
#include "tst_whethercloseguard.moc"
