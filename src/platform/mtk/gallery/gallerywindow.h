// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "mtk/mblureffectwidget.h"

#include <QPointer>

namespace Gallery {

struct Section;

// All sections below each other. Windows among them open from a button.
class GalleryWindow : public Mtk::Widget::MBlurEffectWidget
{
    Q_OBJECT

public:
    GalleryWindow();
    ~GalleryWindow() override;

private:
    QWidget *sections();
    void open(const Section &section, QWidget *button);

    QPointer<QWidget> m_opened; // window that was opened last
};

} // namespace Gallery
