// SPDX-License-Identifier: Apache-2.0
#include "backupconfig.h"

#include "regularfile.h"
#include "wellknownpaths.h"

#include <QSettings>

namespace backupconfig {

QStringList controlCenterList()
{
    const QString path = QString::fromUtf8(vesk::kBackupConfigPath);
    // The settings class would wait at a pipe and read whatever a device gives.
    if (!vesk::base::regularfile::isReadable(path))
        return {};
    QSettings backup(path, QSettings::IniFormat);
    backup.beginGroup(QStringLiteral("config"));
    return backup.value(QStringLiteral("ControlCenterList")).toStringList();
}

} // namespace backupconfig
