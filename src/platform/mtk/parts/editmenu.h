// SPDX-License-Identifier: Apache-2.0
#pragma once

class QLineEdit;
class QMenu;

namespace Mtk::Widget {

// Qt's own context menu of `edit`, with the states that its actions have now, in Chinese. Deletes itself when
// it closes.
QMenu *editMenu(QLineEdit *edit);

} // namespace Mtk::Widget
