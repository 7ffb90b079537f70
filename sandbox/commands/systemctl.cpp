// SPDX-License-Identifier: Apache-2.0
#include "commandrun.h"

#include <QFile>
#include <QJsonDocument>
#include <QJsonObject>
#include <QSaveFile>

#include <sys/file.h>

namespace sandbox {

namespace {

// The per-user services of the world: {"vesks": {"enabled": true}, ...}. Several commands run at the same
// time, so the file is locked from reading to writing.
class Units
{
public:
    explicit Units(const QString &path)
        : m_path(path)
        , m_lock(path + QStringLiteral(".lock"))
    {
        if (m_lock.open(QIODevice::WriteOnly))
            ::flock(m_lock.handle(), LOCK_EX);
        QFile file(path);
        if (file.open(QIODevice::ReadOnly))
            m_units = QJsonDocument::fromJson(file.readAll()).object();
    }

    static bool isKnown(const QString &unit)
    {
        return unit == QLatin1String("vesks") || unit == QLatin1String("mmcs");
    }

    bool isEnabled(const QString &unit) const
    {
        return m_units.value(unit).toObject().value(QLatin1String("enabled")).toBool();
    }

    bool setEnabled(const QString &unit, bool enabled)
    {
        m_units.insert(unit, QJsonObject{{QStringLiteral("enabled"), enabled}});
        QSaveFile file(m_path);
        if (!file.open(QIODevice::WriteOnly))
            return false;
        file.write(QJsonDocument(m_units).toJson());
        return file.commit();
    }

private:
    QString m_path;
    QFile m_lock;
    QJsonObject m_units;
};

Outcome failure(const QString &text)
{
    return {1, {}, text.toUtf8() + '\n'};
}

Outcome apply(const QString &verb, const QString &unit, Units *units)
{
    if (!Units::isKnown(unit))
        return failure(
            QStringLiteral("Failed to %1 unit: Unit file %2.service does not exist.").arg(verb, unit));
    if (verb == QLatin1String("is-enabled")) {
        const bool enabled = units->isEnabled(unit);
        return {enabled ? 0 : 1, enabled ? "enabled\n" : "disabled\n", {}};
    }
    if (verb == QLatin1String("enable") || verb == QLatin1String("disable")) {
        const bool good = units->setEnabled(unit, verb == QLatin1String("enable"));
        return good ? Outcome{} : failure(QStringLiteral("Failed to %1 unit: cannot write").arg(verb));
    }
    if (verb == QLatin1String("stop"))
        return {}; // nothing of theirs runs in a world
    return failure(QStringLiteral("Unknown command verb %1.").arg(verb));
}

} // namespace

Outcome runSystemctl(const QStringList &arguments, const StateFolder &state)
{
    QStringList words = arguments;
    words.removeAll(QStringLiteral("--global"));
    if (words.size() != 2)
        return failure(QStringLiteral("usage: systemctl --global enable|disable|stop|is-enabled UNIT"));
    Units units(state.units());
    return apply(words.at(0), words.at(1), &units);
}

} // namespace sandbox
