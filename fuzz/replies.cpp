// SPDX-License-Identifier: Apache-2.0
#include "replies.h"

#include <QStringList>

namespace fuzz {

QVector<QByteArray> partsOf(const QByteArray &input)
{
    QVector<QByteArray> parts;
    const QString text = QString::fromLatin1(input.constData(), input.size());
    for (const QString &part : text.split(QStringLiteral("\n====\n")))
        parts.append(part.toLatin1());
    return parts;
}

Reply replyOf(const QByteArray &part)
{
    const int lineEnd = part.indexOf('\n');
    if (lineEnd < 0)
        return {};
    const int status = qMax(0, part.left(lineEnd).toInt());
    return {status, status == 0 ? QString() : QString::fromUtf8(part.mid(lineEnd + 1))};
}

QVector<Reply> repliesOf(const QByteArray &input, int first)
{
    QVector<Reply> replies;
    const QVector<QByteArray> parts = partsOf(input);
    for (int i = first; i < parts.size(); ++i)
        replies.append(replyOf(parts.at(i)));
    return replies;
}

} // namespace fuzz
