// SPDX-License-Identifier: Apache-2.0
#include "mtk/mlineedit.h"
#include "widgets/errortip.h"
#include "widgets/lineeditwidget.h"

#include <QAccessible>
#include <QLabel>
#include <QLineEdit>
#include <QPushButton>
#include <QVBoxLayout>
#include <QtTest>

using mcc::widgets::ErrorTip;
using mcc::widgets::LineEditWidget;

namespace {

// Two rows in a window that is on the screen, the focus in the second.
class Form : public QWidget
{
public:
    explicit Form(bool password = false)
        : row(new LineEditWidget(password, nullptr))
        , other(new LineEditWidget)
    {
        auto *layout = new QVBoxLayout(this);
        layout->addWidget(row);
        layout->addWidget(other);
        row->setTitle(QStringLiteral("管理员帐号"));
        show();
        activateWindow();
        other->edit()->setFocus();
    }

    QLineEdit *inner() const { return row->edit()->lineEdit(); }
    ErrorTip *tip() const { return row->findChild<ErrorTip *>(); }
    QPoint middleOf(const QWidget *widget) const { return widget->mapTo(this, widget->rect().center()); }

    LineEditWidget *row;
    LineEditWidget *other;
};

using Step = void (*)(Form &);

void wrongEntry(Form &form)
{
    form.row->setText(QStringLiteral("abc"));
    form.row->setIsErr(true);
    form.row->showAlertMessage(QStringLiteral("wrong"));
}

} // namespace
Q_DECLARE_METATYPE(Step)
Q_DECLARE_METATYPE(Qt::MouseButton)

class TestLineEditWidget : public QObject
{
    Q_OBJECT

private Q_SLOTS:
    void alertComesAndGoes_data();
    void alertComesAndGoes();
    void tipPointsAtLowerLeftCorner();
    void tipFitsItsText_data();
    void tipFitsItsText();
    void tipAppearsIfNotEmpty();
    void pressLeadsIntoEdit_data();
    void pressLeadsIntoEdit();
    void keyboardReachesEveryRow();
    void onlyPasswordModeMasks();
    void titleNamesEdit();
    void rightWidgetStandsBehindEdit();
};

void TestLineEditWidget::alertComesAndGoes_data()
{
    QTest::addColumn<Step>("step");
    QTest::addColumn<bool>("tipVisible");
    QTest::addColumn<bool>("red");

    QTest::newRow("nothing yet") << Step([](Form &) {}) << false << false;
    QTest::newRow("message alone") << Step([](Form &form) {
        form.row->showAlertMessage(QStringLiteral("wrong"));
    }) << true << false;
    QTest::newRow("both") << Step(wrongEntry) << true << true;
    QTest::newRow("empty message") << Step([](Form &form) {
        wrongEntry(form);
        QTest::ignoreMessage(QtDebugMsg, "showAlertMessage  \"\"");
        form.row->showAlertMessage(QString());
    }) << true << true;
    QTest::newRow("hidden") << Step([](Form &form) {
        wrongEntry(form);
        form.row->hideAlertMessage();
    }) << false << false;
    QTest::newRow("typed into") << Step([](Form &form) {
        wrongEntry(form);
        QTest::keyClick(form.inner(), Qt::Key_D);
    }) << false << false;
    QTest::newRow("cursor moved") << Step([](Form &form) {
        wrongEntry(form);
        QTest::keyClick(form.inner(), Qt::Key_Left);
    }) << true << true;
    QTest::newRow("another text set") << Step([](Form &form) {
        wrongEntry(form);
        form.row->setText(QStringLiteral("abd"));
    }) << false << false;
    QTest::newRow("same text set") << Step([](Form &form) {
        wrongEntry(form);
        form.row->setText(QStringLiteral("abc"));
    }) << true << true;
    QTest::newRow("window hidden") << Step([](Form &form) {
        wrongEntry(form);
        form.hide();
    }) << false << true;
}

void TestLineEditWidget::alertComesAndGoes()
{
    QFETCH(Step, step);
    Form form;
    step(form);
    QTEST(form.tip()->isVisible(), "tipVisible");
    QTEST(form.row->edit()->isAlert(), "red");
    QVERIFY(!form.row->isErr());
}

void TestLineEditWidget::tipPointsAtLowerLeftCorner()
{
    Form form;
    form.row->showAlertMessage(QStringLiteral("wrong"));
    const QPoint corner = form.row->edit()->mapToGlobal(form.row->edit()->rect().bottomLeft());
    const QRect tip = form.tip()->geometry();
    QCOMPARE(tip.top(), corner.y());
    QVERIFY(tip.left() < corner.x() && corner.x() < tip.right());

    form.move(form.pos() + QPoint(20, 30));
    QCoreApplication::processEvents();
    QCOMPARE(form.tip()->geometry(), tip);
}

void TestLineEditWidget::tipFitsItsText_data()
{
    QTest::addColumn<QString>("text");
    QTest::newRow("one glyph") << QStringLiteral("错");
    QTest::newRow("sentence") << QStringLiteral("用户名或密码错误,请重新输入");
    QTest::newRow("long")
        << QStringLiteral("This name is taken by another terminal of the domain. ").repeated(4);
    QTest::newRow("one long word") << QStringLiteral("terminal.name.in.the.domain").repeated(2);
    QTest::newRow("lines") << QStringLiteral("one\ntwo\nthree");
}

void TestLineEditWidget::tipFitsItsText()
{
    QFETCH(QString, text);
    Form form;
    // A shorter text before must leave nothing behind, nor a longer one.
    form.row->showAlertMessage(QStringLiteral("短"));
    form.row->showAlertMessage(text.repeated(2));
    form.row->showAlertMessage(text);

    const auto *label = form.tip()->findChild<QLabel *>();
    const QRect place(label->mapTo(form.tip(), QPoint()), label->size());
    QVERIFY(form.tip()->rect().contains(place));
    QVERIFY(label->height() >= label->heightForWidth(label->width()));
    const QRect room = label->contentsRect();
    const QRect needed = label->fontMetrics().boundingRect(0, 0, room.width(), 9999, Qt::TextWordWrap, text);
    QVERIFY2(needed.height() <= room.height(), "lines are cut");
    QVERIFY2(needed.width() <= room.width(), "a word is cut");
}

void TestLineEditWidget::tipAppearsIfNotEmpty()
{
    Form form;
    form.tip()->appearIfNotEmpty();
    QVERIFY(!form.tip()->isVisible());
    form.tip()->setText(QStringLiteral("wrong"));
    QVERIFY(!form.tip()->isVisible());
    form.tip()->appearIfNotEmpty();
    QVERIFY(form.tip()->isVisible());
    form.tip()->clear();
    QVERIFY(!form.tip()->isVisible() && form.tip()->isEmpty());
}

void TestLineEditWidget::pressLeadsIntoEdit_data()
{
    QTest::addColumn<bool>("onTitle");
    QTest::addColumn<Qt::MouseButton>("button");
    QTest::addColumn<bool>("leads");
    QTest::newRow("title") << true << Qt::LeftButton << true;
    QTest::newRow("margin") << false << Qt::LeftButton << true;
    QTest::newRow("title, right") << true << Qt::RightButton << false;
    QTest::newRow("margin, middle") << false << Qt::MiddleButton << false;
}

void TestLineEditWidget::pressLeadsIntoEdit()
{
    QFETCH(bool, onTitle);
    QFETCH(Qt::MouseButton, button);
    QFETCH(bool, leads);
    Form form;
    QVERIFY(QTest::qWaitForWindowActive(&form));
    const QPoint place =
        onTitle ? form.middleOf(form.row->titleLabel()) : form.row->geometry().topLeft() + QPoint(1, 1);

    QTest::mouseClick(form.windowHandle(), button, {}, place);
    QCOMPARE(QApplication::focusWidget(), leads ? form.inner() : form.other->edit()->lineEdit());
}

void TestLineEditWidget::keyboardReachesEveryRow()
{
    Form form;
    QVERIFY(QTest::qWaitForWindowActive(&form));
    QTest::keyClick(form.windowHandle(), Qt::Key_Backtab, Qt::ShiftModifier);
    QTRY_COMPARE(QApplication::focusWidget(), form.inner());
    QTest::keyClick(form.windowHandle(), Qt::Key_X);
    QCOMPARE(form.row->edit()->text(), QStringLiteral("x"));

    form.row->showAlertMessage(QStringLiteral("wrong"));
    QCOMPARE(QApplication::focusWidget(), form.inner());
    QTest::keyClick(form.windowHandle(), Qt::Key_Tab);
    QCOMPARE(QApplication::focusWidget(), form.other->edit()->lineEdit());
}

void TestLineEditWidget::onlyPasswordModeMasks()
{
    for (const bool password : {false, true}) {
        Form form(password);
        form.row->setText(QStringLiteral("Control-9"));
        QCOMPARE(form.row->edit()->text(), QStringLiteral("Control-9"));
        QCOMPARE(form.inner()->displayText() == QStringLiteral("Control-9"), !password);
    }
}

void TestLineEditWidget::titleNamesEdit()
{
    Form form;
    const QAccessibleInterface *edit = QAccessible::queryAccessibleInterface(form.inner());
    QCOMPARE(edit->text(QAccessible::Name), QStringLiteral("管理员帐号"));
    form.row->setTitle(QStringLiteral("密码"));
    QCOMPARE(edit->text(QAccessible::Name), QStringLiteral("密码"));
    QCOMPARE(form.row->accessibleName(), QStringLiteral("密码"));
}

void TestLineEditWidget::rightWidgetStandsBehindEdit()
{
    Form form;
    auto *button = new QPushButton(QStringLiteral("Browse"));
    form.row->addRightWidget(button);
    QCoreApplication::processEvents();
    QCOMPARE(button->parentWidget(), form.row);
    QVERIFY(button->isVisible());
    QVERIFY(button->x() > form.row->edit()->geometry().right());
    QVERIFY(form.row->edit()->x() > form.row->titleLabel()->geometry().right());
}

QTEST_MAIN(TestLineEditWidget)
#include "tst_lineeditwidget.moc"
