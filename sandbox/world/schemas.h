// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QStringList>

namespace sandbox {

// Compiles the settings schemas of this product into `folder`, without the keys named in `without`.
bool compileSchemas(const QString &folder, const QStringList &without, QString *error);

} // namespace sandbox
