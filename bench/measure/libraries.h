// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "figure.h"

#include <QStringList>

// Names of the shared libraries in the text of a /proc/PID/maps, without directory and version, in order,
// each once.
QStringList librariesIn(const QByteArray &maps);

// Those of `libraries` that are not among `baseline`, each with the reason why the first frame needs it.
// Counts those without a reason; the target is none.
Figure librariesFigure(const QString &page, const QStringList &libraries, const QStringList &baseline);
