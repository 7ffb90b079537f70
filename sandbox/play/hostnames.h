// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "state/statefolder.h"

namespace sandbox {

// The table of host names that the running program of a world sees, which is a copy of the world's own. Where
// the program has none of its own, nothing is written. The functions return what went wrong, or nothing.
namespace hostnames {

// Every name of the server leads to an address to which there is no way.
QString loseRoute(const StateFolder &state);
// The names of the server are in no table any more.
QString forget(const StateFolder &state);
QString restore(const StateFolder &state);

} // namespace hostnames

} // namespace sandbox
