// SPDX-License-Identifier: Apache-2.0
#include "state/userunits.h"

#include "journal/smallfile.h"

#include <QJsonDocument>

#include <sys/file.h>

namespace sandbox {

UserUnits::UserUnits(const StateDirectory &state)
    : m_path(state.units())
    , m_lock(m_path + QStringLiteral(".lock"))
{
    if (m_lock.open(QIODevice::WriteOnly))
        ::flock(m_lock.handle(), LOCK_EX);
    m_units = smallfile::readObject(m_path);
}

QStringList UserUnits::names()
{
    return {QStringLiteral("vesks"), QStringLiteral("mmcs")};
}

bool UserUnits::save() const
{
    return smallfile::write(m_path, QJsonDocument(m_units).toJson());
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
