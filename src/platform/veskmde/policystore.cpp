// SPDX-License-Identifier: Apache-2.0
#include "policystore.h"

namespace {

constexpr char kSchema[] = "com.morvek.vesk.mde-policy";
constexpr char kNotKept[] = "was not kept by the settings service";

QString about(const char *what, const char *key)
{
    return QStringLiteral("key %1 of %2 %3")
        .arg(QLatin1String(key), QLatin1String(kSchema), QLatin1String(what));
}

GSettingsSchema *lookUpSchema()
{
    // No source at all is what GLib makes of a machine without any schema.
    GSettingsSchemaSource *source = g_settings_schema_source_get_default();
    return source != nullptr ? g_settings_schema_source_lookup(source, kSchema, TRUE) : nullptr;
}

// GLib falls back to it where no other is installed; what it holds ends with the process.
bool isMemoryBackend(GSettings *settings)
{
    GSettingsBackend *found = nullptr;
    g_object_get(settings, "backend", &found, nullptr);
    const Owned<GSettingsBackend, g_object_unref> backend(found);
    return qstrcmp(G_OBJECT_TYPE_NAME(backend.get()), "GMemorySettingsBackend") == 0;
}

} // namespace

VariantPtr toVariant(bool value)
{
    return VariantPtr(g_variant_ref_sink(g_variant_new_boolean(value ? TRUE : FALSE)));
}

VariantPtr toVariant(const QStringList &value)
{
    GVariantBuilder list;
    g_variant_builder_init(&list, G_VARIANT_TYPE_STRING_ARRAY);
    for (const QString &text : value)
        g_variant_builder_add(&list, "s", text.toUtf8().constData());
    return VariantPtr(g_variant_ref_sink(g_variant_builder_end(&list)));
}

PolicyStore::PolicyStore()
    : m_schema(lookUpSchema())
{
    if (m_schema)
        m_settings.reset(g_settings_new_full(m_schema.get(), nullptr, nullptr));
}

QString PolicyStore::write(const std::vector<PolicyChange> &changes)
{
    QString reason = obstacle();
    for (const PolicyChange &change : changes) {
        if (reason.isEmpty())
            reason = obstacle(change);
    }
    if (!reason.isEmpty())
        return reason;

    for (const PolicyChange &change : changes) {
        if (g_settings_set_value(m_settings.get(), change.key, change.value.get()) == FALSE)
            return about(kNotKept, change.key);
    }
    g_settings_sync();

    // A service may take a value at first and then fail to keep it; after the sync it shows the old one
    // again.
    for (const PolicyChange &change : changes) {
        if (!holds(change))
            return about(kNotKept, change.key);
        const Owned<gchar, g_free> text(g_variant_print(change.value.get(), FALSE));
        qInfo("policy %s is %s", change.key, text.get());
    }
    return QString();
}

QString PolicyStore::obstacle() const
{
    if (!m_settings)
        return QStringLiteral("GSettings schema %1 is not installed").arg(QLatin1String(kSchema));
    if (isMemoryBackend(m_settings.get()))
        return QStringLiteral("there is no settings service that keeps values");
    return QString();
}

QString PolicyStore::obstacle(const PolicyChange &change) const
{
    if (g_settings_schema_has_key(m_schema.get(), change.key) == FALSE)
        return about("is not in the installed schema", change.key);

    const Owned<GSettingsSchemaKey, g_settings_schema_key_unref> key(
        g_settings_schema_get_key(m_schema.get(), change.key));
    if (!g_variant_is_of_type(change.value.get(), g_settings_schema_key_get_value_type(key.get())))
        return about("has another type in the installed schema", change.key);

    if (g_settings_is_writable(m_settings.get(), change.key) == FALSE)
        return about("cannot be changed: it is locked, or its place cannot be written to", change.key);
    return QString();
}

bool PolicyStore::holds(const PolicyChange &change) const
{
    const VariantPtr value(g_settings_get_value(m_settings.get(), change.key));
    return g_variant_equal(value.get(), change.value.get()) != FALSE;
}
