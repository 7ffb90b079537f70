// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "figure.h"
#include "stage.h"

// From exec to the first frame: instructions, memory, libraries and time of the program, for a terminal
// that has not joined ("server page") and for one that has ("leave panel"), beside the bare windows of
// bench-bare and, for memory, the dialog of a scripting tool where that is installed. `firstPaint` gets the
// instructions up to the server page.
Figures measureStart(const Stage &stage, double *firstPaint);
