// SPDX-License-Identifier: Apache-2.0
#include "themedtest.h"

#include "mtk/mdialog.h"
#include "mtk/mlineedit.h"
#include "mtk/msuggestbutton.h"

#include <QAccessible>
#include <QCheckBox>
#include <QLineEdit>
#include <QVBoxLayout>

using Mtk::Widget::MDialog;
using Mtk::Widget::MLineEdit;
using Mtk::Widget::MSuggestButton;

namespace {

// What happens around a press.
enum class Situation {
    Open,
    Disabled,
    PageHidden,
    BehindDialog,
    BehindDialogThatCloses,
    DialogOpensAfterwards,
    Busy,
    BusyThatEnds,
    BusyAfterwards,
};

void press(QWidget *button)
{
    QAccessibleActionInterface *actions = QAccessible::queryAccessibleInterface(button)->actionInterface();
    actions->doAction(actions->actionNames().first());
}

void setBusy(bool busy)
{
    qApp->setProperty("busy", busy);
}

// Longer than a press is shown (100 ms).
constexpr int kPressMs = 150;

} // namespace

Q_DECLARE_METATYPE(Situation)

// What assistive technology does to widgets that mouse and keyboard cannot reach.
class TestInputGate : public QObject
{
    Q_OBJECT

private Q_SLOTS:
    void init();
    void presses_data();
    void presses();
    void busyKeepsInputAway();
    void busyForgetsAPressUnderWay();
    void dialogIsInReach();
    void texts_data();
    void texts();
    void statesFollow();

private:
    void pressIn(Situation situation, const std::function<void()> &way);

    std::unique_ptr<QWidget> m_window;
    QWidget *m_page = nullptr;
    QPushButton *m_button = nullptr;
    QCheckBox *m_check = nullptr;
    MLineEdit *m_edit = nullptr;
};

void TestInputGate::init()
{
    m_window = std::make_unique<QWidget>();
    m_page = new QWidget(m_window.get());
    m_button = new MSuggestButton(QStringLiteral("下一步"), m_page);
    m_check = new QCheckBox(QStringLiteral("记住"), m_page);
    m_edit = new MLineEdit(m_page);
    auto *layout = new QVBoxLayout(m_page);
    for (QWidget *widget :
         {static_cast<QWidget *>(m_edit), static_cast<QWidget *>(m_check), static_cast<QWidget *>(m_button)})
        layout->addWidget(widget);
    (new QVBoxLayout(m_window.get()))->addWidget(m_page);
    m_window->show();
    QVERIFY(QTest::qWaitForWindowExposed(m_window.get()));
}

void TestInputGate::pressIn(Situation situation, const std::function<void()> &way)
{
    MDialog dialog(m_window.get());
    const bool isBehind =
        situation == Situation::BehindDialog || situation == Situation::BehindDialogThatCloses;
    const bool isBusy = situation == Situation::Busy || situation == Situation::BusyThatEnds;
    m_button->setEnabled(situation != Situation::Disabled);
    m_check->setEnabled(situation != Situation::Disabled);
    m_page->setVisible(situation != Situation::PageHidden);
    dialog.setVisible(isBehind);
    if (isBusy)
        setBusy(true);
    way();
    if (situation == Situation::DialogOpensAfterwards)
        dialog.show();
    if (situation == Situation::BehindDialogThatCloses)
        dialog.close();
    if (situation == Situation::BusyAfterwards)
        setBusy(true);
    if (situation == Situation::BusyThatEnds || situation == Situation::BusyAfterwards)
        setBusy(false);
    QTest::qWait(kPressMs);
    if (situation == Situation::Busy)
        setBusy(false);
}

void TestInputGate::presses_data()
{
    QTest::addColumn<Situation>("situation");
    QTest::addColumn<int>("clicks");
    QTest::newRow("open") << Situation::Open << 1;
    QTest::newRow("disabled") << Situation::Disabled << 0;
    QTest::newRow("page hidden") << Situation::PageHidden << 0;
    QTest::newRow("behind a dialog") << Situation::BehindDialog << 0;
    QTest::newRow("behind a dialog that closes") << Situation::BehindDialogThatCloses << 0;
    QTest::newRow("dialog opens afterwards") << Situation::DialogOpensAfterwards << 0;
    QTest::newRow("busy") << Situation::Busy << 0;
    QTest::newRow("busy that ends") << Situation::BusyThatEnds << 0;
    QTest::newRow("busy afterwards") << Situation::BusyAfterwards << 0;
}

void TestInputGate::presses()
{
    QFETCH(const Situation, situation);
    QFETCH(const int, clicks);
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
    pressIn(Situation::Open, [this] { press(m_button); });
    QCOMPARE(clicked.count(), clicks + 1);

    // A shortcut or a program shows a press for a moment, too. It can begin behind a dialog.
    if (situation == Situation::BehindDialogThatCloses)
        return;
    pressIn(situation, [this] { m_button->animateClick(); });
    QCOMPARE(clicked.count(), 2 * clicks + 1);
    pressIn(Situation::Open, [this] { m_button->animateClick(); });
    QCOMPARE(clicked.count(), 2 * clicks + 2);
}

void TestInputGate::busyKeepsInputAway()
{
    const QSignalSpy clicked(m_button, &QPushButton::clicked);
    const QSignalSpy entered(m_edit->lineEdit(), &QLineEdit::returnPressed);
    const auto useAll = [this] {
        QTest::mouseClick(m_button, Qt::LeftButton);
        QTest::keyClick(m_button, Qt::Key_Space);
        QTest::keyClick(m_edit->lineEdit(), Qt::Key_Return);
    };
    setBusy(true);
    useAll();
    setBusy(false);
    QCOMPARE(clicked.count() + entered.count(), 0);
    useAll();
    QCOMPARE(clicked.count() + entered.count(), 3);
}

void TestInputGate::busyForgetsAPressUnderWay()
{
    const QSignalSpy clicked(m_button, &QPushButton::clicked);
    QTest::mousePress(m_button, Qt::LeftButton);
    setBusy(true);
    setBusy(false);
    QTest::mouseMove(m_button, m_button->rect().center() + QPoint(1, 0));
    QTest::mouseRelease(m_button, Qt::LeftButton);
    QCOMPARE(clicked.count(), 0);
}

void TestInputGate::dialogIsInReach()
{
    MDialog dialog(m_window.get());
    dialog.addButton(QStringLiteral("确定"));
    const QSignalSpy pressed(&dialog, &MDialog::buttonClicked);
    dialog.show();
    press(dialog.findChild<QPushButton *>());
    QTRY_COMPARE(pressed.count(), 1);
}

void TestInputGate::texts_data()
{
    QTest::addColumn<Situation>("situation");
    QTest::addColumn<QString>("text");
    QTest::newRow("open") << Situation::Open << QStringLiteral("新");
    QTest::newRow("page hidden") << Situation::PageHidden << QStringLiteral("旧");
    QTest::newRow("behind a dialog") << Situation::BehindDialog << QStringLiteral("旧");
    QTest::newRow("busy") << Situation::Busy << QStringLiteral("旧");
}

void TestInputGate::texts()
{
    QFETCH(const Situation, situation);
    m_edit->setText(QStringLiteral("旧"));
    const QSignalSpy changed(m_edit, &MLineEdit::textChanged);
    pressIn(situation, [this] {
        QAccessible::queryAccessibleInterface(m_edit->lineEdit())
            ->setText(QAccessible::Value, QStringLiteral("新"));
    });
    QTEST(m_edit->text(), "text");
    QTEST(m_edit->lineEdit()->text(), "text");
    QCOMPARE(changed.count(), situation == Situation::Open ? 1 : 0);
    pressIn(situation, [this] { m_edit->setText(QStringLiteral("程序")); });
    QCOMPARE(m_edit->text(), QStringLiteral("程序"));
}

void TestInputGate::statesFollow()
{
    const auto isDisabled = [this] {
        return QAccessible::queryAccessibleInterface(m_button)->state().disabled;
    };
    QVERIFY(!isDisabled());
    {
        MDialog dialog(m_window.get());
        dialog.show();
        QVERIFY(isDisabled());
    }
    QVERIFY(!isDisabled());
    setBusy(true);
    QVERIFY(isDisabled());
    setBusy(false);
    QVERIFY(!isDisabled());
}

THEMED_TEST_MAIN(TestInputGate)
#include "tst_inputgate.moc"
