// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QString>

// Every command line that the program runs. All are constant texts: nothing that a user or a server says ever
// reaches a command line. Results are not looked at unless a function returns one; a command that cannot be
// started or does not end in time leaves one warning in the log.
namespace commands {

// What "id" prints about the present user; empty when it cannot be started. Waits up to 30 s.
QString userIdentity();

// Takes the automatic-login and the login-without-password switch out of the control centre. Waits up to 30 s
// for each of the two.
void hideLoginSwitches();

// Enables the per-user services "vesks" and "mmcs" for all users; starts neither. Waits until both are done.
void enableUserServices();

// Stops and disables both services for all users. The four commands run on their own, in parallel with each
// other and with what follows.
void stopUserServices();

// Ends the service "mmcs" at once. Waits without limit; the exit code says whether one was running;
// negative: killall could not be started, or crashed.
extern const char kKillOlderService[];
int killOlderService();

} // namespace commands
