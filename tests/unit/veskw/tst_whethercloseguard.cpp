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
    static passwd record{name, nullptr, 0, 0, nullptr, nullptr, nullptr};
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
        QVERIFY(log.lines().contains(QStringLiteral("info: userName  \"wangli\"")));
    }
};

QTEST_MAIN(TestWhetherCloseGuard)
#include "tst_whethercloseguard.moc"
