// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "world/statefolder.h"

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
    explicit UserUnits(const StateFolder &state);

    static QStringList names();

    bool isEnabled(const QString &unit) const;
    bool isRunning(const QString &unit) const;
    void setEnabled(const QString &unit, bool enabled);
    void setRunning(const QString &unit, bool running);

    // False when the file could not be written.
    bool save() const;

private:
    bool flag(const QString &unit, const char *name) const;
    void setFlag(const QString &unit, const char *name, bool value);

    QString m_path;
    QFile m_lock;
    QJsonObject m_units;
};

} // namespace sandbox
