// SPDX-License-Identifier: Apache-2.0
#include "controlcenter.h"

#include <QGSettings/QGSettings>
#include <QStringList>
#include <QVariant>

namespace controlcenter {

namespace {

const char kSchema[] = "com.morvek.mde.control-center";
const char kPath[] = "/com/morvek/mde/control-center/";

// Keys in the form of the settings library.
QString autoLoginKey()
{
    return QStringLiteral("autoLoginVisable");
}

QString loginWithoutPasswordKey()
{
    return QStringLiteral("nopasswdLoginVisable");
}

void switchOff(QGSettings &settings, const QString &key)
{
    if (settings.keys().contains(key))
        settings.set(key, false);
}

} // namespace

bool hasAutoLoginSwitch()
{
    const QGSettings settings(kSchema, kPath);
    return settings.keys().contains(autoLoginKey());
}

void hideLoginSwitches()
{
    QGSettings settings(kSchema, kPath);
    switchOff(settings, autoLoginKey());
    switchOff(settings, loginWithoutPasswordKey());
}

} // namespace controlcenter
