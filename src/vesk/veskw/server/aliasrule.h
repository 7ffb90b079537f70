// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QString>

#include <optional>

// How the server's answers about terminal aliases are read and its rule is applied. Where a function fails or
// refuses, `message` is what to show to the user.
namespace aliasrule {

// The rule in the reply of the rule endpoint, empty where the server has none; no value for a reply that is
// not understood. Only the text decides, whatever the status of the reply was.
std::optional<QString> read(const QString &reply, QString &message);

// Whether `name` as a whole obeys `rule`, a regular expression, with slashes around it or without. A rule
// that is nothing but slashes is obeyed by none, and `message` stays untouched. Blocks for two seconds at
// most, while what the user does is discarded.
bool isObeyed(const QString &rule, const QString &name, QString &message);

// The server's own verdict on a name; `message` receives its words on acceptance too.
bool isAccepted(int statusCode, const QString &reply, QString &message);

} // namespace aliasrule
