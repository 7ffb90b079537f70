// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QStringList>

// The desktop settings from before the join, in an INI file that another program of the product writes. Read
// once, when the terminal leaves.
namespace backupconfig {

// The control centre's pages; empty when the file cannot be read or does not name them. A file with a value
// of the types @Variant or @DateTime is not read, with one warning: the settings class would run out of
// memory on a damaged one.
QStringList controlCenterList();

} // namespace backupconfig
