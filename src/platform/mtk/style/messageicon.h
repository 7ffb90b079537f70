// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QIcon>
#include <QStyle>

namespace Mtk {

// The icons that tell what kind a message is: information, question, warning, error. Drawn at the size that
// is asked for.
bool isMessageIcon(QStyle::StandardPixmap icon);
QIcon messageIcon(QStyle::StandardPixmap icon);

} // namespace Mtk
