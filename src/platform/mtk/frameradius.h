// SPDX-License-Identifier: Apache-2.0
#pragma once

class QWidget;

namespace Mtk {

// What MStyle::setFrameRadius set, 0 where it was not called.
int frameRadius(const QWidget *widget);

} // namespace Mtk
