// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "desktop/desktopchanges.h"

// The desktop, loaded at the first call and kept until the process ends. Where the module is missing or
// unusable, one critical line says why, and the object returned knows no switch and changes nothing: a join
// or a removal goes on.
DesktopChanges &desktopChanges();
