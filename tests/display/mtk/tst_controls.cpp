// SPDX-License-Identifier: Apache-2.0
// The small controls: switch, spinner, progress bar, buttons, panels.
#include "themedtest.h"

#include "mtk/mframe.h"
#include "mtk/mprogressbar.h"
#include "mtk/mspinner.h"
#include "mtk/mstyle.h"
#include "mtk/msuggestbutton.h"
#include "mtk/mswitchbutton.h"

#include <QAccessible>
#include <QLineEdit>

#include <cmath>

using namespace Mtk::Widget;
using Mtk::Gui::MPalette;

namespace {

// Relative luminance and contrast as the web's accessibility guidelines define them.
double channel(double value)
{
    return value <= 0.03928 ? value / 12.92 : std::pow((value + 0.055) / 1.055, 2.4);
}

double luminance(const QColor &color)
{
    return 0.2126 * channel(color.redF()) + 0.7152 * channel(color.greenF()) +
           0.0722 * channel(color.blueF());
}

double contrast(const QColor &a, const QColor &b)
{
    const double lighter = qMax(luminance(a), luminance(b));
    const double darker = qMin(luminance(a), luminance(b));
    return (lighter + 0.05) / (darker + 0.05);
}

QImage pictureOf(QWidget &widget)
{
    return widget.grab().toImage().convertToFormat(QImage::Format_RGB32);
}

int accentColumns(QWidget &bar)
{
    const QImage picture = pictureOf(bar);
    const QColor accent = QApplication::palette().color(QPalette::Highlight);
    int count = 0;
    for (int x = 0; x < picture.width(); ++x)
        count += picture.pixelColor(x, picture.height() / 2) == accent ? 1 : 0;
    return count;
}

} // namespace

class TestControls : public QObject
{
    Q_OBJECT

private Q_SLOTS:
    void switchTogglesByKeyAndClick();
    void switchTellsReaders();
    void spinnerTurnsOnlyWhileVisible();
    void progressFillsInProportion_data();
    void progressFillsInProportion();
    void buttonTextIsReadable_data();
    void buttonTextIsReadable();
    void buttonTellsReaders();
    void panelCorners_data();
    void panelCorners();
    void separatorIsOneLine_data();
    void separatorIsOneLine();
};

void TestControls::switchTogglesByKeyAndClick()
{
    MSwitchButton toggle;
    const QSignalSpy toggled(&toggle, &MSwitchButton::toggled);
    toggle.show();
    QTest::keyClick(&toggle, Qt::Key_Space);
    QVERIFY(toggle.isChecked());
    QTest::mouseClick(&toggle, Qt::LeftButton);
    QVERIFY(!toggle.isChecked());
    toggle.setEnabled(false);
    QTest::mouseClick(&toggle, Qt::LeftButton);
    QCOMPARE(toggled.count(), 2);

    // The knob comes to rest where the state is.
    MSwitchButton still;
    still.setEnabled(false);
    QTRY_COMPARE(pictureOf(toggle), pictureOf(still));
}

void TestControls::switchTellsReaders()
{
    MSwitchButton toggle;
    toggle.setAccessibleName(QStringLiteral("自动登录"));
    toggle.setChecked(true);
    QAccessibleInterface *face = QAccessible::queryAccessibleInterface(&toggle);
    QCOMPARE(face->role(), QAccessible::CheckBox);
    QCOMPARE(face->text(QAccessible::Name), QStringLiteral("自动登录"));
    QVERIFY(face->state().checkable);
    QVERIFY(face->state().checked);
    QVERIFY(face->actionInterface());
    toggle.show();
    face->actionInterface()->doAction(QAccessibleActionInterface::toggleAction());
    QTRY_VERIFY(!toggle.isChecked());
}

void TestControls::spinnerTurnsOnlyWhileVisible()
{
    QWidget page;
    auto *spinner = new MSpinner(&page);
    spinner->setGeometry(100, 0, 20, 20);
    spinner->start();
    QVERIFY(!spinner->isPlaying());
    page.show();
    QVERIFY(spinner->isPlaying());
    const QImage first = pictureOf(*spinner);
    QTRY_VERIFY(pictureOf(*spinner) != first);
    page.hide();
    QVERIFY(!spinner->isPlaying());
    page.show();
    QVERIFY(spinner->isPlaying());
    spinner->stop();
    QVERIFY(!spinner->isPlaying());
    QVERIFY(!QAccessible::queryAccessibleInterface(spinner)->text(QAccessible::Name).isEmpty());
}

void TestControls::progressFillsInProportion_data()
{
    QTest::addColumn<int>("value");
    QTest::addColumn<int>("columns");
    QTest::newRow("nothing") << 0 << 0;
    QTest::newRow("a dot at least") << 1 << 8;
    QTest::newRow("fifth") << 20 << 64;
    QTest::newRow("all") << 100 << 320;
}

void TestControls::progressFillsInProportion()
{
    QFETCH(int, value);
    QFETCH(int, columns);
    MProgressBar bar;
    bar.setFixedSize(320, 8);
    bar.setTextVisible(false);
    bar.setRange(0, 100);
    bar.setValue(value);
    // The round ends are mixed with the ground at a pixel or two.
    QVERIFY(qAbs(accentColumns(bar) - columns) <= 2);
}

void TestControls::buttonTextIsReadable_data()
{
    QTest::addColumn<bool>("suggested");
    QTest::addColumn<bool>("down");
    QTest::addColumn<bool>("hovered");
    for (const bool suggested : {false, true}) {
        const char *kind = suggested ? "suggested" : "plain";
        QTest::addRow("%s at rest", kind) << suggested << false << false;
        QTest::addRow("%s hovered", kind) << suggested << false << true;
        QTest::addRow("%s pressed", kind) << suggested << true << true;
    }
}

void TestControls::buttonTextIsReadable()
{
    QFETCH(bool, suggested);
    QFETCH(bool, down);
    QFETCH(bool, hovered);
    MSuggestButton primary;
    QPushButton plain;
    QPushButton &button = suggested ? primary : plain;
    button.resize(170, 36);
    const QImage ground = pictureOf(button);
    button.setText(QStringLiteral("██"));
    button.setDown(down);
    button.setAttribute(Qt::WA_UnderMouse, hovered);
    const QImage picture = pictureOf(button);
    QVERIFY(contrast(picture.pixelColor(20, 18), picture.pixelColor(80, 18)) >= 4.5);
    QCOMPARE(picture.pixelColor(20, 18) == ground.pixelColor(20, 18), !down && !hovered);
}

void TestControls::buttonTellsReaders()
{
    MSuggestButton button(QStringLiteral("下一步(&N)"));
    QAccessibleInterface *face = QAccessible::queryAccessibleInterface(&button);
    QCOMPARE(face->role(), QAccessible::Button);
    QCOMPARE(face->text(QAccessible::Name), QStringLiteral("下一步(N)"));
    QCOMPARE(face->actionInterface()->actionNames().first(), QAccessibleActionInterface::pressAction());
    QCOMPARE(face->actionInterface()->keyBindingsForAction(QAccessibleActionInterface::pressAction()),
             QStringList{QStringLiteral("Alt+N")});
    button.setAccessibleName(QStringLiteral("继续"));
    QCOMPARE(face->text(QAccessible::Name), QStringLiteral("继续"));
}

void TestControls::panelCorners_data()
{
    QTest::addColumn<int>("radius"); // -1 through setFrameRounded
    QTest::addColumn<bool>("rounded");
    QTest::newRow("square") << 0 << false;
    QTest::newRow("radius") << 8 << true;
    QTest::newRow("rounded") << -1 << true;
}

void TestControls::panelCorners()
{
    QFETCH(int, radius);
    QFETCH(bool, rounded);
    QWidget page;
    auto *panel = new MFrame(&page);
    panel->resize(360, 62);
    panel->setBackgroundRole(MPalette::FrameShadowBorder);
    if (radius < 0)
        panel->setFrameRounded(true);
    else
        MStyle::setFrameRadius(panel, radius);
    const QImage picture = pictureOf(page);
    const QColor ground = page.palette().color(QPalette::Window);
    QVERIFY(picture.pixelColor(180, 31) != ground);
    QCOMPARE(picture.pixelColor(0, 0) == ground, rounded);
}

void TestControls::separatorIsOneLine_data()
{
    QTest::addColumn<int>("width");
    QTest::newRow("one wide") << 1;
    QTest::newRow("two wide") << 2;
}

void TestControls::separatorIsOneLine()
{
    QFETCH(int, width);
    MFrame line;
    line.setFrameShape(QFrame::VLine);
    line.setFixedSize(width, 28);
    const QImage picture = pictureOf(line);
    const QColor ground = line.palette().color(QPalette::Window);
    int columns = 0;
    for (int x = 0; x < width; ++x)
        columns += picture.pixelColor(x, 0) != ground && picture.pixelColor(x, 27) != ground ? 1 : 0;
    QCOMPARE(columns, 1);
}

THEMED_TEST_MAIN(TestControls)
#include "tst_controls.moc"
