// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QDir>
#include <QFile>

// Files below the staging folder, a place that others reach: nothing that stands there is followed elsewhere,
// and nobody else can write what is made there. A file that cannot be staged has one warning with path and
// reason.
namespace privatefile {

// For a key or certificate, which nobody but its owner can read, from the first moment on. Makes the file
// that `file` names anew and opens it for writing. What stood at the path is gone first, so that a failure
// leaves nothing old behind; a link there is removed, not followed. Missing folders are made. False when the
// file could not be made, for example because the path is a folder.
bool create(QFile &file);

// For what all may read. Opens the file that `file` names for writing as QFile would with `mode`, emptied.
// Unless what stands there is a regular file of the user's own that has one link and that nobody else can
// write, it is removed first, and a new file is made. False when that fails, for example in a sticky folder;
// what stood there is then as it was.
bool replace(QFile &file, QIODevice::OpenMode mode);

// Makes a folder of the user's alone; where there is something, nothing happens.
void makeFolder(const QDir &parent, const QString &name);

} // namespace privatefile
