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

DesktopChanges *load()
{
    QLibrary module(modulePath());
    module.setLoadHints(QLibrary::PreventUnloadHint);
    const auto function = reinterpret_cast<DesktopChangesFunction>(module.resolve(kDesktopChangesSymbol));
    if (function != nullptr)
        return function();
    qCritical() << "the desktop's settings stay as they are, module not loaded:" << module.errorString();
    return nullptr;
}

} // namespace

DesktopChanges &desktopChanges()
{
    static NoDesktop none;
    static DesktopChanges *loaded = nullptr;
    if (loaded == nullptr) // also after a failure, which may have been the moment's
        loaded = load();
    return loaded != nullptr ? *loaded : none;
}
