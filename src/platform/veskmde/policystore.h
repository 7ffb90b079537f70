// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QString>
#include <QStringList>

#include <gio/gio.h>

#include <memory>
#include <type_traits>
#include <vector>

// An object of GLib, and the function that gives up its reference.
template <typename Object, auto unref>
using Owned = std::unique_ptr<Object, std::integral_constant<decltype(unref), unref>>;
using VariantPtr = Owned<GVariant, g_variant_unref>;

VariantPtr toVariant(bool value);
VariantPtr toVariant(const QStringList &value);

// One key of the policy and what it becomes.
struct PolicyChange
{
    const char *key;
    VariantPtr value;
};

// The keys of the desktop policy in GSettings, written so that a missing schema, a key that it doesn't know
// or a lock is an answer and never the end of the process, which GLib would make of the first two. Libveskmde
// alone uses it.
class PolicyStore
{
public:
    PolicyStore();

    // Makes all changes, or none when one of them is known beforehand to fail. Returns when the settings
    // service has taken them: an empty text, or the reason why not.
    QString write(const std::vector<PolicyChange> &changes);

private:
    QString obstacle() const;
    QString obstacle(const PolicyChange &change) const;
    bool holds(const PolicyChange &change) const;

    Owned<GSettingsSchema, g_settings_schema_unref> m_schema; // null where it is not installed
    Owned<GSettings, g_object_unref> m_settings;              // null without schema
};
