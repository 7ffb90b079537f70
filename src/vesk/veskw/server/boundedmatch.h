// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QString>

// What a foreign regular expression makes of a text. Such an expression is a program, which may crash or go
// on for hours: a forked child compiles and matches it, with a second of processor time and 384 MiB of
// memory; one that does not get on for one and a half seconds is ended. Time in which it waits for a
// processor counts for neither: a busy machine refuses no rule before thirty seconds are over. The child
// holds no file, lock or connection of this process and ends with it.
struct BoundedMatch
{
    enum class Verdict {
        Undecided, // the child crashed or reached a limit, or there was none
        Invalid,   // QRegExp::isValid() is false
        NoMatch,
        Match
    };

    Verdict verdict = Verdict::Undecided;
    int position = -1; // of a match, in characters
    int length = -1;   // of a match, in characters; QRegExp::matchedLength()
    QString failure;   // why it is undecided, for the log
};

// Does what QRegExp::indexIn() does with `pattern` (case-sensitive, syntax QRegExp::RegExp), `text`, offset 0
// and CaretAtZero. Blocks for some milliseconds as a rule, for two and a half seconds at most where
// processors are free, for thirty where they are not. Any pattern and text will do. No other thread may use
// QRegExp meanwhile: its cache has a lock, which the child could not get.
BoundedMatch matchInChild(const QString &pattern, const QString &text);
