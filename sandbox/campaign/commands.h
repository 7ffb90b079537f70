// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QStringList>

namespace sandbox {

// `vesk-sandbox campaign ...`. arguments: of the whole process. Returns the exit code.
int runCampaign(const QStringList &arguments);

// `vesk-sandbox campaign-row ID --state FOLDER`, in which way the campaign starts itself for each row.
// Complaints go to standard output, one line each; none: exit code 0.
int runCampaignRow(const QStringList &arguments);

} // namespace sandbox
