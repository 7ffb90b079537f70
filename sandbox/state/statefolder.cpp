// SPDX-License-Identifier: Apache-2.0
#include "state/statefolder.h"

namespace sandbox {

std::optional<StateFolder> StateFolder::fromEnvironment()
{
    const QString path = qEnvironmentVariable(kVariable);
    if (path.isEmpty())
        return std::nullopt;
    return StateFolder(path);
}

std::optional<Scenario> StateFolder::scenario(QString *error) const
{
    return Scenario::load(scenarioFile(), error);
}

} // namespace sandbox
