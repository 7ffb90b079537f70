// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QObject>
#include <QString>
#include <QStringList>

#include <memory>

#if defined(VESKMDE_LIBRARY)
#define VESKMDE_EXPORT Q_DECL_EXPORT
#else
#define VESKMDE_EXPORT Q_DECL_IMPORT
#endif

class PolicyStore;

// What a managed desktop lets its user do: nine setters, one for each feature. The library keeps the policy
// of the session's user in the GSettings schema that it brings, com.morvek.vesk.mde-policy, one key for each
// setter's argument. It changes no desktop itself: a desktop reads the keys and follows them. Services of the
// product call it when a terminal comes under control or leaves it.
//
// Each setter returns when the settings service has taken the value, and leaves a warning in the log when
// that failed: schema not installed, key unknown to an older schema or locked by the administrator, a place
// that cannot be written to, no settings service that keeps values. Seven setters return the reason in
// English, and an empty text when all went well; the two others return whether it did. The process goes on in
// every case, and one failure does not stop the next setter. Setting the value that a key has already
// succeeds, unless the key is locked.
//
// An object is used from one thread; several objects may exist, all working on the same keys.
class VESKMDE_EXPORT Libveskmde : public QObject
{
    Q_OBJECT

public:
    // `parent`, which may be null, owns the object.
    explicit Libveskmde(QObject *parent = nullptr);
    ~Libveskmde() override;

    // Which pages the control centre offers: those of `shown`, all of them where it is empty, less those of
    // `hidden`. An empty text in a list names no page. Both lists are written, or neither when one of their
    // keys is locked.
    bool SetControlConfig(const QStringList &shown, const QStringList &hidden);
    // Whether the terminal may become a hotspot: 1 allows it, 0 does not, any other number is refused.
    bool SetHotspotEnable(int enable);

    // System-wide keyboard shortcuts.
    QString SetShortcutKeyEnable(bool enable);
    // The launcher, from which applications are started.
    QString SetLauncherDisplayable(bool displayable);
    // The menu that a right click on the taskbar opens.
    QString SetTaskbarRightclickMenuEnable(bool enable);
    // Applications that are pinned to the taskbar.
    QString SetResidentTaskbarAppDisplayable(bool displayable);
    // The recycle bin.
    QString SetRecycleBinDisplayable(bool displayable);
    // The network's icon in the tray: whether it answers to clicks.
    QString SetWebTrayIconClickable(bool clickable);
    // The icon of plugged-in USB devices in the tray: whether it answers to clicks.
    QString SetUsbTrayIconClickable(bool clickable);

private:
    Q_DISABLE_COPY(Libveskmde)

    std::unique_ptr<PolicyStore> m_store;
};
