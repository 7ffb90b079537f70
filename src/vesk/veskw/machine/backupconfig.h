// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QStringList>

// The desktop settings from before the join, in an INI file that another program of the product writes. Read
// once, when the terminal leaves.
namespace backupconfig {

// The control centre's pages; empty when the file cannot be read or does not name them.
QStringList controlCenterList();

} // namespace backupconfig
