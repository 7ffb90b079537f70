// SPDX-License-Identifier: Apache-2.0
#include "themedtest.h"

#include "mtk/marrowrectangle.h"

#include <QBitmap>
#include <QLabel>
#include <QScreen>

using namespace Mtk::Widget;

class TestMArrowRectangle : public QObject
{
    Q_OBJECT

private Q_SLOTS:
    void tipTouchesThePlace_data()
    {
        QTest::addColumn<int>("direction");
        QTest::addColumn<QPoint>("tip");
        const QRect screen = QGuiApplication::primaryScreen()->availableGeometry();
        QTest::newRow("top") << int(MArrowRectangle::ArrowTop) << screen.center();
        QTest::newRow("top, at the right edge")
            << int(MArrowRectangle::ArrowTop) << QPoint(screen.right() - 30, screen.center().y());
        QTest::newRow("bottom") << int(MArrowRectangle::ArrowBottom) << screen.center();
        QTest::newRow("left") << int(MArrowRectangle::ArrowLeft) << screen.center();
        QTest::newRow("right") << int(MArrowRectangle::ArrowRight) << screen.center();
    }

    void tipTouchesThePlace()
    {
        QFETCH(int, direction);
        QFETCH(QPoint, tip);
        MArrowRectangle popup{MArrowRectangle::ArrowDirection(direction)};
        popup.setContent(new QLabel(QStringLiteral("帐号不能为空，请输入管理员帐号")));
        popup.setAttribute(Qt::WA_TranslucentBackground); // so that the image tells inside from outside
        popup.show(tip.x(), tip.y());

        QVERIFY(popup.screen()->availableGeometry().contains(popup.geometry()));
        const QImage image = popup.grab().toImage();
        const QRegion drawn(QBitmap::fromImage(image.createAlphaMask()));
        QVERIFY(drawn.intersects(QRect(popup.mapFromGlobal(tip) - QPoint(2, 2), QSize(5, 5))));
        QCOMPARE(qAlpha(image.pixel(0, 0)), 0);
    }

    void leavesFocusAndGoesWithItsWindow()
    {
        QWidget window;
        QVERIFY(activate(window));
        MArrowRectangle popup(MArrowRectangle::ArrowTop, &window);
        popup.setContent(new QLabel(QStringLiteral("x")));
        popup.show(50, 50);
        QVERIFY(popup.isVisible());
        QVERIFY(window.isActiveWindow());
        window.hide();
        QVERIFY(!popup.isVisible());
    }
};

THEMED_TEST_MAIN(TestMArrowRectangle)
#include "tst_marrowrectangle.moc"
