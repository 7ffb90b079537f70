// SPDX-License-Identifier: Apache-2.0
#include "mtk/mswitchbutton.h"
#include "widgets/switchwidget.h"

#include <QLabel>
#include <QPushButton>
#include <QtTest>

using mcc::widgets::SwitchWidget;
using Mtk::Widget::MSwitchButton;

using Make = SwitchWidget *(*)();
Q_DECLARE_METATYPE(Make)
Q_DECLARE_METATYPE(Qt::MouseButton)

class TestSwitchWidget : public QObject
{
    Q_OBJECT

private Q_SLOTS:
    void mouse_data();
    void mouse();
    void spaceToggles();
    void codeChangesSilently();
    void titles_data();
    void titles();
};

namespace {

MSwitchButton *switchOf(const SwitchWidget &row)
{
    return row.findChild<MSwitchButton *>();
}

} // namespace

void TestSwitchWidget::mouse_data()
{
    QTest::addColumn<QString>("place");
    QTest::addColumn<Qt::MouseButton>("button");
    QTest::addColumn<int>("clicks");
    QTest::addColumn<int>("changes");
    QTest::newRow("switch") << QStringLiteral("switch") << Qt::LeftButton << 0 << 1;
    QTest::newRow("switch, right") << QStringLiteral("switch") << Qt::RightButton << 0 << 0;
    QTest::newRow("label") << QStringLiteral("label") << Qt::LeftButton << 1 << 0;
    QTest::newRow("label, right") << QStringLiteral("label") << Qt::RightButton << 1 << 0;
    QTest::newRow("margin, middle") << QStringLiteral("margin") << Qt::MiddleButton << 1 << 0;
}

void TestSwitchWidget::mouse()
{
    QFETCH(QString, place);
    QFETCH(Qt::MouseButton, button);
    SwitchWidget row(QStringLiteral("热点"));
    row.resize(300, row.height());
    row.show();
    QVERIFY(QTest::qWaitForWindowExposed(&row));
    QSignalSpy clicks(&row, &SwitchWidget::clicked);
    QSignalSpy changes(&row, &SwitchWidget::checkedChanged);

    const QPoint margin(3, row.height() / 2);
    const QPoint target = place == QStringLiteral("switch")  ? switchOf(row)->geometry().center()
                          : place == QStringLiteral("label") ? row.findChild<QLabel *>()->geometry().center()
                                                             : margin;
    QTest::mouseClick(row.windowHandle(), button, {}, target);
    QTEST(clicks.size(), "clicks");
    QTEST(changes.size(), "changes");
    QCOMPARE(row.checked(), !changes.isEmpty());
}

void TestSwitchWidget::spaceToggles()
{
    SwitchWidget row(QStringLiteral("热点"));
    row.show();
    row.activateWindow();
    QVERIFY(QTest::qWaitForWindowActive(&row));
    QSignalSpy clicks(&row, &SwitchWidget::clicked);
    QSignalSpy changes(&row, &SwitchWidget::checkedChanged);

    QTest::keyClick(row.windowHandle(), Qt::Key_Tab);
    QTest::keyClick(row.windowHandle(), Qt::Key_Space);
    QTest::keyClick(row.windowHandle(), Qt::Key_Space);
    const QList<QList<QVariant>> expected{{true}, {false}};
    QCOMPARE(static_cast<const QList<QList<QVariant>> &>(changes), expected);
    QCOMPARE(clicks.size(), 0);
}

void TestSwitchWidget::codeChangesSilently()
{
    SwitchWidget row(QStringLiteral("热点"));
    row.show();
    QSignalSpy changes(&row, &SwitchWidget::checkedChanged);
    const QImage off = row.grab().toImage();

    row.setChecked(true);
    QVERIFY(row.checked());
    QTRY_VERIFY2(row.grab().toImage() != off, "the switch still looks off");
    row.setChecked(false);
    QVERIFY(!row.checked());
    QTRY_VERIFY2(row.grab().toImage() == off, "the switch still looks on");
    QCOMPARE(changes.size(), 0);

    // And the user's next toggle is told again.
    switchOf(row)->click();
    QCOMPARE(changes.size(), 1);
}

void TestSwitchWidget::titles_data()
{
    QTest::addColumn<Make>("make");
    QTest::addColumn<QString>("title");
    QTest::addColumn<QString>("named");
    QTest::addColumn<bool>("takesTitle");
    const QString text = QStringLiteral("text");
    QTest::newRow("title") << Make([] { return new SwitchWidget(QStringLiteral("text")); }) << text << text
                           << true;
    QTest::newRow("label") << Make([] {
        return new SwitchWidget(nullptr, new QLabel(QStringLiteral("text")));
    }) << text << QString() << true;
    QTest::newRow("nothing") << Make([] { return new SwitchWidget; }) << QString() << QString() << true;
    QTest::newRow("no label") << Make([] { return new SwitchWidget(nullptr, new QPushButton); }) << QString()
                              << QString() << false;
}

void TestSwitchWidget::titles()
{
    QFETCH(Make, make);
    QFETCH(bool, takesTitle);
    const std::unique_ptr<SwitchWidget> row(make());
    QTEST(row->title(), "title");
    QTEST(switchOf(*row)->accessibleName(), "named");

    const QString longer =
        QStringLiteral("A title that is longer than the row is wide, so that it takes two lines");
    row->setTitle(longer);
    QCOMPARE(row->title(), takesTitle ? longer : QString());
    QCOMPARE(row->accessibleName(), longer);
    QCOMPARE(switchOf(*row)->accessibleName(), longer);
    QCOMPARE(row->height(), 36);
}

QTEST_MAIN(TestSwitchWidget)
#include "tst_switchwidget.moc"
