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

namespace {

MSwitchButton *switchOf(const SwitchWidget &row)
{
    return row.findChild<MSwitchButton *>();
}

} // namespace

class TestSwitchWidget : public QObject
{
    Q_OBJECT

private Q_SLOTS:
    // Presses of the switch toggle; those beside it are told as clicks. What code sets is not told at all.
    void mouse()
    {
        SwitchWidget row(QStringLiteral("热点"));
        row.resize(300, row.height());
        row.show();
        QVERIFY(QTest::qWaitForWindowExposed(&row));
        QSignalSpy clicks(&row, &SwitchWidget::clicked);
        QSignalSpy changes(&row, &SwitchWidget::checkedChanged);
        const auto press = [&row](const QPoint &place, Qt::MouseButton button) {
            QTest::mouseClick(row.windowHandle(), button, {}, place);
        };
        press(switchOf(row)->geometry().center(), Qt::LeftButton);
        press(switchOf(row)->geometry().center(), Qt::RightButton);
        QVERIFY(row.checked());
        QCOMPARE(clicks.size(), 0);
        press(row.findChild<QLabel *>()->geometry().center(), Qt::LeftButton);
        press(row.findChild<QLabel *>()->geometry().center(), Qt::RightButton);
        press(QPoint(3, row.height() / 2), Qt::MiddleButton);
        QCOMPARE(clicks.size(), 3);
        row.setChecked(false);
        QVERIFY(!row.checked());
        QCOMPARE(changes.size(), 1);
        switchOf(row)->click();
        QCOMPARE(changes.size(), 2);
    }

    void titles_data()
    {
        QTest::addColumn<Make>("make");
        QTest::addColumn<QString>("title");
        QTest::addColumn<QString>("named");
        QTest::addColumn<bool>("takesTitle");
        const QString text = QStringLiteral("text");
        QTest::newRow("title") << Make([] { return new SwitchWidget(QStringLiteral("text")); }) << text
                               << text << true;
        QTest::newRow("label") << Make([] {
            return new SwitchWidget(nullptr, new QLabel(QStringLiteral("text")));
        }) << text << QString() << true;
        QTest::newRow("nothing") << Make([] { return new SwitchWidget; }) << QString() << QString() << true;
        QTest::newRow("no label") << Make([] { return new SwitchWidget(nullptr, new QPushButton); })
                                  << QString() << QString() << false;
    }

    void titles()
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
};

QTEST_MAIN(TestSwitchWidget)
#include "tst_switchwidget.moc"
