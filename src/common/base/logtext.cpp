// SPDX-License-Identifier: Apache-2.0
#include "logtext.h"

namespace vesk {
namespace base {

namespace {

bool isWithin(QChar character, ushort first, ushort last)
{
    return character.unicode() >= first && character.unicode() <= last;
}

bool isLineEndOrTab(QChar character)
{
    return isWithin(character, '\t', '\r') || character == QChar(0x85) || isWithin(character, 0x2028, 0x2029);
}

bool isControl(QChar character)
{
    return character.unicode() < 0x20 || isWithin(character, 0x7f, 0x9f) || character == QChar(0x61c) ||
           isWithin(character, 0x200e, 0x200f) || isWithin(character, 0x202a, 0x202e) ||
           isWithin(character, 0x2066, 0x2069);
}

bool isPair(const QString &text, int high)
{
    return high >= 0 && high + 1 < text.length() && text.at(high).isHighSurrogate() &&
           text.at(high + 1).isLowSurrogate();
}

QChar harmless(const QString &text, int position)
{
    const QChar character = text.at(position);
    if (isLineEndOrTab(character))
        return QLatin1Char(' ');
    const bool isAlone = character.isSurrogate() && !isPair(text, position) && !isPair(text, position - 1);
    return isAlone || isControl(character) ? QChar(QChar::ReplacementCharacter) : character;
}

} // namespace

QString logText(const QString &text)
{
    const QString kept = text.left(kMaxLogText);
    QString result;
    result.reserve(kept.length() + 1);
    for (int i = 0; i < kept.length(); ++i)
        result.append(harmless(kept, i));
    if (kept.length() < text.length())
        result.append(QChar(0x2026));
    return result;
}

} // namespace base
} // namespace vesk
