// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QJsonArray>
#include <QJsonObject>
#include <QString>

#include <functional>
#include <optional>
#include <set>

namespace sandbox {

// Thrown by StrictObject and its users, caught where a file is read. `text` names the key, not the file.
struct JsonTrouble
{
    QString text;
};

// One JSON object of a hand-written file, read so that no slip goes unnoticed: a value of another type, a
// number out of its range and a key that nobody asked for are all a JsonTrouble. Used by the readers of
// scenarios and of the server's configuration. A key that is absent gives an empty optional.
class StrictObject
{
public:
    // `where` is the key path of this object ("server.endpoints"), empty for the top of a file.
    StrictObject(QJsonObject object, QString where);

    // The text of a file as its top object.
    static StrictObject parse(const QByteArray &text);

    std::optional<bool> flag(const char *key);
    std::optional<int> number(const char *key, int least, int most);
    std::optional<QString> text(const char *key);
    // A text out of a list of allowed ones.
    std::optional<QString> choice(const char *key, const QStringList &allowed);
    // A list of texts.
    std::optional<QStringList> texts(const char *key);
    std::optional<QJsonValue> value(const char *key);
    std::optional<QJsonObject> object(const char *key);

    // Calls `read` for the object at `key`, if there is one, and refuses what it leaves unread.
    void inside(const char *key, const std::function<void(StrictObject &)> &read);
    // Calls `read` for each object in the array at `key`. False when there is no such key.
    bool forEach(const char *key, const std::function<void(StrictObject &)> &read);
    // Calls `read` for each key of this object, which must all be in `allowed`, with its object.
    void forEachKey(const QStringList &allowed,
                    const std::function<void(const QString &, StrictObject &)> &read);

    // Refuses every key that has not been read.
    void refuseOthers() const;

    [[noreturn]] void refuse(const QString &key, const QString &why) const;

private:
    QString pathOf(const QString &key) const;
    std::optional<QJsonValue> take(const char *key, QJsonValue::Type type, const QString &expected);

    QJsonObject m_object;
    QString m_where;
    std::set<QString> m_read;
};

} // namespace sandbox
