// SPDX-License-Identifier: Apache-2.0
#include "mlabel.h"

namespace Mtk {
namespace Widget {

MLabel::MLabel(QWidget *parent, Qt::WindowFlags flags)
    : QLabel(parent, flags)
{
    setTextFormat(Qt::PlainText);
}

MLabel::~MLabel() = default;

} // namespace Widget
} // namespace Mtk
