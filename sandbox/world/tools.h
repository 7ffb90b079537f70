// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QString>

namespace sandbox {

// Path of a program of this build or installation, which lies beside the running one or, for a test, in the
// folder of programs beside it. Null with one line in `error` when there is none.
QString findTool(const QString &name, QString *error);

} // namespace sandbox
