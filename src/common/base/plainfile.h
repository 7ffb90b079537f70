// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QFile>
#include <QString>

namespace vesk {
namespace base {

// Opens files so that nothing that stands in their place can stop the program: no pipe is waited for, no
// device is read. Links are followed. The small text files of this product (record, machine identity, host
// name, backup settings) are read no further than a limit, so that none can eat the program's memory either.
namespace plainfile {

// A thousand times what any of these files holds.
constexpr qint64 kLongest = 1024LL * 1024;

// Opens the file that `file` names as QFile::open() does, in every mode. What is neither a regular file nor a
// folder is refused, with one warning. On failure error() and errorString() of `file` say why.
bool open(QFile &file, QIODevice::OpenMode mode);

// Whether an open file may be read whole. One that is too long is closed, with one warning, and then counts
// as one that cannot be opened.
bool isWithinLimit(QFile &file);

// Both of the above.
bool openToRead(QFile &file, QIODevice::OpenMode mode);

// The content of a file opened for reading, of which more than kLongest bytes are never taken.
QByteArray readAll(QFile &file);

// Whether `path` could be opened for reading. Warns as openToRead() does.
bool isReadable(const QString &path);

} // namespace plainfile
} // namespace base
} // namespace vesk
