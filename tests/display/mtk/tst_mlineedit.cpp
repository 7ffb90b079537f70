// SPDX-License-Identifier: Apache-2.0
#include "themedtest.h"

#include "mtk/mpasswordedit.h"

#include <QAccessible>
#include <QAction>
#include <QClipboard>
#include <QLabel>
#include <QLineEdit>
#include <QVBoxLayout>

using namespace Mtk::Widget;

namespace {

const QString kSecret = QStringLiteral("Terminal-7");

QAbstractButton *reveal(const QWidget &edit)
{
    return buttonNamed(edit, QStringLiteral("显示密码"));
}

bool shows(const MLineEdit &edit, const QString &text)
{
    return edit.lineEdit()->displayText() == text;
}

} // namespace

class TestMLineEdit : public QObject
{
    Q_OBJECT

private Q_SLOTS:
    void textChangedFiresTypedAndSet()
    {
        MLineEdit edit;
        const QSignalSpy changed(&edit, &MLineEdit::textChanged);
        QTest::keyClicks(edit.lineEdit(), QStringLiteral("ab"));
        edit.setText(QStringLiteral("server"));
        edit.setText(QStringLiteral("server"));
        QCOMPARE(changed.count(), 3);
        QCOMPARE(changed.last().first().toString(), QStringLiteral("server"));
        QCOMPARE(edit.text(), QStringLiteral("server"));
    }

    void clearButton()
    {
        MLineEdit edit;
        edit.resize(270, 36);
        edit.setClearButtonEnabled(true);
        edit.show();
        QAbstractButton *button = buttonNamed(edit, QStringLiteral("清除"));
        QVERIFY(!button->isVisible());
        edit.setText(QStringLiteral("a"));
        QVERIFY(button->isVisible());
        edit.lineEdit()->setReadOnly(true);
        QVERIFY(!button->isVisible());
        edit.lineEdit()->setReadOnly(false);
        QTest::mouseClick(button, Qt::LeftButton);
        QCOMPARE(edit.text(), QString());
        edit.setClearButtonEnabled(false);
        QVERIFY(!buttonNamed(edit, QStringLiteral("清除")));
    }

    void alertChangesTheLook()
    {
        MLineEdit edit;
        edit.resize(270, 36);
        const QImage calm = imageOf(edit);
        edit.setAlert(true);
        const QColor border = imageOf(edit).pixelColor(135, 0);
        QVERIFY(border.red() > 180 && border.green() < 120);
        edit.setAlert(false);
        QCOMPARE(imageOf(edit), calm);
    }

    void accessibleName()
    {
        const QString name = QStringLiteral("域地址");
        QWidget window;
        auto *label = new QLabel(QStringLiteral("域&地址"), &window);
        MLineEdit *edits[] = {new MLineEdit(&window), new MLineEdit(&window), new MLineEdit(&window)};
        edits[0]->setAccessibleName(name);
        static_cast<QWidget *>(edits[1])->setAccessibleName(name);
        label->setBuddy(edits[2]);
        window.show();
        for (MLineEdit *edit : edits) {
            QAccessibleInterface *inner = QAccessible::queryAccessibleInterface(edit->lineEdit());
            QCOMPARE(inner->role(), QAccessible::EditableText);
            QCOMPARE(inner->text(QAccessible::Name), name);
            inner->editableTextInterface()->insertText(0, QStringLiteral("typed by a reader"));
            QCOMPARE(edit->text(), QStringLiteral("typed by a reader"));
        }
    }

    // By the label's shortcut into its buddy; by Tab once into an edit.
    void keyboardLeadsIn()
    {
        QWidget window;
        auto *label = new QLabel(QStringLiteral("&Port"));
        auto *first = new MLineEdit;
        auto *second = new MPasswordEdit;
        label->setBuddy(second);
        auto *column = new QVBoxLayout(&window);
        column->addWidget(label);
        column->addWidget(first);
        column->addWidget(second);
        QVERIFY(activate(window));
        first->setFocus();
        QVector<QWidget *> stops{QApplication::focusWidget()};
        QTest::keyClick(&window, Qt::Key_P, Qt::AltModifier);
        stops << QApplication::focusWidget();
        for (int i = 0; i < 2; ++i) {
            QTest::keyClick(QApplication::focusWidget(), Qt::Key_Tab);
            stops << QApplication::focusWidget();
        }
        QCOMPARE(stops, QVector<QWidget *>(
                            {first->lineEdit(), second->lineEdit(), reveal(*second), first->lineEdit()}));
    }

    void maskedPasswordCannotBeCopied()
    {
        MPasswordEdit edit;
        edit.setText(kSecret);
        QVERIFY(edit.lineEdit()->inputMethodHints() & Qt::ImhSensitiveData);
        QApplication::clipboard()->setText(QStringLiteral("before"));
        edit.lineEdit()->selectAll();
        QTest::keySequence(edit.lineEdit(), QKeySequence::Copy);
        QTest::keySequence(edit.lineEdit(), QKeySequence::Cut);
        QCOMPARE(QApplication::clipboard()->text(), QStringLiteral("before"));
        edit.setText(kSecret);
        const auto *inner = QAccessible::queryAccessibleInterface(edit.lineEdit());
        QVERIFY(!inner->text(QAccessible::Value).contains(kSecret));
    }

    void menuIsChinese()
    {
        MLineEdit plain;
        MPasswordEdit masked;
        QStringList offered;
        for (MLineEdit *edit : {&plain, static_cast<MLineEdit *>(&masked)}) {
            QVERIFY(activate(*edit));
            QApplication::clipboard()->clear();
            QTest::keyClicks(edit->lineEdit(), kSecret);
            edit->lineEdit()->selectAll();
            QTest::keyClick(edit->lineEdit(), Qt::Key_F10, Qt::ShiftModifier);
            for (const QAction *action : QApplication::activePopupWidget()->actions()) {
                if (action->isEnabled() && !action->isSeparator())
                    offered << action->text().section(QLatin1Char('\t'), 0, 0);
            }
            QApplication::activePopupWidget()->close();
        }
        QCOMPARE(offered.join(QLatin1Char(' ')), QStringLiteral("撤消 剪切 复制 删除 撤消 删除"));
        plain.setContextMenuPolicy(Qt::NoContextMenu);
        QTest::keyClick(plain.lineEdit(), Qt::Key_F10, Qt::ShiftModifier);
        QVERIFY(!QApplication::activePopupWidget());
    }

    void revealByKeyboard()
    {
        MPasswordEdit edit;
        edit.setText(kSecret);
        edit.show();
        edit.lineEdit()->setCursorPosition(3);
        const QSignalSpy changed(&edit, &MLineEdit::textChanged);
        QVERIFY(!shows(edit, kSecret));
        QTest::keyClick(reveal(edit), Qt::Key_Space);
        QVERIFY(shows(edit, kSecret));
        QCOMPARE(edit.lineEdit()->cursorPosition(), 3);
        QTest::keyClick(buttonNamed(edit, QStringLiteral("隐藏密码")), Qt::Key_Space);
        QVERIFY(!shows(edit, kSecret));
        QCOMPARE(changed.count(), 0);

        // An edit that goes out of sight masks again.
        reveal(edit)->click();
        edit.hide();
        QVERIFY(!shows(edit, kSecret) && reveal(edit));
    }

    void revealingForgetsWhatWasTyped()
    {
        MPasswordEdit edit;
        QTest::keyClicks(edit.lineEdit(), kSecret);
        edit.lineEdit()->selectAll();
        QTest::keyClick(edit.lineEdit(), Qt::Key_Delete);
        reveal(edit)->click();
        QTest::keySequence(edit.lineEdit(), QKeySequence::Undo);
        QCOMPARE(edit.text(), QString());
    }
};

THEMED_TEST_MAIN(TestMLineEdit)
#include "tst_mlineedit.moc"
