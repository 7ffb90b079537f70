// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QString>

namespace sandbox {

/// One deed beside a walk, on whichever instance of the program shows the thing. Each throws a Trouble when
/// nothing of the kind shows within some seconds.
namespace sidehand {

/// Presses the button with this text, enabled or not, and does not wait for what comes of it.
void press(const QString &program, const QString &button);

/// Closes the message box with this text by its button.
void answer(const QString &program, const QString &message);

} // namespace sidehand

} // namespace sandbox
