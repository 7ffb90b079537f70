// SPDX-License-Identifier: Apache-2.0
#include "logtext.h"

#include <QVector>

#include <algorithm>

namespace vesk::base {

namespace {

constexpr uint kEllipsis = 0x2026;

bool isWithin(uint character, uint first, uint last)
{
    return character >= first && character <= last;
}

bool isLineEndOrTab(uint character)
{
    return isWithin(character, '\t', '\r') || character == 0x85 || isWithin(character, 0x2028, 0x2029);
}

bool isInvisible(uint character)
{
    return character < 0x20 || isWithin(character, 0x7f, 0x9f) || character == 0x61c ||
           isWithin(character, 0x200e, 0x200f) || isWithin(character, 0x202a, 0x202e) ||
           isWithin(character, 0x2066, 0x2069);
}

uint harmless(uint character)
{
    if (isLineEndOrTab(character))
        return ' ';
    return isInvisible(character) ? uint(QChar::ReplacementCharacter) : character;
}

} // namespace

bool isControl(uint character)
{
    return isLineEndOrTab(character) || isInvisible(character);
}

QString logText(const QString &text)
{
    // toUcs4() replaces surrogates without a partner; fromUcs4() takes away the byte order mark at the start.
    QVector<uint> characters = (QChar(QChar::ByteOrderMark) + text.left(kMaxLogText)).toUcs4();
    std::transform(characters.cbegin(), characters.cend(), characters.begin(), harmless);
    if (text.length() > kMaxLogText)
        characters.append(kEllipsis);
    return QString::fromUcs4(characters.constData(), characters.size());
}

} // namespace vesk::base
