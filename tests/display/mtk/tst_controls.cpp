// SPDX-License-Identifier: Apache-2.0
// The small controls: switch, spinner, label, buttons.
#include "themedtest.h"

#include "mtk/mlabel.h"
#include "mtk/mspinner.h"
#include "mtk/msuggestbutton.h"
#include "mtk/mswitchbutton.h"
#include "mtk/style/theme.h"

#include <QAccessible>
#include <QTextDocumentFragment>
#include <QToolTip>

#include <cmath>

using namespace Mtk::Widget;

namespace {

// As the web's accessibility guidelines define it.
double contrast(const QColor &a, const QColor &b)
{
    const auto luminance = [](const QColor &color) {
        const auto linear = [](qreal part) {
            return part <= 0.04045 ? part / 12.92 : std::pow((part + 0.055) / 1.055, 2.4);
        };
        return 0.2126 * linear(color.redF()) + 0.7152 * linear(color.greenF()) +
               0.0722 * linear(color.blueF()) + 0.05;
    };
    return qMax(luminance(a), luminance(b)) / qMin(luminance(a), luminance(b));
}

} // namespace

class TestControls : public QObject
{
    Q_OBJECT

private Q_SLOTS:
    void switchTogglesByKeyAndClick()
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
        QTRY_COMPARE(imageOf(toggle), imageOf(still));
    }

    void switchTellsReaders()
    {
        MSwitchButton toggle;
        toggle.setAccessibleName(QStringLiteral("自动登录"));
        toggle.setChecked(true);
        QAccessibleInterface *face = QAccessible::queryAccessibleInterface(&toggle);
        QCOMPARE(face->role(), QAccessible::CheckBox);
        QCOMPARE(face->text(QAccessible::Name), QStringLiteral("自动登录"));
        QVERIFY(face->state().checkable && face->state().checked);
        toggle.show();
        face->actionInterface()->doAction(QAccessibleActionInterface::toggleAction());
        QTRY_VERIFY(!toggle.isChecked());
    }

    void spinnerTurnsOnlyWhileVisible()
    {
        QWidget page;
        auto *spinner = new MSpinner(&page);
        spinner->setGeometry(100, 0, 20, 20);
        spinner->start();
        QVERIFY(!spinner->isPlaying());
        page.show();
        const QImage first = imageOf(*spinner);
        QTRY_VERIFY(imageOf(*spinner) != first);
        page.hide();
        QVERIFY(!spinner->isPlaying());
        page.show();
        QVERIFY(spinner->isPlaying());
        spinner->stop();
        QVERIFY(!spinner->isPlaying());
        QVERIFY(!QAccessible::queryAccessibleInterface(spinner)->text(QAccessible::Name).isEmpty());
    }

    void themeHasContrast()
    {
        const Mtk::Theme t;
        for (const QColor &ground :
             {t.window, t.titlebar, t.surface, t.itemBackground, t.frameShadowBorder}) {
            for (const QColor &outline : {t.border, t.borderHover, t.switchOff, t.windowBorder})
                QVERIFY(contrast(outline, ground) >= 3);
            for (const QColor &text : {t.text, t.textMuted, t.accent})
                QVERIFY(contrast(text, ground) >= 4.5);
        }
        for (const QColor &ground : {t.control, t.controlHover})
            QVERIFY(contrast(t.alert, ground) >= 4.5);
        QVERIFY(contrast(t.alertPressed, t.controlPressed) >= 4.5 && contrast(t.onAccent, t.alert) >= 4.5);
        QVERIFY(contrast(t.placeholder, t.surface) >= 4.5 && contrast(t.placeholder, t.alertSurface) >= 4.5);
        QVERIFY(contrast(t.alert, t.alertSurface) >= 3 && contrast(t.onAccent, t.switchOff) >= 3);
    }

    // What is left out of the text is left out on the screen alone.
    void labelLeavesOutTheMiddle()
    {
        const QString address = QStringLiteral("<b>management.terminals.example.org:8443");
        MLabel label;
        MLabel shown;
        for (MLabel *each : {&label, &shown})
            each->setFixedSize(120, 36);
        label.setText(address);
        label.setElideMode(Qt::ElideMiddle);
        shown.setText(label.fontMetrics().elidedText(address, Qt::ElideMiddle, 120));
        QCOMPARE(imageOf(label), imageOf(shown));
        QCOMPARE(QAccessible::queryAccessibleInterface(&label)->text(QAccessible::Name), address);
        label.show();
        QHelpEvent hover(QEvent::ToolTip, QPoint(), label.mapToGlobal(QPoint(5, 5)));
        QApplication::sendEvent(&label, &hover);
        QCOMPARE(QTextDocumentFragment::fromHtml(QToolTip::text()).toPlainText(), address);
    }

    // At rest, under the mouse and pressed.
    void buttonTextIsReadable()
    {
        MSuggestButton suggested;
        QPushButton plain;
        for (QPushButton *button : {static_cast<QPushButton *>(&suggested), &plain}) {
            button->resize(170, 36);
            const QRgb ground = imageOf(*button).pixel(20, 18);
            button->setText(QStringLiteral("██"));
            for (int state = 0; state < 3; ++state) {
                button->setAttribute(Qt::WA_UnderMouse, state > 0);
                button->setDown(state > 1);
                const QImage image = imageOf(*button);
                QVERIFY(contrast(image.pixel(20, 18), image.pixel(80, 18)) >= 4.5);
                QCOMPARE(image.pixel(20, 18) != ground, state > 0);
            }
        }
    }

    void buttonTellsReaders()
    {
        MSuggestButton button(QStringLiteral("下一步(&N)"));
        QAccessibleInterface *face = QAccessible::queryAccessibleInterface(&button);
        const QString press = QAccessibleActionInterface::pressAction();
        QCOMPARE(face->role(), QAccessible::Button);
        QCOMPARE(face->text(QAccessible::Name), QStringLiteral("下一步(N)"));
        QCOMPARE(face->actionInterface()->actionNames().first(), press);
        QCOMPARE(face->actionInterface()->keyBindingsForAction(press), QStringList(QStringLiteral("Alt+N")));
        QFrame frame; // Qt's own would be taken for a window
        QCOMPARE(QAccessible::queryAccessibleInterface(&frame)->role(), QAccessible::Client);
        button.setAccessibleName(QStringLiteral("继续"));
        QCOMPARE(face->text(QAccessible::Name), QStringLiteral("继续"));
    }
};

THEMED_TEST_MAIN(TestControls)
#include "tst_controls.moc"
