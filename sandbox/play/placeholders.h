// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "state/statefolder.h"

#include <QJsonObject>

#include <optional>

namespace sandbox {

// What a table cannot know, since it differs from world to world, in the form in which the server sends it:
//     {ca}                the CA of the world
//     {cert} {key}        a new pair for this terminal, by that CA
//     {other_key}         a key that belongs to another certificate
class Placeholders
{
public:
    // The world's server has been started once, so that its CA is there.
    explicit Placeholders(StateFolder state)
        : m_state(std::move(state))
    {
    }

    // `object` with all of them filled in. Nothing, with one line in `error`, when the CA cannot be read.
    std::optional<QJsonObject> fill(const QJsonObject &object, QString *error) const;

private:
    StateFolder m_state;
};

} // namespace sandbox
