// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QStringList>

namespace sandbox {

// Compiles the settings schemas of this product into `directory`, without the keys named in `without`. Throws
// an Error.
void compileSchemas(const QString &directory, const QStringList &without);

} // namespace sandbox
