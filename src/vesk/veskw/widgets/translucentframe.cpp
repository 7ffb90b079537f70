// SPDX-License-Identifier: Apache-2.0
#include "widgets/translucentframe.h"

namespace mcc {
namespace widgets {

TranslucentFrame::TranslucentFrame(QWidget *parent)
    : QFrame(parent)
{
}

} // namespace widgets
} // namespace mcc
