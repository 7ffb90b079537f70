// SPDX-License-Identifier: Apache-2.0
#include "campaign/preparation.h"

#include "campaign/jsonfile.h"
#include "campaign/overlay.h"
#include "scenario/strictobject.h"

namespace sandbox {

bool prepareFiles(const StateFolder &state, const QJsonObject &prepare, QString *error)
{
    try {
        StrictObject strict(prepare, QStringLiteral("prepare"));
        const QString record = state.inside(QStringLiteral("/etc/vesk/userinfo.json"));
        if (const auto patch = strict.object("record"))
            jsonfile::write(record, overlaid(jsonfile::read(record), *patch));
        strict.refuseOthers();
    } catch (const JsonTrouble &trouble) {
        *error = trouble.text;
    }
    return error->isEmpty();
}

} // namespace sandbox
