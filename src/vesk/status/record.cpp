// SPDX-License-Identifier: Apache-2.0
#include "record.h"

#include "fileaccess.h"
#include "regularfile.h"

#include <QFile>
#include <QJsonDocument>

namespace regularfile = vesk::base::regularfile;

Record Record::read(const QString &path)
{
    const FileAccess access = FileAccess::of(path);
    if (access.isAbsent())
        return {State::Missing, {}};
    if (!access.isReadable())
        return {State::Unreadable, {}};
    QFile file(path);
    if (!regularfile::openToRead(file, QIODevice::ReadOnly))
        return {State::Refused, {}};
    const QByteArray content = regularfile::readAll(file);
    if (content.isEmpty())
        return {State::Empty, {}};
    const QJsonDocument document = QJsonDocument::fromJson(content);
    return document.isObject() ? Record{State::Whole, document.object()} : Record{State::Torn, {}};
}

Joined Record::joined() const
{
    if (state == State::Missing)
        return false;
    const QJsonValue flag = values.value(QLatin1String("is_Domain"));
    return flag.isBool() ? Joined(flag.toBool()) : std::nullopt;
}

QString Record::text(const char *key) const
{
    return values.value(QLatin1String(key)).toString();
}
