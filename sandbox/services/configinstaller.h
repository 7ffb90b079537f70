// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "state/statedirectory.h"

namespace sandbox {

// Installs a terminal's record, CA, certificate and key from where the client stages them, and takes them
// away again. All four are checked before the first is touched; each is replaced atomically, the record last,
// so that a record that says "joined" never stands without its keys. Every file installed, removed or refused
// is journalled.
class ConfigInstaller
{
public:
    explicit ConfigInstaller(StateDirectory state)
        : m_state(std::move(state))
    {
    }

    bool prepare() const;
    bool install() const;
    // The staged record replaces the installed one; keys, certificate and CA are deleted.
    bool remove() const;

private:
    StateDirectory m_state;
};

} // namespace sandbox
