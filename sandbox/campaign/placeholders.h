// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "state/statedirectory.h"

#include <QMap>

namespace sandbox {

// What differs from world to world, and from row to row, in what an attempt sends and writes.
class Placeholders
{
public:
    // As they are when the attempt begins.
    // scenario: of the attempt; its "expect" may say under "values" what is sent in place of a usual value.
    Placeholders(const StateDirectory &state, const QJsonObject &scenario);

    // The text with each "{name}" filled in: percent-encoded after "=" in a request, as JSON has it after a
    // quotation mark, else as it is. Names that are not known stay.
    QString filled(const QString &text) const;

private:
    QMap<QString, QString> m_values; // by name
};

} // namespace sandbox
