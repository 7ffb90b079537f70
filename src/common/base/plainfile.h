// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QFile>
#include <QString>

namespace vesk {
namespace base {

// Opens the small text files of this product so that nothing that stands in their place can stop the program
// or eat its memory: no pipe is waited for, no device is read, and a file that is too long counts as one that
// cannot be opened. Links are followed. Used by all readers and writers of record, machine identity, host
// name and backup settings.
namespace plainfile {

// A thousand times what any of these files holds.
constexpr qint64 kLongest = 1024LL * 1024;

// Opens the file that `file` names as QFile::open() would with `mode`, which is ReadOnly or WriteOnly, with
// Truncate and Text as they are wanted; a written file is made with the usual mode and starts empty. False
// when that fails, with one warning when it is for another reason than QFile's own: no plain file, or too
// long to be read.
bool open(QFile &file, QIODevice::OpenMode mode);

// The content of a file opened for reading, of which more than kLongest bytes are never taken.
QByteArray readAll(QFile &file);

// Whether `path` could be opened for reading. Warns as open() does.
bool isReadable(const QString &path);

} // namespace plainfile
} // namespace base
} // namespace vesk
