// SPDX-License-Identifier: Apache-2.0
#include "themedtest.h"

#include "mtk/mpasswordedit.h"

#include <QAbstractButton>
#include <QAccessible>
#include <QClipboard>
#include <QLabel>
#include <QLineEdit>
#include <QVBoxLayout>

using namespace Mtk::Widget;

namespace {

const QString kSecret = QStringLiteral("Terminal-7");

QAbstractButton *buttonNamed(const QWidget &edit, const QString &name)
{
    const QList<QAbstractButton *> buttons = edit.findChildren<QAbstractButton *>();
    for (QAbstractButton *button : buttons) {
        if (button->accessibleName() == name)
            return button;
    }
    return nullptr;
}

QAbstractButton *reveal(const QWidget &edit)
{
    return buttonNamed(edit, QStringLiteral("显示密码"));
}

} // namespace

class TestMLineEdit : public QObject
{
    Q_OBJECT

private Q_SLOTS:
    void textChangedFiresTypedAndSet();
    void clearButton();
    void alertChangesThePicture();
    void accessibleName_data();
    void accessibleName();
    void buddyGivesFocus();
    void tabStopsOnceInAnEdit();
    void maskedPasswordCannotBeCopied();
    void revealByKeyboard();
    void revealingForgetsWhatWasTyped();
    void hidingMasksAgain();
};

void TestMLineEdit::textChangedFiresTypedAndSet()
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

void TestMLineEdit::clearButton()
{
    MLineEdit edit;
    edit.resize(270, 36);
    edit.setClearButtonEnabled(true);
    edit.show();
    QAbstractButton *button = buttonNamed(edit, QStringLiteral("清除"));
    QVERIFY(button);
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

void TestMLineEdit::alertChangesThePicture()
{
    MLineEdit edit;
    edit.resize(270, 36);
    const QImage calm = edit.grab().toImage();
    edit.setAlert(true);
    const QImage alert = edit.grab().toImage();
    QVERIFY(alert != calm);
    QVERIFY(alert.pixelColor(135, 0).red() > 180 && alert.pixelColor(135, 0).green() < 120);
    edit.setAlert(false);
    QCOMPARE(edit.grab().toImage(), calm);
}

void TestMLineEdit::accessibleName_data()
{
    QTest::addColumn<bool>("throughWidget");
    QTest::addColumn<bool>("throughBuddy");
    QTest::newRow("set on the edit") << false << false;
    QTest::newRow("set through its base class") << true << false;
    QTest::newRow("from the label") << false << true;
}

void TestMLineEdit::accessibleName()
{
    QFETCH(bool, throughWidget);
    QFETCH(bool, throughBuddy);
    const QString name = QStringLiteral("域地址");
    QWidget window;
    auto *label = new QLabel(QStringLiteral("域&地址"), &window);
    auto *edit = new MLineEdit(&window);
    if (throughBuddy)
        label->setBuddy(edit);
    else if (throughWidget)
        static_cast<QWidget *>(edit)->setAccessibleName(name);
    else
        edit->setAccessibleName(name);
    window.show();

    QAccessibleInterface *inner = QAccessible::queryAccessibleInterface(edit->lineEdit());
    QCOMPARE(inner->role(), QAccessible::EditableText);
    QCOMPARE(inner->text(QAccessible::Name), name);
    QVERIFY(inner->editableTextInterface());
    inner->editableTextInterface()->insertText(0, QStringLiteral("typed by a reader"));
    QCOMPARE(edit->text(), QStringLiteral("typed by a reader"));
}

void TestMLineEdit::buddyGivesFocus()
{
    QWidget window;
    auto *column = new QVBoxLayout(&window);
    auto *other = new MLineEdit;
    auto *label = new QLabel(QStringLiteral("&Port"));
    auto *edit = new MLineEdit;
    label->setBuddy(edit);
    column->addWidget(other);
    column->addWidget(label);
    column->addWidget(edit);
    window.show();
    window.activateWindow();
    QVERIFY(QTest::qWaitForWindowActive(&window));
    other->setFocus();
    QVERIFY(other->lineEdit()->hasFocus());
    QTest::keyClick(&window, Qt::Key_P, Qt::AltModifier);
    QVERIFY(edit->lineEdit()->hasFocus());
}

void TestMLineEdit::tabStopsOnceInAnEdit()
{
    QWidget window;
    auto *column = new QVBoxLayout(&window);
    auto *first = new MLineEdit;
    auto *second = new MPasswordEdit;
    column->addWidget(first);
    column->addWidget(second);
    window.show();
    window.activateWindow();
    QVERIFY(QTest::qWaitForWindowActive(&window));
    first->setFocus();
    QVector<QWidget *> stops;
    for (int i = 0; i < 3; ++i) {
        QTest::keyClick(QApplication::focusWidget(), Qt::Key_Tab);
        stops << QApplication::focusWidget();
    }
    QCOMPARE(stops, QVector<QWidget *>({second->lineEdit(), reveal(*second), first->lineEdit()}));
}

void TestMLineEdit::maskedPasswordCannotBeCopied()
{
    MPasswordEdit edit;
    edit.setText(kSecret);
    QVERIFY(!edit.lineEdit()->displayText().contains(kSecret));
    QVERIFY(edit.lineEdit()->inputMethodHints() & Qt::ImhSensitiveData);
    QApplication::clipboard()->setText(QStringLiteral("before"));
    edit.lineEdit()->selectAll();
    QTest::keySequence(edit.lineEdit(), QKeySequence::Copy);
    QTest::keySequence(edit.lineEdit(), QKeySequence::Cut);
    QCOMPARE(QApplication::clipboard()->text(), QStringLiteral("before"));
    edit.setText(kSecret);
    const QString heard = QAccessible::queryAccessibleInterface(edit.lineEdit())->text(QAccessible::Value);
    QVERIFY(!heard.contains(kSecret));
}

void TestMLineEdit::revealByKeyboard()
{
    MPasswordEdit edit;
    edit.setText(kSecret);
    edit.lineEdit()->setCursorPosition(3);
    const QSignalSpy changed(&edit, &MLineEdit::textChanged);
    QTest::keyClick(reveal(edit), Qt::Key_Space);
    QCOMPARE(edit.lineEdit()->displayText(), kSecret);
    QCOMPARE(edit.lineEdit()->cursorPosition(), 3);
    QTest::keyClick(buttonNamed(edit, QStringLiteral("隐藏密码")), Qt::Key_Space);
    QVERIFY(reveal(edit));
    QVERIFY(!edit.lineEdit()->displayText().contains(kSecret));
    QCOMPARE(changed.count(), 0);
}

void TestMLineEdit::revealingForgetsWhatWasTyped()
{
    MPasswordEdit edit;
    QTest::keyClicks(edit.lineEdit(), kSecret);
    edit.lineEdit()->selectAll();
    QTest::keyClick(edit.lineEdit(), Qt::Key_Delete);
    reveal(edit)->click();
    QTest::keySequence(edit.lineEdit(), QKeySequence::Undo);
    QCOMPARE(edit.text(), QString());
}

void TestMLineEdit::hidingMasksAgain()
{
    MPasswordEdit edit;
    edit.setText(kSecret);
    edit.show();
    reveal(edit)->click();
    edit.hide();
    QCOMPARE(edit.lineEdit()->echoMode(), QLineEdit::Password);
    QVERIFY(reveal(edit));
}

THEMED_TEST_MAIN(TestMLineEdit)
#include "tst_mlineedit.moc"
