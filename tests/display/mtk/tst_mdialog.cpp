// SPDX-License-Identifier: Apache-2.0
#include "themedtest.h"

#include "mtk/mblureffectwidget.h"
#include "mtk/mdialog.h"
#include "mtk/mlineedit.h"
#include "mtk/mpasswordedit.h"

#include <QAccessible>
#include <QClipboard>
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

Act click(const QString &button)
{
    return [button](MDialog &dialog) {
        QTest::mouseClick(buttonNamed(dialog, button), Qt::LeftButton);
    };
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
    void endsInEachWay_data()
    {
        QTest::addColumn<Act>("act");
        QTest::addColumn<int>("result");
        QTest::newRow("first button") << click(QStringLiteral("取消")) << 0;
        QTest::newRow("second button") << click(QStringLiteral("授权")) << 1;
        QTest::newRow("Escape") << Act([](MDialog &d) { QTest::keyClick(d.windowHandle(), Qt::Key_Escape); })
                                << -1;
        QTest::newRow("title bar") << click(QStringLiteral("关闭")) << -1;
        QTest::newRow("close") << Act([](MDialog &d) { d.close(); }) << -1;
        QTest::newRow("hide") << Act([](MDialog &d) { d.hide(); }) << -1;
        QTest::newRow("accept") << Act([](MDialog &d) { d.accept(); }) << -1;
    }

    void endsInEachWay()
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

        // It opens again, and knows nothing of the first time.
        QCOMPARE(runWith(dialog, [](MDialog &d) { d.reject(); }), -1);
        QCOMPARE(runWith(dialog, click(QStringLiteral("取消"))), 0);
        QCOMPARE(closed.count(), 3);
    }

    void enterAnswers_data()
    {
        QTest::addColumn<QVector<int>>("types");
        QTest::addColumn<int>("isDefault"); // index, -1 none
        QTest::addColumn<int>("focus");     // index, -1 where it starts
        QTest::addColumn<int>("result");    // -1 nothing happens
        const int normal = MDialog::ButtonNormal;
        const int recommended = MDialog::ButtonRecommended;
        QTest::newRow("the only one") << QVector<int>{normal} << -1 << -1 << 0;
        QTest::newRow("the recommended one") << QVector<int>{normal, recommended} << -1 << -1 << 1;
        QTest::newRow("the default one first") << QVector<int>{normal, recommended} << 0 << -1 << 0;
        QTest::newRow("the focused one above all") << QVector<int>{normal, recommended} << -1 << 0 << 0;
        QTest::newRow("none of two equal ones") << QVector<int>{normal, normal} << -1 << -1 << -1;
    }

    void enterAnswers()
    {
        QFETCH(QVector<int>, types);
        QFETCH(int, isDefault);
        QFETCH(int, focus);
        MDialog dialog;
        auto *field = new MLineEdit;
        field->setClearButtonEnabled(true);
        dialog.addContent(field);
        dialog.addContent(new MPasswordEdit);
        for (int i = 0; i < types.size(); ++i)
            dialog.addButton(QString::number(i), i == isDefault, MDialog::ButtonType(types.at(i)));

        const QWidget *first = nullptr;
        const int answer = runWith(dialog, [&](MDialog &d) {
            first = QApplication::focusWidget();
            if (focus >= 0)
                buttonNamed(d, QString::number(focus))->setFocus();
            QTest::keyClick(d.windowHandle(), Qt::Key_Return);
            if (d.isVisible())
                d.reject();
        });
        QTEST(answer, "result");
        QCOMPARE(first, field->lineEdit());
    }

    // The contents stand while the first press is heard, and a second is not.
    void onePressIsHeard()
    {
        MDialog dialog;
        auto *password = new MPasswordEdit;
        password->setText(QStringLiteral("Control-9"));
        dialog.addContent(password);
        dialog.addButton(QStringLiteral("授权"));
        dialog.addButton(QStringLiteral("取消"));
        QStringList events;
        connect(&dialog, &MDialog::buttonClicked, this, [&] {
            events << password->text();
            buttonNamed(dialog, QStringLiteral("取消"))->click();
        });
        connect(&dialog, &MDialog::closed, this, [&] { events << QStringLiteral("closed"); });
        QCOMPARE(runWith(dialog, click(QStringLiteral("授权"))), 0);
        events << QStringLiteral("returned");
        QCOMPARE(events.join(QLatin1Char(' ')), QStringLiteral("Control-9 closed returned"));
    }

    void destroyedWhileOpenTellsOfItsEnd()
    {
        int closed = 0;
        for (const bool open : {true, false}) {
            MDialog dialog;
            connect(&dialog, &MDialog::closed, this, [&closed] { ++closed; });
            dialog.setVisible(open);
        }
        QCOMPARE(closed, 1);
    }

    void standsOverItsParentEachTime()
    {
        MBlurEffectWidget window;
        window.setGeometry(300, 200, 380, 237);
        window.show();
        const QImage bright = imageOf(window);
        MDialog dialog(&window);
        dialog.addButton(QStringLiteral("a"));
        for (int i = 0; i < 2; ++i) {
            dialog.show();
            QCOMPARE(dialog.geometry().center(), window.geometry().center());
            QVERIFY(qGray(imageOf(window).pixel(9, 9)) < qGray(bright.pixel(9, 9)) * 2 / 3);
            dialog.move(0, 0);
            dialog.hide();
            QCOMPARE(imageOf(window), bright);
            window.move(200, 100);
        }
        window.setGeometry(790, 100, 380, 60);
        dialog.show();
        QCOMPARE(dialog.y(), 150); // below the title bar, not over all of it
        QVERIFY(dialog.screen()->availableGeometry().contains(dialog.geometry()));
    }

    void textIsNeverCut_data()
    {
        QTest::addColumn<QString>("message");
        QTest::addColumn<bool>("scrolls");
        QTest::newRow("short") << QStringLiteral("网络异常，请稍后重试") << false;
        QTest::newRow("several lines") << QStringLiteral("网络异常，请稍后重试\n").repeated(4) << false;
        QTest::newRow("one long word") << QStringLiteral("x").repeated(300) << false;
        QTest::newRow("very long") << QStringLiteral("网络异常，请稍后重试。").repeated(400) << true;
    }

    void textIsNeverCut()
    {
        QFETCH(QString, message);
        QFETCH(bool, scrolls);
        MDialog dialog;
        dialog.addButton(QStringLiteral("确定"));
        dialog.setMessage(message);
        dialog.show();
        QVERIFY(QTest::qWaitForWindowExposed(&dialog));

        const auto *area = dialog.findChild<QAbstractScrollArea *>();
        const QLabel *label = area->findChildren<QLabel *>().last();
        QCOMPARE(label->text(), message);
        const QRect wide(0, 0, label->width(), QWIDGETSIZE_MAX);
        const QRect needed = dialog.fontMetrics().boundingRect(wide, Qt::TextWrapAnywhere, message);
        QVERIFY(label->height() >= needed.height());
        QCOMPARE(area->verticalScrollBar()->maximum() > 0, scrolls);
        QCOMPARE(area->focusPolicy() != Qt::NoFocus, scrolls);
        QVERIFY(scrolls || area->viewport()->height() >= label->height());
        QVERIFY(dialog.height() <= dialog.screen()->size().height() * 3 / 4);
        QVERIFY(dialog.rect().contains(buttonNamed(dialog, QStringLiteral("确定"))->geometry()));
    }

    // What a server wrote must reach the user's eyes as it is.
    void textHasABound_data()
    {
        QTest::addColumn<QString>("text");
        QTest::addColumn<int>("kept"); // characters before the ellipsis
        QTest::newRow("just fits") << QString(16384, QLatin1Char('a')) << 16384;
        QTest::newRow("letters") << QString(4000000, QLatin1Char('a')) << 16384;
        QTest::newRow("combining") << QString(300000, QChar(0x0301)) << 16384;
        QTest::newRow("whole characters")
            << QStringLiteral("a") + QString(QStringLiteral("😀")).repeated(9000) << 16383;
    }

    void textHasABound()
    {
        QFETCH(const QString, text);
        QFETCH(const int, kept);
        const bool fits = kept == text.size();
        if (!fits)
            QTest::ignoreMessage(QtWarningMsg, QRegularExpression(QStringLiteral("shown up to 16384")));
        MDialog dialog;
        dialog.setMessage(text);
        QCOMPARE(
            runWith(dialog, [](MDialog &shown) { QTest::keyClick(shown.windowHandle(), Qt::Key_Escape); }),
            -1);
        QCOMPARE(dialog.accessibleName(), text.left(kept) + (fits ? QString() : QStringLiteral("…")));
    }

    void textCanBeCopied()
    {
        const QString message = QStringLiteral("<b>网络异常</b>\n请稍后重试");
        QStringList copied;
        const auto copy = [&copied] {
            QTest::keySequence(QApplication::focusWidget(), QKeySequence::Copy);
            copied << QApplication::clipboard()->text();
        };
        MDialog dialog;
        dialog.addButton(QStringLiteral("确定"));
        dialog.setMessage(message);
        const int answer = runWith(dialog, [&](MDialog &d) {
            copy(); // all, where nothing is selected
            QWidget *label = d.findChildren<QLabel *>().last();
            QTest::mousePress(label, Qt::LeftButton, {}, QPoint(0, 2));
            QMouseEvent move(QEvent::MouseMove, QPoint(label->width(), 2), Qt::NoButton, Qt::LeftButton, {});
            QApplication::sendEvent(label, &move);
            QTest::mouseRelease(label, Qt::LeftButton, {}, QPoint(label->width(), 2));
            copy();
            QTest::keySequence(QApplication::focusWidget(), QKeySequence::SelectAll);
            copy();
            QTest::keyClick(d.windowHandle(), Qt::Key_Return);
        });
        QCOMPARE(copied, QStringList({message, QStringLiteral("<b>网络异常</b>"), message}));
        QCOMPARE(answer, 0);
    }

    void textIsPlainAndHeard()
    {
        MDialog dialog;
        const QString message = QStringLiteral("<img src='file:///etc/passwd'>a & b");
        const QString title = QStringLiteral("<b>title</b>");
        dialog.setMessage(message);
        const QAccessibleInterface *face = QAccessible::queryAccessibleInterface(&dialog);
        QCOMPARE(face->role(), QAccessible::Dialog);
        QCOMPARE(face->text(QAccessible::Name), message);
        dialog.setTitle(title);
        QCOMPARE(face->text(QAccessible::Name), title);
        QCOMPARE(face->text(QAccessible::Description), message);
        int plain = 0;
        for (const QLabel *label : dialog.findChildren<QLabel *>())
            plain += label->textFormat() == Qt::PlainText && !label->text().isEmpty() ? 1 : 0;
        QCOMPARE(plain, 2);
    }
};

THEMED_TEST_MAIN(TestMDialog)
#include "tst_mdialog.moc"
