// SPDX-License-Identifier: Apache-2.0
#include "mlabel.h"

namespace Mtk::Widget {

MLabel::MLabel(QWidget *parent, Qt::WindowFlags flags)
    : QLabel(parent, flags)
{
    setTextFormat(Qt::PlainText);
}

MLabel::~MLabel() = default;

} // namespace Mtk::Widget
