// SPDX-License-Identifier: Apache-2.0
#include "gallerywindow.h"

#include "section.h"

#include "mtk/marrowrectangle.h"
#include "mtk/mlabel.h"
#include "mtk/mtitlebar.h"
#include "mtk/mwindowmanagerhelper.h"

#include <QPushButton>
#include <QScrollArea>
#include <QStyle>
#include <QVBoxLayout>

namespace Gallery {

GalleryWindow::GalleryWindow()
{
    setWindowTitle(QStringLiteral("控件一览"));
    auto *bar = new Mtk::Widget::MTitlebar(this);
    bar->setBackgroundTransparent(true);

    auto *area = new QScrollArea(this);
    area->setFrameShape(QFrame::NoFrame);
    area->setWidget(sections());
    area->setWidgetResizable(true);
    area->viewport()->setAutoFillBackground(false);
    area->widget()->setAutoFillBackground(false);

    auto *column = new QVBoxLayout(this);
    column->setContentsMargins(0, 0, 0, 0);
    column->setSpacing(0);
    column->addWidget(bar);
    column->addWidget(area);
    resize(area->widget()->sizeHint().width() + style()->pixelMetric(QStyle::PM_ScrollBarExtent), 760);
    if (!Mtk::Gui::MWindowManagerHelper::instance()->hasBlurWindow())
        setMaskAlpha(255);
}

GalleryWindow::~GalleryWindow() = default;

QWidget *GalleryWindow::sections()
{
    auto *page = new QWidget;
    auto *column = new QVBoxLayout(page);
    for (const Section &section : controlSections() + surfaceSections()) {
        QWidget *widget = section.make();
        if (widget->windowType() != Qt::Popup && !widget->windowFlags().testFlag(Qt::FramelessWindowHint)) {
            auto *title = new Mtk::Widget::MLabel;
            title->setText(section.title);
            column->addWidget(title);
            column->addWidget(widget, 0, Qt::AlignLeft);
            continue;
        }
        delete widget;
        auto *button = new QPushButton(section.title);
        connect(button, &QPushButton::clicked, this, [this, section, button] { open(section, button); });
        column->addWidget(button, 0, Qt::AlignLeft);
    }
    return page;
}

void GalleryWindow::open(const Section &section, QWidget *button)
{
    delete m_opened;
    m_opened = section.make();
    m_opened->setAttribute(Qt::WA_DeleteOnClose);
    const QPoint below = button->mapToGlobal({0, button->height()});
    if (auto *popup = qobject_cast<Mtk::Widget::MArrowRectangle *>(m_opened.data())) {
        popup->show(below.x(), below.y());
        return;
    }
    if (m_opened->windowType() == Qt::Popup)
        m_opened->move(below);
    m_opened->show();
}

} // namespace Gallery
