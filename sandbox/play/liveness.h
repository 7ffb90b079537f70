// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QString>

namespace sandbox {

// Whether the program with this name answers a question about itself on the accessibility bus within the
// time: its event loop runs.
bool isAnswering(const QString &busAddress, const QString &program, int limitMs);

} // namespace sandbox
