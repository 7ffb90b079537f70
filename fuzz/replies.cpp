// SPDX-License-Identifier: Apache-2.0
#include "replies.h"

namespace fuzz {

QVector<QByteArray> partsOf(const QByteArray &input)
{
    constexpr char kSeparator[] = "\n====\n";
    constexpr int kSeparatorLength = sizeof(kSeparator) - 1;
    QVector<QByteArray> parts;
    int from = 0;
    for (int at = input.indexOf(kSeparator); at >= 0; at = input.indexOf(kSeparator, from)) {
        parts.append(input.mid(from, at - from));
        from = at + kSeparatorLength;
    }
    parts.append(input.mid(from));
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
