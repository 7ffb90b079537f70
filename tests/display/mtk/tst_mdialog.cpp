// SPDX-License-Identifier: Apache-2.0
#include "themedtest.h"

#include "mtk/mdialog.h"
#include "mtk/mlineedit.h"
#include "mtk/mpasswordedit.h"

#include <QAccessible>
#include <QLabel>
#include <QLineEdit>
#include <QPushButton>
#include <QScreen>
#include <QScrollArea>
#include <QScrollBar>

#include <functional>

using namespace Mtk::Widget;

namespace {

using Act = std::function<void(MDialog &)>;

QPushButton *buttonOf(const QWidget &dialog, const QString &text)
{
    const QList<QPushButton *> buttons = dialog.findChildren<QPushButton *>();
    for (QPushButton *button : buttons) {
        if (button->text() == text)
            return button;
    }
    return nullptr;
}

QAbstractButton *closeButtonOf(const QWidget &dialog)
{
    const QList<QAbstractButton *> buttons = dialog.findChildren<QAbstractButton *>();
    for (QAbstractButton *button : buttons) {
        if (button->accessibleName() == QStringLiteral("关闭"))
            return button;
    }
    return nullptr;
}

void key(MDialog &dialog, Qt::Key which)
{
    QTest::keyClick(dialog.focusWidget() ? dialog.focusWidget() : &dialog, which);
}

// What the label's text takes when its lines are broken wherever they are full.
int leastHeight(const QLabel &label)
{
    const QFontMetrics metrics = label.fontMetrics();
    int lines = 0;
    for (const QString &paragraph : label.text().split(QLatin1Char('\n')))
        lines += qMax(1, (metrics.horizontalAdvance(paragraph) + label.width() - 1) / label.width());
    return lines * metrics.height();
}

// Runs the dialog, and `act` once it is up.
int runWith(MDialog &dialog, const Act &act)
{
    QTimer::singleShot(0, &dialog, [&dialog, &act] {
        QVERIFY(QTest::qWaitForWindowActive(&dialog));
        act(dialog);
    });
    return dialog.exec();
}

} // namespace

Q_DECLARE_METATYPE(Act)

class TestMDialog : public QObject
{
    Q_OBJECT

private Q_SLOTS:
    void endsInEachWay_data();
    void endsInEachWay();
    void enterAnswers_data();
    void enterAnswers();
    void contentsStandWhileTheAnswerIsHeard();
    void aSecondPressIsNotHeardWhileTheFirstIs();
    void destroyedWhileOpenTellsOfItsEnd();
    void opensAgain();
    void standsOverItsParentEachTime();
    void focusStartsInTheFirstField();
    void textIsNeverCut_data();
    void textIsNeverCut();
    void textHasABound_data();
    void textHasABound();
    void textIsPlain();
    void readersHearTheMessage();
};

void TestMDialog::endsInEachWay_data()
{
    QTest::addColumn<Act>("act");
    QTest::addColumn<int>("result");
    const auto click = [](const QString &text) {
        return Act([text](MDialog &d) { QTest::mouseClick(buttonOf(d, text), Qt::LeftButton); });
    };
    QTest::newRow("first button") << click(QStringLiteral("取消")) << 0;
    QTest::newRow("second button") << click(QStringLiteral("授权")) << 1;
    QTest::newRow("Escape") << Act([](MDialog &d) { key(d, Qt::Key_Escape); }) << -1;
    QTest::newRow("title bar") << Act([](MDialog &d) { closeButtonOf(d)->click(); }) << -1;
    QTest::newRow("close") << Act([](MDialog &d) { d.close(); }) << -1;
    QTest::newRow("hide") << Act([](MDialog &d) { d.hide(); }) << -1;
    QTest::newRow("accept") << Act([](MDialog &d) { d.accept(); }) << -1;
}

void TestMDialog::endsInEachWay()
{
    QFETCH(Act, act);
    QFETCH(int, result);
    MDialog dialog;
    dialog.addButton(QStringLiteral("取消"));
    dialog.addButton(QStringLiteral("授权"), false, MDialog::ButtonRecommended);
    const QSignalSpy closed(&dialog, &MDialog::closed);
    const QSignalSpy clicked(&dialog, &MDialog::buttonClicked);

    QCOMPARE(runWith(dialog, act), result);
    QCOMPARE(closed.count(), 1);
    QCOMPARE(clicked.count(), result < 0 ? 0 : 1);
    if (result >= 0)
        QCOMPARE(clicked.first().first().toInt(), result);
    QVERIFY(!dialog.isVisible());
}

void TestMDialog::enterAnswers_data()
{
    QTest::addColumn<QVector<int>>("types");
    QTest::addColumn<int>("isDefault"); // index, -1 none
    QTest::addColumn<int>("focus");     // index, -1 a field
    QTest::addColumn<int>("result");    // -1 nothing happens
    const int normal = MDialog::ButtonNormal;
    const int recommended = MDialog::ButtonRecommended;
    QTest::newRow("the only one") << QVector<int>{normal} << -1 << -1 << 0;
    QTest::newRow("the recommended one") << QVector<int>{normal, recommended} << -1 << -1 << 1;
    QTest::newRow("the default one first") << QVector<int>{normal, recommended} << 0 << -1 << 0;
    QTest::newRow("the focused one above all") << QVector<int>{normal, recommended} << -1 << 0 << 0;
    QTest::newRow("none of two equal ones") << QVector<int>{normal, normal} << -1 << -1 << -1;
}

void TestMDialog::enterAnswers()
{
    QFETCH(QVector<int>, types);
    QFETCH(int, isDefault);
    QFETCH(int, focus);
    QFETCH(int, result);
    MDialog dialog;
    auto *field = new MLineEdit;
    dialog.addContent(field);
    for (int i = 0; i < types.size(); ++i)
        dialog.addButton(QString::number(i), i == isDefault, MDialog::ButtonType(types.at(i)));

    const int answer = runWith(dialog, [&](MDialog &d) {
        if (focus >= 0)
            buttonOf(d, QString::number(focus))->setFocus();
        key(d, Qt::Key_Return);
        if (d.isVisible())
            d.reject();
    });
    QCOMPARE(answer, result);
}

void TestMDialog::contentsStandWhileTheAnswerIsHeard()
{
    MDialog dialog;
    auto *password = new MPasswordEdit;
    password->setText(QStringLiteral("Control-9"));
    dialog.addContent(password);
    dialog.addButton(QStringLiteral("授权"));
    QStringList events;
    connect(&dialog, &MDialog::buttonClicked, this, [&] { events << password->text(); });
    connect(&dialog, &MDialog::closed, this, [&] { events << QStringLiteral("closed"); });
    runWith(dialog, [](MDialog &d) { buttonOf(d, QStringLiteral("授权"))->click(); });
    events << QStringLiteral("exec returned");
    QCOMPARE(events, QStringList({QStringLiteral("Control-9"), QStringLiteral("closed"),
                                  QStringLiteral("exec returned")}));
}

void TestMDialog::aSecondPressIsNotHeardWhileTheFirstIs()
{
    MDialog dialog;
    dialog.addButton(QStringLiteral("a"));
    dialog.addButton(QStringLiteral("b"));
    int heard = 0;
    connect(&dialog, &MDialog::buttonClicked, this, [&] {
        ++heard;
        buttonOf(dialog, QStringLiteral("b"))->click();
    });
    QCOMPARE(runWith(dialog, [](MDialog &d) { buttonOf(d, QStringLiteral("a"))->click(); }), 0);
    QCOMPARE(heard, 1);
}

void TestMDialog::destroyedWhileOpenTellsOfItsEnd()
{
    auto *dialog = new MDialog;
    int closed = 0;
    connect(dialog, &MDialog::closed, this, [&closed] { ++closed; });
    dialog->show();
    delete dialog;
    QCOMPARE(closed, 1);

    delete new MDialog; // never open, nothing to tell
    QCOMPARE(closed, 1);
}

void TestMDialog::opensAgain()
{
    MDialog dialog;
    dialog.addButton(QStringLiteral("a"));
    const QSignalSpy closed(&dialog, &MDialog::closed);
    QCOMPARE(runWith(dialog, [](MDialog &d) { buttonOf(d, QStringLiteral("a"))->click(); }), 0);
    QCOMPARE(runWith(dialog, [](MDialog &d) { d.reject(); }), -1);
    QCOMPARE(runWith(dialog, [](MDialog &d) { buttonOf(d, QStringLiteral("a"))->click(); }), 0);
    QCOMPARE(closed.count(), 3);
}

void TestMDialog::standsOverItsParentEachTime()
{
    QWidget window;
    window.setGeometry(300, 200, 380, 237);
    window.show();
    MDialog dialog(&window);
    dialog.addButton(QStringLiteral("a"));
    for (int i = 0; i < 2; ++i) {
        dialog.show();
        QCOMPARE(dialog.geometry().center(), window.geometry().center());
        dialog.move(0, 0);
        dialog.hide();
        window.move(200, 100);
    }
    window.move(790, 100);
    dialog.show();
    QVERIFY(dialog.screen()->availableGeometry().contains(dialog.geometry()));
}

void TestMDialog::focusStartsInTheFirstField()
{
    MDialog dialog;
    auto *account = new MLineEdit;
    account->setClearButtonEnabled(true);
    dialog.addContent(account);
    dialog.addContent(new MPasswordEdit);
    dialog.addButton(QStringLiteral("授权"));
    QWidget *focused = nullptr;
    runWith(dialog, [&focused](MDialog &d) {
        focused = QApplication::focusWidget();
        d.reject();
    });
    QCOMPARE(focused, account->lineEdit());
}

void TestMDialog::textIsNeverCut_data()
{
    QTest::addColumn<QString>("message");
    QTest::addColumn<bool>("scrolls");
    QTest::newRow("short") << QStringLiteral("网络异常，请稍后重试") << false;
    QTest::newRow("several lines") << QStringLiteral("网络异常，请稍后重试\n").repeated(4) << false;
    QTest::newRow("one long word") << QStringLiteral("x").repeated(300) << false;
    QTest::newRow("very long") << QStringLiteral("网络异常，请稍后重试。").repeated(400) << true;
}

void TestMDialog::textIsNeverCut()
{
    QFETCH(QString, message);
    QFETCH(bool, scrolls);
    MDialog dialog;
    dialog.addButton(QStringLiteral("确定"));
    dialog.setMessage(message);
    dialog.show();
    QVERIFY(QTest::qWaitForWindowExposed(&dialog));

    QLabel *label = nullptr;
    for (QLabel *candidate : dialog.findChildren<QLabel *>()) {
        if (candidate->text() == message)
            label = candidate;
    }
    QVERIFY(label);
    QVERIFY(label->height() >= leastHeight(*label));
    const auto *area = dialog.findChild<QAbstractScrollArea *>();
    QCOMPARE(area->verticalScrollBar()->maximum() > 0, scrolls);
    QCOMPARE(area->focusPolicy() != Qt::NoFocus, scrolls);
    QVERIFY(scrolls || area->viewport()->height() >= label->height());
    QVERIFY(dialog.height() <= dialog.screen()->size().height() * 3 / 4);
    QVERIFY(dialog.rect().contains(buttonOf(dialog, QStringLiteral("确定"))->geometry()));
}

// What a server wrote must reach the user's eyes as it is.
void TestMDialog::textHasABound_data()
{
    QTest::addColumn<QString>("text");
    QTest::addColumn<int>("kept"); // characters before the ellipsis
    QTest::newRow("just fits") << QString(16384, QLatin1Char('a')) << 16384;
    QTest::newRow("letters") << QString(4000000, QLatin1Char('a')) << 16384;
    QTest::newRow("combining") << QString(300000, QChar(0x0301)) << 16384;
    QTest::newRow("whole characters")
        << QStringLiteral("a") + QString(QStringLiteral("😀")).repeated(9000) << 16383;
}

void TestMDialog::textHasABound()
{
    QFETCH(const QString, text);
    QFETCH(const int, kept);
    const bool fits = kept == text.size();
    if (!fits)
        QTest::ignoreMessage(QtWarningMsg, QRegularExpression(QStringLiteral("shown up to 16384")));
    MDialog dialog;
    dialog.setMessage(text);
    QCOMPARE(runWith(dialog, [](MDialog &shown) { key(shown, Qt::Key_Escape); }), -1);
    QCOMPARE(dialog.accessibleName(), text.left(kept) + (fits ? QString() : QStringLiteral("…")));
}

void TestMDialog::textIsPlain()
{
    MDialog dialog;
    dialog.setTitle(QStringLiteral("<b>title</b>"));
    dialog.setMessage(QStringLiteral("<img src='file:///etc/passwd'>a & b"));
    int plain = 0;
    for (const QLabel *label : dialog.findChildren<QLabel *>())
        plain += label->textFormat() == Qt::PlainText && !label->text().isEmpty() ? 1 : 0;
    QCOMPARE(plain, 2);
}

void TestMDialog::readersHearTheMessage()
{
    MDialog dialog;
    dialog.setMessage(QStringLiteral("网络异常"));
    QAccessibleInterface *face = QAccessible::queryAccessibleInterface(&dialog);
    QCOMPARE(face->role(), QAccessible::Dialog);
    QCOMPARE(face->text(QAccessible::Name), QStringLiteral("网络异常"));
    dialog.setTitle(QStringLiteral("标题"));
    QCOMPARE(face->text(QAccessible::Name), QStringLiteral("标题"));
    QCOMPARE(face->text(QAccessible::Description), QStringLiteral("网络异常"));
}

THEMED_TEST_MAIN(TestMDialog)
#include "tst_mdialog.moc"
