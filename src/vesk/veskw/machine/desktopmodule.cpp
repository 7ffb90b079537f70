// SPDX-License-Identifier: Apache-2.0
#include "desktopmodule.h"

#include <QCoreApplication>
#include <QLibrary>

#include <QDebug>

namespace {

class NoDesktop final : public DesktopChanges
{
public:
    bool hasAutoLoginSwitch() override { return false; }

    void hideLoginSwitches() override {}
    void liftRestrictions(const QStringList & /*controlCenterList*/) override {}
};

// The same in a build directory and below /usr.
QString modulePath()
{
    return QCoreApplication::applicationDirPath() + QStringLiteral("/../lib/veskw/libveskw-desktop.so");
}

DesktopChanges &load()
{
    static NoDesktop none;
    QLibrary module(modulePath());
    module.setLoadHints(QLibrary::PreventUnloadHint);
    const auto function = reinterpret_cast<DesktopChangesFunction>(module.resolve(kDesktopChangesSymbol));
    if (function != nullptr)
        return *function();
    qCritical() << "the desktop's settings stay as they are, module not loaded:" << module.errorString();
    return none;
}

} // namespace

DesktopChanges &desktopChanges()
{
    static DesktopChanges &loaded = load();
    return loaded;
}
