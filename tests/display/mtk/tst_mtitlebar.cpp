// SPDX-License-Identifier: Apache-2.0
#include "themedtest.h"

#include "mtk/mblureffectwidget.h"
#include "mtk/mtitlebar.h"

#include <QVBoxLayout>

using namespace Mtk::Widget;

namespace {

constexpr QPoint kPlace(40, 20); // on the bar, beside its buttons

// A window as programs build theirs.
struct Window : MBlurEffectWidget
{
    MTitlebar *bar = new MTitlebar;
    bool refuses = false;

    Window()
    {
        auto *column = new QVBoxLayout(this);
        column->setContentsMargins(0, 0, 0, 0);
        column->addWidget(bar);
        column->addStretch();
        resize(380, 237);
    }

    void keepFlags(uint mask) { setWindowFlags(windowFlags() & Qt::WindowFlags(QFlag(mask))); }
    void closeEvent(QCloseEvent *event) override { event->setAccepted(!refuses); }

    QString shownButtons() const
    {
        QStringList names;
        for (const QAbstractButton *button : findChildren<QAbstractButton *>()) {
            if (button->isVisible())
                names << button->accessibleName();
        }
        return names.join(QLatin1Char(' '));
    }

    void drag(const QPoint &by)
    {
        QTest::mousePress(bar, Qt::LeftButton, {}, kPlace);
        QMouseEvent move(QEvent::MouseMove, kPlace + by, bar->mapToGlobal(kPlace + by), Qt::NoButton,
                         Qt::LeftButton, {});
        QApplication::sendEvent(bar, &move);
        QTest::mouseRelease(bar, Qt::LeftButton, {}, kPlace);
    }
};

} // namespace

class TestMTitlebar : public QObject
{
    Q_OBJECT

private Q_SLOTS:
    void buttonsFollowTheFlags_data()
    {
        QTest::addColumn<uint>("mask");
        QTest::addColumn<bool>("fixed");
        QTest::addColumn<QString>("names");
        QTest::newRow("all") << 0xffffffffU << false << QStringLiteral("最小化 最大化 关闭");
        QTest::newRow("fixed size") << 0xffffffffU << true << QStringLiteral("最小化 关闭");
        QTest::newRow("close only") << 0xffff3fffU << true << QStringLiteral("关闭");
        QTest::newRow("none") << 0xf7ff3fffU << true << QString();
    }

    void buttonsFollowTheFlags()
    {
        QFETCH(uint, mask);
        QFETCH(bool, fixed);
        Window window;
        window.bar->setMenuVisible(false);
        if (fixed)
            window.setFixedSize(380, 237);
        window.keepFlags(mask);
        window.show();
        QTEST(window.shownButtons(), "names");
        QVERIFY(window.isWindow() && window.windowFlags() & Qt::FramelessWindowHint);

        // Flags that change while the window is open count as well.
        window.keepFlags(~uint(Qt::WindowCloseButtonHint));
        window.show();
        QVERIFY(!window.shownButtons().contains(QStringLiteral("关闭")));
    }

    void closeAsksTheWindow()
    {
        Window window;
        window.show();
        for (const bool refuses : {true, false}) {
            window.refuses = refuses;
            buttonNamed(window, QStringLiteral("关闭"))->click();
            QCOMPARE(window.isVisible(), refuses);
        }
    }

    void doubleClickMaximisesWhereGranted()
    {
        Window window;
        window.show();
        QTest::mouseDClick(window.bar, Qt::LeftButton, {}, kPlace);
        QVERIFY(window.isMaximized() && buttonNamed(window, QStringLiteral("还原")));
        QTest::mouseDClick(window.bar, Qt::LeftButton, {}, kPlace);
        QVERIFY(!window.isMaximized());
        window.keepFlags(~uint(Qt::WindowMaximizeButtonHint));
        window.show();
        QTest::mouseDClick(window.bar, Qt::LeftButton, {}, kPlace);
        QVERIFY(!window.isMaximized());
    }

    void dragMovesTheWindow()
    {
        Window window;
        window.move(100, 100);
        window.show();
        window.drag({1, 1});
        QCOMPARE(window.pos(), QPoint(100, 100));
        window.drag({30, 50});
        QCOMPARE(window.pos(), QPoint(130, 150));
    }

    void titleAndIconFollowTheWindowUntilSet()
    {
        Window window;
        window.setWindowTitle(QStringLiteral("窗口"));
        window.setWindowIcon(window.grab());
        QCOMPARE(window.bar->title(), QStringLiteral("窗口"));
        QVERIFY(!window.bar->icon().isNull());
        window.bar->setTitle(QString());
        window.bar->setIcon(QIcon(QString()));
        QCOMPARE(window.bar->title(), QString());
        QVERIFY(window.bar->icon().isNull());
    }
};

THEMED_TEST_MAIN(TestMTitlebar)
#include "tst_mtitlebar.moc"
