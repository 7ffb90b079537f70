// SPDX-License-Identifier: Apache-2.0
#pragma once

// Watches over the construction of an application object. Qt ends a process that finds no display with an
// abort and a core dump; between begin() and finish() that becomes one critical message and status 1.
// Meanwhile warnings of the platform plugin are held back; they are logged when the start succeeds.
namespace Mtk::PlatformStart {

void begin();
void finish();

} // namespace Mtk::PlatformStart
