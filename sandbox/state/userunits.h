// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "state/statedirectory.h"

#include <QFile>
#include <QJsonObject>
#include <QStringList>

namespace sandbox {

// The per-user services of a world, "vesks" and "mmcs", as the commands of the terminal change them and the
// launcher starts and ends them: {"vesks": {"enabled": true, "running": true}, ...}. Several processes come
// here at the same time, so the file stays locked for as long as the object lives.
class UserUnits
{
public:
    explicit UserUnits(const StateDirectory &state);

    static QStringList names();

    bool isEnabled(const QString &unit) const { return flag(unit, "enabled"); }
    bool isRunning(const QString &unit) const { return flag(unit, "running"); }
    void setEnabled(const QString &unit, bool enabled) { setFlag(unit, "enabled", enabled); }
    void setRunning(const QString &unit, bool running) { setFlag(unit, "running", running); }

    // False with one line in `error`, which may be null, when the file could not be written.
    bool save() const;

private:
    bool flag(const QString &unit, const char *name) const;
    void setFlag(const QString &unit, const char *name, bool value);

    QString m_path;
    QFile m_lock;
    QJsonObject m_units;
};

} // namespace sandbox
