// SPDX-License-Identifier: Apache-2.0
#pragma once

// The settings of the control centre that the program looks at and changes, schema
// "com.morvek.mde.control-center". The schema has to be installed: the settings library ends the process
// otherwise. The packages see to that.
namespace controlcenter {

// Whether this desktop's control centre knows the automatic-login switch.
bool hasAutoLoginSwitch();

// Takes the automatic-login and the login-without-password switch out of the control centre, each one if the
// schema has it.
void hideLoginSwitches();

} // namespace controlcenter
