// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QByteArray>

namespace sandbox::data {

// A file of this directory, which every program of the sandbox has in it: the schema of scenarios, templates.
QByteArray read(const char *name);

} // namespace sandbox::data
