// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QIcon>
#include <QStyle>

namespace Mtk {

// The icons for the kinds of messages: information, question, warning, error. Drawn at any size.
bool isMessageIcon(QStyle::StandardPixmap icon);
QIcon messageIcon(QStyle::StandardPixmap icon);

} // namespace Mtk
