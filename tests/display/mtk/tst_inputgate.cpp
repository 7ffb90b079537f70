// SPDX-License-Identifier: Apache-2.0
#include "themedtest.h"

#include "mtk/mdialog.h"
#include "mtk/mlineedit.h"
#include "mtk/msuggestbutton.h"

#include <QAccessible>
#include <QCheckBox>
#include <QKeyEvent>
#include <QLineEdit>
#include <QShortcut>
#include <QVBoxLayout>
#include <QWindow>

#include <qpa/qwindowsysteminterface.h>
#include <qtestspontaneevent.h>

using namespace Mtk::Widget;

namespace {

void press(QWidget *button)
{
    QAccessibleActionInterface *actions = QAccessible::queryAccessibleInterface(button)->actionInterface();
    actions->doAction(actions->actionNames().first());
}

void setBusy(bool busy)
{
    qApp->setProperty("busy", busy);
}

const QString kOpen = QStringLiteral("open");

// Longer than a press is shown (100 ms).
constexpr int kPressMs = 150;

// As the platform gives it to whichever window has the focus.
void sendKey(Qt::Key key, QEvent::Type type, bool isRepeat, ulong time)
{
    QKeyEvent event(type, key, Qt::NoModifier, 36, 0, 0,
                    key == Qt::Key_Space ? QStringLiteral(" ") : QString(), isRepeat);
    event.setTimestamp(time);
    QSpontaneKeyEvent::setSpontaneous(&event);
    qApp->notify(qApp->focusWindow(), &event);
}

} // namespace

// What assistive technology does to widgets that mouse and keyboard cannot reach.
class TestInputGate : public QObject
{
    Q_OBJECT

private Q_SLOTS:
    void init()
    {
        m_window = std::make_unique<QWidget>();
        m_page = new QWidget(m_window.get());
        m_button = new MSuggestButton(QStringLiteral("下一步"), m_page);
        m_check = new QCheckBox(QStringLiteral("记住"), m_page);
        m_edit = new MLineEdit(m_page);
        auto *layout = new QVBoxLayout(m_page);
        layout->addWidget(m_edit);
        layout->addWidget(m_check);
        layout->addWidget(m_button);
        (new QVBoxLayout(m_window.get()))->addWidget(m_page);
        m_window->show();
        QVERIFY(QTest::qWaitForWindowExposed(m_window.get()));
    }

    // A situation is what there is before a press, and what comes after it, one by one.
    void presses_data()
    {
        QTest::addColumn<QString>("situation");
        for (const char *situation : {"open", "disabled", "hidden", "dialog", "dialog,open", "open,dialog",
                                      "busy", "busy,open", "open,busy,open"})
            QTest::newRow(situation) << QString::fromLatin1(situation);
    }

    void presses()
    {
        QFETCH(const QString, situation);
        const int clicks = situation == kOpen ? 1 : 0;
        const QSignalSpy clicked(m_button, &QPushButton::clicked);
        const QSignalSpy toggled(m_check, &QCheckBox::toggled);
        pressIn(situation, [this] {
            press(m_button);
            press(m_check);
        });
        QCOMPARE(clicked.count(), clicks);
        QCOMPARE(toggled.count(), clicks);
        QVERIFY(!m_button->isDown());

        // Nothing sticks.
        pressIn(kOpen, [this] { press(m_button); });
        QCOMPARE(clicked.count(), clicks + 1);

        // A shortcut or a program shows a press for a moment, too. It can begin behind a dialog.
        if (situation == QLatin1String("dialog,open"))
            return;
        pressIn(situation, [this] { m_button->animateClick(); });
        QCOMPARE(clicked.count(), 2 * clicks + 1);
        pressIn(kOpen, [this] { m_button->animateClick(); });
        QCOMPARE(clicked.count(), 2 * clicks + 2);
    }

    void busyKeepsInputAway()
    {
        const QSignalSpy clicked(m_button, &QPushButton::clicked);
        const QSignalSpy entered(m_edit->lineEdit(), &QLineEdit::returnPressed);
        const QShortcut shortcut(QKeySequence(Qt::CTRL + Qt::Key_N), m_button, SLOT(click()));
        QVERIFY(activate(*m_window));
        const auto useAll = [this] {
            QTest::mouseClick(m_button, Qt::LeftButton);
            QTest::keyClick(m_button, Qt::Key_Space);
            QTest::keyClick(m_edit->lineEdit(), Qt::Key_Return);
            QTest::keyClick(m_window->windowHandle(), Qt::Key_N, Qt::ControlModifier);
        };
        setBusy(true);
        useAll();
        setBusy(false);
        QCOMPARE(clicked.count() + entered.count(), 0);
        useAll();
        QCOMPARE(clicked.count() + entered.count(), 4);

        // A press under way is forgotten.
        QTest::mousePress(m_button, Qt::LeftButton);
        setBusy(true);
        setBusy(false);
        QTest::mouseMove(m_button, m_button->rect().center() + QPoint(1, 0));
        QTest::mouseRelease(m_button, Qt::LeftButton);
        QCOMPARE(clicked.count() + entered.count(), 4);
    }

    // Events of one key with their times in ms: + press, * press told as a repeat, - release. Between them a
    // call begins and ends, the focus goes to another program and back, or a dialog opens.
    void heldKeys_data()
    {
        QTest::addColumn<QString>("events");
        QTest::addColumn<int>("clicks");
        QTest::newRow("two presses") << "+1 -20 +30 -40" << 2;
        QTest::newRow("known repeats") << "+1 *600 *640 -650" << 1;
        QTest::newRow("repeats like presses") << "+1 +600 +640 -650 +660" << 2;
        QTest::newRow("repeats like releases and presses") << "+1 -600 +600 -640 +640 -650 +651" << 2;
        QTest::newRow("released during a call") << "+1 call -20 end +30" << 2;
        QTest::newRow("held during a call") << "+1 call +600 end +640" << 1;
        QTest::newRow("released elsewhere") << "+1 away +30" << 2;
        QTest::newRow("released unheard") << "+1 +5000" << 2;
        QTest::newRow("held while a dialog opens") << "+1 dialog *600 *640" << 1;
        QTest::newRow("Escape held while a dialog opens") << "+1 dialog *600 *640" << 0;
        QTest::newRow("released while a dialog opens") << "+1 dialog +30" << 2;
        QTest::newRow("pressed again in the dialog") << "+1 dialog *600 -650 +660" << 2;
    }

    void heldKeys()
    {
        QFETCH(const QString, events);
        MDialog dialog(m_window.get());
        dialog.addButton(QStringLiteral("确定"));
        const auto key =
            QByteArray(QTest::currentDataTag()).startsWith("Escape") ? Qt::Key_Escape : Qt::Key_Return;
        const QSignalSpy closed(&dialog, &MDialog::closed);
        const QSignalSpy clicked(m_button, &QPushButton::clicked);
        m_button->setAutoDefault(true);
        m_button->setFocus();
        QVERIFY(activate(*m_window));
        for (const QString &each : events.split(QLatin1Char(' '))) {
            if (each == QLatin1String("call") || each == QLatin1String("end"))
                setBusy(each == QLatin1String("call"));
            else if (each == QLatin1String("dialog"))
                dialog.show();
            else if (each == QLatin1String("away"))
                QWindowSystemInterface::handleWindowActivated(nullptr);
            else
                sendKey(key, each.startsWith(QLatin1Char('-')) ? QEvent::KeyRelease : QEvent::KeyPress,
                        each.startsWith(QLatin1Char('*')), each.midRef(1).toULong());
            const QWidget *front = dialog.isVisible() ? &dialog : m_window.get();
            QWindowSystemInterface::handleWindowActivated(front->windowHandle());
            QCoreApplication::processEvents();
            QTRY_COMPARE(qApp->focusWindow(), front->windowHandle());
        }
        QTEST(clicked.count() + closed.count(), "clicks");
    }

    void spaceRepeatsInText()
    {
        m_edit->setFocus();
        QVERIFY(activate(*m_window));
        for (const ulong time : {1, 600, 640})
            sendKey(Qt::Key_Space, QEvent::KeyPress, false, time);
        QCOMPARE(m_edit->text(), QStringLiteral("   "));
    }

    void texts()
    {
        QTest::addColumn<QString>("situation");
        for (const char *situation : {"hidden", "dialog", "busy", "open"}) {
            m_edit->setText(QStringLiteral("旧"));
            const QSignalSpy changed(m_edit, &MLineEdit::textChanged);
            pressIn(QString::fromLatin1(situation), [this] {
                QAccessible::queryAccessibleInterface(m_edit->lineEdit())
                    ->setText(QAccessible::Value, QStringLiteral("新"));
            });
            const bool isOpen = kOpen == QLatin1String(situation);
            QCOMPARE(m_edit->text(), isOpen ? QStringLiteral("新") : QStringLiteral("旧"));
            QCOMPARE(m_edit->lineEdit()->text(), m_edit->text());
            QCOMPARE(changed.count(), isOpen ? 1 : 0);
            pressIn(QString::fromLatin1(situation), [this] { m_edit->setText(QStringLiteral("程序")); });
            QCOMPARE(m_edit->text(), QStringLiteral("程序"));
        }
    }

    void statesFollow()
    {
        const auto isDisabled = [this] {
            return QAccessible::queryAccessibleInterface(m_button)->state().disabled;
        };
        QVERIFY(!isDisabled());
        {
            MDialog dialog(m_window.get());
            dialog.addButton(QStringLiteral("确定"));
            const QSignalSpy pressed(&dialog, &MDialog::buttonClicked);
            dialog.show();
            QVERIFY(isDisabled());
            // The dialog itself is in reach.
            press(dialog.findChild<QPushButton *>());
            QTRY_COMPARE(pressed.count(), 1);
        }
        QVERIFY(!isDisabled());
        setBusy(true);
        QVERIFY(isDisabled());
        setBusy(false);
        QVERIFY(!isDisabled());
    }

private:
    void pressIn(const QString &situation, const std::function<void()> &way)
    {
        MDialog dialog(m_window.get());
        const auto change = [this, &dialog](const QString &step) {
            m_page->setEnabled(step != QLatin1String("disabled"));
            m_page->setVisible(step != QLatin1String("hidden"));
            dialog.setVisible(step == QLatin1String("dialog"));
            setBusy(step == QLatin1String("busy"));
        };
        QStringList steps = situation.split(QLatin1Char(','));
        change(steps.takeFirst());
        way();
        for (const QString &step : qAsConst(steps))
            change(step);
        QTest::qWait(kPressMs);
        change(kOpen);
    }

    std::unique_ptr<QWidget> m_window;
    QWidget *m_page = nullptr;
    QPushButton *m_button = nullptr;
    QCheckBox *m_check = nullptr;
    MLineEdit *m_edit = nullptr;
};

THEMED_TEST_MAIN(TestInputGate)
#include "tst_inputgate.moc"
