// SPDX-License-Identifier: Apache-2.0
#pragma once

namespace Mtk {

// Watches over the construction of an application object. Qt ends a process that finds no display with an
// abort and a core dump; between construction and finish() of this object that becomes one critical message
// and status 1. What the platform plugin warns of meanwhile is held back, and passed on when the start
// succeeds.
class PlatformStart
{
public:
    static void begin();
    static void finish();
};

} // namespace Mtk
