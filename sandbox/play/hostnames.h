// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QString>

namespace sandbox {

class World;

// The table of host names that the running program of a world sees, which is a copy of the world's own. Where
// the program has none of its own, nothing is written. The functions throw an Error.
namespace hostnames {

// Every name of the server leads to an address to which there is no way.
void loseRoute(World &world);
// The names of the server are in no table any more.
void forget(World &world);
void restore(World &world);

} // namespace hostnames

} // namespace sandbox
