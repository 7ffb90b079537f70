// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "backend.h"

namespace sandbox {

// The same view by system call translation, for machines that grant no namespaces. It replaces paths and
// nothing more: the rest of the machine stays as writable as it is for the user.
class Proot : public Backend
{
public:
    QStringList commandLine(const View &view, const RunFolder &folder, const QStringList &stage) override;
    bool endsStragglers() const override { return false; }
    bool enter() const override;

    static QStringList trialArguments();
};

} // namespace sandbox
