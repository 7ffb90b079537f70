// SPDX-License-Identifier: Apache-2.0
#include "mtk/mframe.h"
#include "widgets/settingsitem.h"

#include <QLabel>
#include <QVBoxLayout>
#include <QtTest>

using mcc::widgets::SettingsItem;
using Mtk::Widget::MFrame;

class TestSettingsItem : public QObject
{
    Q_OBJECT

private Q_SLOTS:
    void styleSheetFollowsError()
    {
        SettingsItem item(nullptr);
        item.setStyleSheet(
            QStringLiteral("mcc--widgets--SettingsItem { background: #00ff00 }"
                           "mcc--widgets--SettingsItem[isErr=\"true\"] { background: #ff0000 }"));
        item.resize(40, 40);
        const auto color = [&item] {
            return item.grab().toImage().pixelColor(20, 20);
        };
        QCOMPARE(color(), QColor(Qt::green));
        item.setIsErr(true);
        QCOMPARE(color(), QColor(Qt::red));
        item.setIsErr(false);
        QCOMPARE(color(), QColor(Qt::green));
    }

    void backgroundFillsRow()
    {
        for (const bool shownBefore : {false, true}) {
            SettingsItem item(nullptr);
            auto *content = new QLabel;
            (new QVBoxLayout(&item))->addWidget(content);
            item.resize(200, 50);
            item.setVisible(shownBefore);

            item.addBackground();
            item.show();
            auto *background = item.findChild<MFrame *>();
            QVERIFY(background && background->isVisible());
            QCOMPARE(background->geometry(), item.rect());
            QVERIFY2(item.children().indexOf(background) < item.children().indexOf(content),
                     "it covers the content");

            item.resize(320, 44);
            QCOMPARE(background->geometry(), item.rect());
        }
    }
};

QTEST_MAIN(TestSettingsItem)
#include "tst_settingsitem.moc"
