// SPDX-License-Identifier: Apache-2.0
#include "mtk/mlineedit.h"
#include "widgets/errortip.h"
#include "widgets/lineeditwidget.h"

#include <QAccessible>
#include <QLabel>
#include <QLineEdit>
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

    LineEditWidget *row;
    LineEditWidget *other;
};

using Step = void (*)(Form &);

} // namespace

Q_DECLARE_METATYPE(Step)

class TestLineEditWidget : public QObject
{
    Q_OBJECT

private Q_SLOTS:
    void alertComesAndGoes_data()
    {
        QTest::addColumn<Step>("step"); // after a wrong entry
        QTest::addColumn<bool>("tipVisible");
        QTest::addColumn<bool>("red");
        const auto row = [](const char *name, Step step, bool tipVisible, bool red) {
            QTest::newRow(name) << step << tipVisible << red;
        };
        row(
            "empty message", [](Form &form) { form.row->showAlertMessage(QString()); }, true, true);
        row(
            "hidden", [](Form &form) { form.row->hideAlertMessage(); }, false, false);
        row(
            "typed into", [](Form &form) { QTest::keyClick(form.inner(), Qt::Key_D); }, false, false);
        row(
            "cursor moved", [](Form &form) { QTest::keyClick(form.inner(), Qt::Key_Left); }, true, true);
        row(
            "another text set", [](Form &form) { form.row->setText(QStringLiteral("abd")); }, false, false);
        row(
            "same text set", [](Form &form) { form.row->setText(QStringLiteral("abc")); }, true, true);
        row(
            "window hidden", [](Form &form) { form.hide(); }, false, true);
    }

    void alertComesAndGoes()
    {
        QFETCH(Step, step);
        Form form;
        form.row->setText(QStringLiteral("abc"));
        QVERIFY(!form.tip()->isVisible());
        form.row->showAlertMessage(QStringLiteral("wrong"));
        QVERIFY(form.tip()->isVisible() && !form.row->edit()->isAlert());
        form.row->setIsErr(true);
        step(form);
        QTEST(form.tip()->isVisible(), "tipVisible");
        QTEST(form.row->edit()->isAlert(), "red");
        QVERIFY(!form.row->isErr());
    }

    void tipPointsAtLowerLeftCorner()
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

    void tipFitsItsText_data()
    {
        QTest::addColumn<QString>("text");
        for (const char *text : {"错", "用户名或密码错误,请重新输入", "one\ntwo\nthree",
                                 "terminal.name.in.the.domainterminal.name.in.the.domain",
                                 "This name is taken by another terminal of the domain. Take another one"})
            QTest::newRow(text) << QString::fromUtf8(text);
    }

    void tipFitsItsText()
    {
        QFETCH(QString, text);
        Form form;
        // A shorter text before must leave nothing behind, nor a longer one.
        form.row->showAlertMessage(QStringLiteral("短"));
        form.row->showAlertMessage(text.repeated(2));
        form.row->showAlertMessage(text);

        const auto *label = form.tip()->findChild<QLabel *>();
        QVERIFY(form.tip()->rect().contains(label->geometry()));
        QVERIFY(label->height() >= label->heightForWidth(label->width()));
        const QRect room = label->contentsRect();
        const QRect needed =
            label->fontMetrics().boundingRect(0, 0, room.width(), 9999, Qt::TextWordWrap, text);
        QVERIFY2(needed.height() <= room.height(), "lines are cut");
        QVERIFY2(needed.width() <= room.width(), "a word is cut");
    }

    void pressLeadsIntoEdit()
    {
        Form form;
        QVERIFY(QTest::qWaitForWindowActive(&form));
        const QPoint title = form.row->titleLabel()->mapTo(&form, QPoint(5, 5));
        const QPoint margin = form.row->geometry().topLeft() + QPoint(1, 1);
        for (const QPoint &place : {title, margin}) {
            for (const Qt::MouseButton button : {Qt::RightButton, Qt::MiddleButton, Qt::LeftButton}) {
                form.other->edit()->setFocus();
                QTest::mouseClick(form.windowHandle(), button, {}, place);
                QCOMPARE(form.inner()->hasFocus(), button == Qt::LeftButton);
            }
        }
    }

    void keyboardReachesEveryRow()
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

    void onlyPasswordModeMasks()
    {
        for (const bool password : {false, true}) {
            Form form(password);
            form.row->setText(QStringLiteral("Control-9"));
            QCOMPARE(form.row->edit()->text(), QStringLiteral("Control-9"));
            QCOMPARE(form.inner()->displayText() == QStringLiteral("Control-9"), !password);
        }
    }

    void titleNamesEdit()
    {
        Form form;
        const QAccessibleInterface *edit = QAccessible::queryAccessibleInterface(form.inner());
        QCOMPARE(edit->text(QAccessible::Name), QStringLiteral("管理员帐号"));
        form.row->setTitle(QStringLiteral("密码"));
        QCOMPARE(edit->text(QAccessible::Name), QStringLiteral("密码"));
        QCOMPARE(form.row->accessibleName(), QStringLiteral("密码"));
    }
};

QTEST_MAIN(TestLineEditWidget)
#include "tst_lineeditwidget.moc"
