// SPDX-License-Identifier: Apache-2.0
#include "desktopchanges.h"

#include "libveskmde.h"

#include <QGSettings/QGSettings>
#include <QVariant>

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

class InstalledDesktop final : public DesktopChanges
{
public:
    bool hasAutoLoginSwitch() override
    {
        const QGSettings settings(kSchema, kPath);
        return settings.keys().contains(autoLoginKey());
    }

    void hideLoginSwitches() override
    {
        QGSettings settings(kSchema, kPath);
        switchOff(settings, autoLoginKey());
        switchOff(settings, loginWithoutPasswordKey());
    }

    void liftRestrictions(const QStringList &controlCenterList) override
    {
        Libveskmde policy(nullptr);
        policy.SetControlConfig(controlCenterList, {QString()});
        policy.SetHotspotEnable(1);
        policy.SetShortcutKeyEnable(true);
        policy.SetLauncherDisplayable(true);
        policy.SetTaskbarRightclickMenuEnable(true);
        policy.SetResidentTaskbarAppDisplayable(true);
        policy.SetRecycleBinDisplayable(true);
        policy.SetWebTrayIconClickable(true);
        policy.SetUsbTrayIconClickable(true);
    }
};

} // namespace

extern "C" Q_DECL_EXPORT DesktopChanges *veskwDesktopChanges()
{
    static InstalledDesktop desktop;
    return &desktop;
}
