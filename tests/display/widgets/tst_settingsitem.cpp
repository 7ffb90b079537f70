// SPDX-License-Identifier: Apache-2.0
#include "mtk/mframe.h"
#include "widgets/labels.h"
#include "widgets/settingsitem.h"

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

    void secondBackgroundReplacesFirst()
    {
        SettingsItem item(nullptr);
        item.show();
        item.addBackground();
        const QPointer<MFrame> first = item.findChild<MFrame *>();
        item.addBackground();
        QCoreApplication::sendPostedEvents(nullptr, QEvent::DeferredDelete);

        QVERIFY(first.isNull());
        QCOMPARE(item.findChildren<MFrame *>().size(), 1);
        item.resize(190, 90);
        QCOMPARE(item.findChild<MFrame *>()->size(), QSize(190, 90));
    }

    void styleSheetsTellLabelsApart()
    {
        QWidget window;
        window.setStyleSheet(QStringLiteral("mcc--widgets--LargeLabel { color: #000001 }"
                                            "mcc--widgets--NormalLabel { color: #000002 }"
                                            "mcc--widgets--SmallLabel { color: #000003; margin: 5px }"
                                            "mcc--widgets--TipsLabel { color: #000004 }"));
        QLabel *const labels[] = {
            new mcc::widgets::LargeLabel(&window), new mcc::widgets::NormalLabel(&window),
            new mcc::widgets::SmallLabel(&window), new mcc::widgets::TipsLabel(&window)};
        int kind = 0;
        for (QLabel *label : labels) {
            label->ensurePolished();
            QCOMPARE(label->palette().color(QPalette::WindowText).blue(), ++kind);
        }
        QVERIFY2(labels[3]->minimumSizeHint().width() >= 10, "TipsLabel is no SmallLabel");
    }
};

QTEST_MAIN(TestSettingsItem)
#include "tst_settingsitem.moc"
