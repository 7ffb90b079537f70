// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QByteArray>
#include <QString>

// The program's files, at the absolute paths of the isolated view.
namespace programfiles {

bool exists(const char *path);
QByteArray read(const QString &path);
// Replaces the content; makes missing directories, and ends the process when that fails.
void write(const QString &path, const QByteArray &content);

// Removes all that the program stages: CA, certificate, key and record.
void removeStaged();
QString stagedRecord();

// Only the owner may read or write it.
bool isPrivate(const QString &path);

} // namespace programfiles
