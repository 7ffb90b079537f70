// SPDX-License-Identifier: Apache-2.0
#include "widgets/translucentframe.h"

namespace mcc::widgets {

TranslucentFrame::TranslucentFrame(QWidget *parent)
    : QFrame(parent)
{
}

} // namespace mcc::widgets
