// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "backend.h"

namespace sandbox {

// A private mount and process namespace made by bubblewrap. A mount point that the machine lacks cannot be
// made on a read-only root, so /, /etc, /usr and /usr/share are built anew and their entries bound one by
// one. What the command writes into /etc itself is gone with the run.
class Bubblewrap : public Backend
{
public:
    QStringList commandLine(const View &view, const RunFolder &folder, const QStringList &stage) override;
    bool endsStragglers() const override { return true; }

    static QStringList trialArguments();
};

} // namespace sandbox
