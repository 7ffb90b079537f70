// SPDX-License-Identifier: Apache-2.0
#include "themedtest.h"

#include "mtk/mblureffectwidget.h"
#include "mtk/mtitlebar.h"

#include <QAbstractButton>
#include <QVBoxLayout>

using namespace Mtk::Widget;

namespace {

// A window as programs build theirs.
struct Window : MBlurEffectWidget
{
    MTitlebar *bar = new MTitlebar;

    Window()
    {
        auto *column = new QVBoxLayout(this);
        column->setContentsMargins(0, 0, 0, 0);
        column->addWidget(bar);
        column->addStretch();
        resize(380, 237);
    }

    QStringList shownButtons() const
    {
        QStringList names;
        for (const QAbstractButton *button : findChildren<QAbstractButton *>()) {
            if (button->isVisible())
                names << button->accessibleName();
        }
        return names;
    }

    QAbstractButton *button(const QString &name) const
    {
        for (QAbstractButton *candidate : findChildren<QAbstractButton *>()) {
            if (candidate->accessibleName() == name)
                return candidate;
        }
        return nullptr;
    }
};

void drag(QWidget *widget, const QPoint &from, const QPoint &by)
{
    QTest::mousePress(widget, Qt::LeftButton, {}, from);
    const QPoint to = widget->mapToGlobal(from + by);
    QMouseEvent move(QEvent::MouseMove, from + by, to, Qt::NoButton, Qt::LeftButton, {});
    QApplication::sendEvent(widget, &move);
    QTest::mouseRelease(widget, Qt::LeftButton, {}, from);
}

} // namespace

class TestMTitlebar : public QObject
{
    Q_OBJECT

private Q_SLOTS:
    void buttonsFollowTheFlags_data();
    void buttonsFollowTheFlags();
    void windowStaysFramelessWhenHintsAreTaken();
    void closeAsksTheWindow();
    void doubleClick_data();
    void doubleClick();
    void dragMovesTheWindow();
    void titleAndIconFollowTheWindowUntilSet();
};

void TestMTitlebar::buttonsFollowTheFlags_data()
{
    QTest::addColumn<uint>("mask");
    QTest::addColumn<bool>("fixed");
    QTest::addColumn<QStringList>("names");
    const QString minimise = QStringLiteral("最小化");
    const QString maximise = QStringLiteral("最大化");
    const QString close = QStringLiteral("关闭");
    QTest::newRow("all") << 0xffffffffU << false << QStringList{minimise, maximise, close};
    QTest::newRow("fixed size") << 0xffffffffU << true << QStringList{minimise, close};
    QTest::newRow("close only") << 0xffff3fffU << true << QStringList{close};
    QTest::newRow("none") << 0xf7ff3fffU << true << QStringList{};
}

void TestMTitlebar::buttonsFollowTheFlags()
{
    QFETCH(uint, mask);
    QFETCH(bool, fixed);
    QFETCH(QStringList, names);
    Window window;
    window.bar->setMenuVisible(false);
    if (fixed)
        window.setFixedSize(380, 237);
    window.setWindowFlags(window.windowFlags() & Qt::WindowFlags(QFlag(mask)));
    window.show();
    QCOMPARE(window.shownButtons(), names);

    // Flags that change while the window is open count as well.
    window.setWindowFlags(window.windowFlags() & ~Qt::WindowCloseButtonHint);
    window.show();
    QVERIFY(!window.shownButtons().contains(QStringLiteral("关闭")));
}

void TestMTitlebar::windowStaysFramelessWhenHintsAreTaken()
{
    Window window;
    window.setWindowFlags(window.windowFlags() & Qt::WindowFlags(QFlag(0xf7ff3fffU)));
    QVERIFY(window.isWindow());
    QVERIFY(window.windowFlags() & Qt::FramelessWindowHint);
}

void TestMTitlebar::closeAsksTheWindow()
{
    struct Refusing : Window
    {
        int asked = 0;
        void closeEvent(QCloseEvent *event) override
        {
            ++asked;
            event->ignore();
        }
    } window;
    window.show();
    window.button(QStringLiteral("关闭"))->click();
    QCOMPARE(window.asked, 1);
    QVERIFY(window.isVisible());
}

void TestMTitlebar::doubleClick_data()
{
    QTest::addColumn<bool>("granted");
    QTest::newRow("granted") << true;
    QTest::newRow("not granted") << false;
}

void TestMTitlebar::doubleClick()
{
    QFETCH(bool, granted);
    Window window;
    if (!granted)
        window.setWindowFlags(window.windowFlags() & ~Qt::WindowMaximizeButtonHint);
    window.show();
    QTest::mouseDClick(window.bar, Qt::LeftButton, {}, {40, 20});
    QCOMPARE(window.isMaximized(), granted);
    if (!granted)
        return;
    QVERIFY(window.button(QStringLiteral("还原")));
    QTest::mouseDClick(window.bar, Qt::LeftButton, {}, {40, 20});
    QVERIFY(!window.isMaximized());
}

void TestMTitlebar::dragMovesTheWindow()
{
    Window window;
    window.move(100, 100);
    window.show();
    drag(window.bar, {40, 20}, {1, 1});
    QCOMPARE(window.pos(), QPoint(100, 100));
    drag(window.bar, {40, 20}, {30, 50});
    QCOMPARE(window.pos(), QPoint(130, 150));
}

void TestMTitlebar::titleAndIconFollowTheWindowUntilSet()
{
    Window window;
    window.setWindowTitle(QStringLiteral("窗口"));
    QPixmap pixmap(16, 16);
    pixmap.fill(Qt::red);
    window.setWindowIcon(pixmap);
    QCOMPARE(window.bar->title(), QStringLiteral("窗口"));
    QVERIFY(!window.bar->icon().isNull());
    window.bar->setTitle(QString());
    window.bar->setIcon(QIcon(QString()));
    QCOMPARE(window.bar->title(), QString());
    QVERIFY(window.bar->icon().isNull());
}

THEMED_TEST_MAIN(TestMTitlebar)
#include "tst_mtitlebar.moc"
