// SPDX-License-Identifier: Apache-2.0
// Settings schemas. A schema or key is looked up before it is used: GLib ends the process otherwise.
#include "collectors.h"

#include "owned.h"

#include <QJsonArray>
#include <QStringList>

#include <gio/gio.h>

namespace {

using Schema = Owned<GSettingsSchema, g_settings_schema_unref>;

constexpr char kControlCenter[] = "com.morvek.mde.control-center";
constexpr char kControlCenterPath[] = "/com/morvek/mde/control-center/";
constexpr char kPolicy[] = "com.morvek.vesk.mde-policy";
constexpr const char *kSwitches[] = {"auto-login-visable", "nopasswd-login-visable"};
constexpr const char *kPolicyKeys[] = {
    "control-center-shown",    "control-center-hidden",
    "hotspot-enabled",         "shortcut-keys-enabled",
    "launcher-displayed",      "taskbar-menu-enabled",
    "recycle-bin-displayed",   "network-tray-icon-clickable",
    "usb-tray-icon-clickable", "resident-taskbar-apps-displayed",
};

Schema lookUp(const char *name)
{
    GSettingsSchemaSource *source = g_settings_schema_source_get_default();
    return Schema(source != nullptr ? g_settings_schema_source_lookup(source, name, TRUE) : nullptr);
}

template <size_t count>
QStringList missingIn(const Schema &schema, const char *const (&keys)[count])
{
    QStringList missing;
    for (const char *key : keys) {
        if (g_settings_schema_has_key(schema.get(), key) == FALSE)
            missing.append(QLatin1String(key));
    }
    return missing;
}

// needsKeys: not a matter of the desktop. without: what follows where the schema is missing.
template <size_t count>
Finding schemaFinding(const char *name, const Schema &schema, const char *const (&keys)[count],
                      bool needsKeys, const QString &without)
{
    const QString key = QStringLiteral("schema:") + QLatin1String(name);
    const QString install = Text::tr("install vesk-mde-schemas, or what the desktop provides in its place");
    if (!schema)
        return Finding::fault(key, QStringLiteral("missing"), without, install);
    const QStringList missing = missingIn(schema, keys);
    const QJsonArray value = QJsonArray::fromStringList(missing);
    if (missing.isEmpty())
        return Finding::ok(key, value, Text::tr("is installed, with all keys"));
    const QString lacks = Text::tr("lacks the keys %1").arg(missing.join(QStringLiteral(", ")));
    return needsKeys ? Finding::fault(key, value, lacks, install) : Finding::none(key, value, lacks);
}

Findings switchFindings(const Schema &schema)
{
    Findings findings;
    // A schema without a path of its own needs one, and one that has a path takes no other.
    const char *path = g_settings_schema_get_path(schema.get()) == nullptr ? kControlCenterPath : nullptr;
    const Owned<GSettings, g_object_unref> settings(g_settings_new_full(schema.get(), nullptr, path));
    for (const char *name : kSwitches) {
        if (g_settings_schema_has_key(schema.get(), name) == FALSE)
            continue;
        const Owned<GVariant, g_variant_unref> value(g_settings_get_value(settings.get(), name));
        if (g_variant_is_of_type(value.get(), G_VARIANT_TYPE_BOOLEAN) == FALSE)
            continue;
        const bool isShown = g_variant_get_boolean(value.get()) != FALSE;
        findings += Finding::none(QStringLiteral("switch:") + QLatin1String(name), isShown,
                                  isShown ? Text::tr("this user sees the switch")
                                          : Text::tr("this user does not see the switch"));
    }
    return findings;
}

} // namespace

Findings desktopFindings()
{
    const Schema controlCenter = lookUp(kControlCenter);
    const Schema policy = lookUp(kPolicy);
    Findings findings{
        schemaFinding(kControlCenter, controlCenter, kSwitches, false,
                      Text::tr("is not installed: the enrolment program is aborted in a join or a leave")),
        schemaFinding(kPolicy, policy, kPolicyKeys, true,
                      Text::tr("is not installed: a leave does not restore the desktop"))};
    if (controlCenter)
        findings += switchFindings(controlCenter);
    return findings;
}
