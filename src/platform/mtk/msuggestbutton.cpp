// SPDX-License-Identifier: Apache-2.0
#include "msuggestbutton.h"

namespace Mtk {
namespace Widget {

MSuggestButton::MSuggestButton(QWidget *parent)
    : QPushButton(parent)
{
}

MSuggestButton::MSuggestButton(const QString &text, QWidget *parent)
    : QPushButton(text, parent)
{
}

MSuggestButton::~MSuggestButton() = default;

} // namespace Widget
} // namespace Mtk
