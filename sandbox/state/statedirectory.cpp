// SPDX-License-Identifier: Apache-2.0
#include "state/statedirectory.h"

namespace sandbox {

std::optional<StateDirectory> StateDirectory::fromEnvironment()
{
    const QString path = qEnvironmentVariable(kVariable);
    if (path.isEmpty())
        return std::nullopt;
    return StateDirectory(path);
}

std::optional<Scenario> StateDirectory::scenario(QString *error) const
{
    return Scenario::load(scenarioFile(), error);
}

} // namespace sandbox
