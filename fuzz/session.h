// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QByteArray>

#include "targets.h"

namespace fuzz {

// Makes this process what a target needs: inside an isolated view, with an application, with its log caught,
// without a bus and without commands. Returns the target that the environment variable VESK_FUZZ_TARGET
// names. Ends the process with a line on standard error when the view or the target is missing.
Target openSession(int &argc, char **argv);

// One input, from a clean start: no log line and no scripted reply of the input before it is left.
void run(Target target, const QByteArray &input);

} // namespace fuzz
