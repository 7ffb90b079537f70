// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QFrame>

namespace mcc::widgets {

// A plain frame with a name of its own, so that a style sheet can select it. It sets no look itself.
class TranslucentFrame : public QFrame
{
    Q_OBJECT

public:
    explicit TranslucentFrame(QWidget *parent = nullptr);
};

} // namespace mcc::widgets
