// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QStringList>

namespace sandbox {

// Compiles the settings schemas of this product into `directory`, without the keys named in `without`.
bool compileSchemas(const QString &directory, const QStringList &without, QString *error);

} // namespace sandbox
