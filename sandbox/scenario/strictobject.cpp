// SPDX-License-Identifier: Apache-2.0
#include "scenario/strictobject.h"

#include <QJsonDocument>

#include <cmath>

namespace sandbox {

namespace {

// A key may hold any character.
QString onOneLine(QString path)
{
    for (QChar &character : path) {
        if (!character.isPrint())
            character = QLatin1Char('?');
    }
    return path;
}

} // namespace

StrictObject::StrictObject(QJsonObject object, QString where)
    : m_object(std::move(object))
    , m_where(std::move(where))
{
}

StrictObject StrictObject::parse(const QByteArray &text)
{
    QJsonParseError error;
    const QJsonDocument document = QJsonDocument::fromJson(text, &error);
    if (error.error != QJsonParseError::NoError) {
        const auto line = text.left(error.offset).count('\n') + 1;
        throw JsonTrouble{QStringLiteral("line %1 is no JSON: %2").arg(line).arg(error.errorString())};
    }
    if (!document.isObject())
        throw JsonTrouble{QStringLiteral("the top is not an object")};
    return {document.object(), QString()};
}

std::optional<bool> StrictObject::flag(const char *key)
{
    const auto value = take(key, QJsonValue::Bool, QStringLiteral("true or false"));
    return value ? std::optional(value->toBool()) : std::nullopt;
}

std::optional<int> StrictObject::number(const char *key, int least, int most)
{
    const QString expected = QStringLiteral("a whole number from %1 to %2").arg(least).arg(most);
    const auto value = take(key, QJsonValue::Double, expected);
    if (!value)
        return std::nullopt;
    const double number = value->toDouble();
    if (std::floor(number) != number || number < least || number > most)
        refuse(QLatin1String(key), QStringLiteral("is not %1").arg(expected));
    return static_cast<int>(number);
}

std::optional<QString> StrictObject::text(const char *key)
{
    const auto value = take(key, QJsonValue::String, QStringLiteral("a text"));
    return value ? std::optional(value->toString()) : std::nullopt;
}

std::optional<QString> StrictObject::choice(const char *key, const QStringList &allowed)
{
    auto value = text(key);
    if (value && !allowed.contains(*value))
        refuse(QLatin1String(key), QStringLiteral("is none of %1").arg(allowed.join(QStringLiteral(", "))));
    return value;
}

std::optional<QStringList> StrictObject::texts(const char *key)
{
    const auto value = take(key, QJsonValue::Array, QStringLiteral("a list of texts"));
    if (!value)
        return std::nullopt;
    QStringList result;
    const QJsonArray array = value->toArray();
    for (const QJsonValue &element : array) {
        if (!element.isString())
            refuse(QLatin1String(key), QStringLiteral("is not a list of texts"));
        result += element.toString();
    }
    return result;
}

std::optional<QJsonValue> StrictObject::value(const char *key)
{
    const QString name = QLatin1String(key);
    m_read.insert(name);
    return m_object.contains(name) ? std::optional(m_object.value(name)) : std::nullopt;
}

std::optional<QJsonObject> StrictObject::object(const char *key)
{
    const auto value = take(key, QJsonValue::Object, QStringLiteral("an object"));
    return value ? std::optional(value->toObject()) : std::nullopt;
}

void StrictObject::inside(const char *key, const std::function<void(StrictObject &)> &read)
{
    const auto inner = object(key);
    if (!inner)
        return;
    StrictObject strict(*inner, pathOf(QLatin1String(key)));
    read(strict);
    strict.refuseOthers();
}

bool StrictObject::forEach(const char *key, const std::function<void(StrictObject &)> &read)
{
    const auto value = take(key, QJsonValue::Array, QStringLiteral("a list of objects"));
    if (!value)
        return false;
    const QJsonArray array = value->toArray();
    for (int index = 0; index < array.size(); ++index) {
        const QString name = QStringLiteral("%1[%2]").arg(QLatin1String(key)).arg(index);
        if (!array.at(index).isObject())
            refuse(name, QStringLiteral("is not an object"));
        StrictObject strict(array.at(index).toObject(), pathOf(name));
        read(strict);
        strict.refuseOthers();
    }
    return true;
}

void StrictObject::forEachKey(const QStringList &allowed,
                              const std::function<void(const QString &, StrictObject &)> &read)
{
    const QStringList keys = m_object.keys();
    for (const QString &key : keys) {
        if (!allowed.contains(key))
            refuse(key, QStringLiteral("is unknown; known are %1").arg(allowed.join(QStringLiteral(", "))));
        inside(key.toLatin1().constData(), [&](StrictObject &inner) { read(key, inner); });
    }
}

void StrictObject::refuseOthers() const
{
    const QStringList keys = m_object.keys();
    for (const QString &key : keys) {
        if (m_read.count(key) == 0)
            refuse(key, QStringLiteral("is unknown here"));
    }
}

void StrictObject::refuse(const QString &key, const QString &why) const
{
    throw JsonTrouble{QStringLiteral("\"%1\" %2").arg(onOneLine(pathOf(key)), why)};
}

QString StrictObject::pathOf(const QString &key) const
{
    return m_where.isEmpty() ? key : m_where + QLatin1Char('.') + key;
}

std::optional<QJsonValue> StrictObject::take(const char *key, QJsonValue::Type type, const QString &expected)
{
    auto found = value(key);
    if (found && found->type() != type)
        refuse(QLatin1String(key), QStringLiteral("is not %1").arg(expected));
    return found;
}

} // namespace sandbox
