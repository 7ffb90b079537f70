// SPDX-License-Identifier: Apache-2.0
#include "userunits.h"

#include <QJsonDocument>
#include <QSaveFile>

#include <sys/file.h>

namespace sandbox {

UserUnits::UserUnits(const StateFolder &state)
    : m_path(state.units())
    , m_lock(m_path + QStringLiteral(".lock"))
{
    if (m_lock.open(QIODevice::WriteOnly))
        ::flock(m_lock.handle(), LOCK_EX);
    QFile file(m_path);
    if (file.open(QIODevice::ReadOnly))
        m_units = QJsonDocument::fromJson(file.readAll()).object();
}

QStringList UserUnits::names()
{
    return {QStringLiteral("vesks"), QStringLiteral("mmcs")};
}

bool UserUnits::isEnabled(const QString &unit) const
{
    return flag(unit, "enabled");
}

bool UserUnits::isRunning(const QString &unit) const
{
    return flag(unit, "running");
}

void UserUnits::setEnabled(const QString &unit, bool enabled)
{
    setFlag(unit, "enabled", enabled);
}

void UserUnits::setRunning(const QString &unit, bool running)
{
    setFlag(unit, "running", running);
}

bool UserUnits::save() const
{
    QSaveFile file(m_path);
    if (!file.open(QIODevice::WriteOnly))
        return false;
    file.write(QJsonDocument(m_units).toJson());
    return file.commit();
}

bool UserUnits::flag(const QString &unit, const char *name) const
{
    return m_units.value(unit).toObject().value(QLatin1String(name)).toBool();
}

void UserUnits::setFlag(const QString &unit, const char *name, bool value)
{
    QJsonObject flags = m_units.value(unit).toObject();
    flags.insert(QLatin1String(name), value);
    m_units.insert(unit, flags);
}

} // namespace sandbox
