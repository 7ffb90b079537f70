// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "state/statedirectory.h"

#include <QTemporaryDir>

#include <memory>

namespace sandbox {

// The directory in which the sockets of a world lie: short and private, below /tmp, since the path of a
// socket has little room and a state directory may lie anywhere. Everybody finds it by StateDirectory::run().
// Only the holder of the world's lock makes one.
class RuntimeDirectory
{
public:
    explicit RuntimeDirectory(StateDirectory state)
        : m_state(std::move(state))
    {
    }
    ~RuntimeDirectory() { remove(); }
    Q_DISABLE_COPY_MOVE(RuntimeDirectory)

    // Removes what a killed world has left, and makes a new one. Throws an Error.
    void make();
    // Removes it with all that is in it.
    void remove();

private:
    void removeStale() const;

    StateDirectory m_state;
    std::unique_ptr<QTemporaryDir> m_directory;
};

} // namespace sandbox
