// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "figure.h"
#include "stage.h"

// A whole join in sandbox worlds that answer at once, by the program under a hand that types, and by the
// shell script that makes the same exchanges: instructions, time, how soon the program acts and paints, and
// what 200 failed attempts leave in its memory. `firstPaint`: instructions of its start, which are not the
// join's.
Figures measureJoin(const Stage &stage, double firstPaint);
