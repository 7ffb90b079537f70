// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QStringList>

// What the program looks at and changes on the user's desktop, through the settings library and the policy
// library. Both bring libraries of their own that the first paint has no use for, so this class is
// implemented in a module that is loaded when it is first asked for (see desktopmodule.h). Main thread only.
//
// The control centre's schema, "com.morvek.mde.control-center", has to be installed: the settings library
// ends the process otherwise. The packages see to that.
class DesktopChanges
{
public:
    // Whether this desktop's control centre knows the automatic-login switch.
    virtual bool hasAutoLoginSwitch() = 0;

    // Takes the automatic-login and the login-without-password switch out of the control centre, each one if
    // the schema has it.
    virtual void hideLoginSwitches() = 0;

    // Gives the user the control centre's pages of `controlCenterList` and all other parts of the desktop
    // back. No step reports to the caller; the policy library logs what fails.
    virtual void liftRestrictions(const QStringList &controlCenterList) = 0;

protected:
    ~DesktopChanges() = default;
};

// What the module exports: a function without arguments that gives the one object, which is never deleted.
using DesktopChangesFunction = DesktopChanges *(*)();
constexpr char kDesktopChangesSymbol[] = "veskwDesktopChanges";
