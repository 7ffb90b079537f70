// SPDX-License-Identifier: Apache-2.0
#include "libveskmde.h"

#include "policystore.h"

#include <QDebug>

namespace {

QString logged(const char *setter, const QString &reason)
{
    if (!reason.isEmpty())
        qWarning().noquote() << setter << "failed:" << reason;
    return reason;
}

QString setSwitch(PolicyStore &store, const char *setter, const char *key, bool on)
{
    std::vector<PolicyChange> changes;
    changes.push_back({key, toVariant(on)});
    return logged(setter, store.write(changes));
}

} // namespace

Libveskmde::Libveskmde(QObject *parent)
    : QObject(parent)
    , m_store(std::make_unique<PolicyStore>())
{
}

Libveskmde::~Libveskmde() = default;

bool Libveskmde::SetControlConfig(const QStringList &shown, const QStringList &hidden)
{
    std::vector<PolicyChange> changes;
    changes.push_back({"control-center-shown", toVariant(shown)});
    changes.push_back({"control-center-hidden", toVariant(hidden)});
    return logged(__func__, m_store->write(changes)).isEmpty();
}

bool Libveskmde::SetHotspotEnable(int enable)
{
    if (enable != 0 && enable != 1) {
        logged(__func__, QStringLiteral("%1 is neither 0 nor 1").arg(enable));
        return false;
    }
    return setSwitch(*m_store, __func__, "hotspot-enabled", enable == 1).isEmpty();
}

QString Libveskmde::SetShortcutKeyEnable(bool enable)
{
    return setSwitch(*m_store, __func__, "shortcut-keys-enabled", enable);
}

QString Libveskmde::SetLauncherDisplayable(bool displayable)
{
    return setSwitch(*m_store, __func__, "launcher-displayed", displayable);
}

QString Libveskmde::SetTaskbarRightclickMenuEnable(bool enable)
{
    return setSwitch(*m_store, __func__, "taskbar-menu-enabled", enable);
}

QString Libveskmde::SetResidentTaskbarAppDisplayable(bool displayable)
{
    return setSwitch(*m_store, __func__, "resident-taskbar-apps-displayed", displayable);
}

QString Libveskmde::SetRecycleBinDisplayable(bool displayable)
{
    return setSwitch(*m_store, __func__, "recycle-bin-displayed", displayable);
}

QString Libveskmde::SetWebTrayIconClickable(bool clickable)
{
    return setSwitch(*m_store, __func__, "network-tray-icon-clickable", clickable);
}

QString Libveskmde::SetUsbTrayIconClickable(bool clickable)
{
    return setSwitch(*m_store, __func__, "usb-tray-icon-clickable", clickable);
}
