// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QDir>
#include <QFile>
#include <QString>

// Opens and makes files so that nothing that stands in their place can do harm.
namespace vesk::base::regularfile {

// Reading. No pipe is waited for and no device is read; links are followed. The small text files of this
// product (record, machine identity, host name, backup settings) are read no further than a limit, so that
// none can eat the program's memory either.

// In bytes: a thousand times what any of these files holds.
constexpr qint64 kMaxSize = 1024LL * 1024;

// Opens the file that `file` names as QFile::open() does, in every mode. What is neither a regular file nor a
// directory is refused, with one warning. On failure error() and errorString() of `file` say why.
bool open(QFile &file, QIODevice::OpenMode mode);

// Whether an open file may be read whole. One that is too long is closed, with one warning, and then counts
// as one that cannot be opened.
bool isWithinLimit(QFile &file);

// Both of the above.
bool openToRead(QFile &file, QIODevice::OpenMode mode);

// The content of a file opened for reading, of which more than kMaxSize bytes are never taken.
QByteArray readAll(QFile &file);

// Staging, below a directory that others reach: no link there is followed, and nobody else can write what is
// made. A file that cannot be staged has one warning with path and reason.

// For a key or certificate, which nobody but its owner can read, from the first moment on. Makes the file
// that `file` names and opens it for writing; missing directories are made. What stood at the path is removed
// first, so that a failure leaves nothing old behind. False when the file could not be made, for example
// because the path is a directory.
bool createPrivate(QFile &file);

// For what all may read. Opens the file that `file` names for writing as QFile would with `mode`, emptied.
// Unless what stands there is a regular file of the user's own that has one link and that nobody else can
// write, it is removed first, and a new file is made. False when that fails, for example in a sticky
// directory; what stood there is then as it was.
bool replace(QFile &file, QIODevice::OpenMode mode);

// Makes a directory of the user's alone; where there is something, nothing happens.
void makePrivateDirectory(const QDir &parent, const QString &name);

} // namespace vesk::base::regularfile
