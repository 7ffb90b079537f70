// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QFile>
#include <QObject>

namespace vesk::base {

// A file that logs why it could not be opened and is closed with its proxy. Used by FileContent, which reads
// and writes the held file directly after open(). One proxy can be opened again, for reading first and then
// for writing.
class FileProxy : public QObject
{
    Q_OBJECT

public:
    explicit FileProxy(QObject *parent = nullptr);
    ~FileProxy() override;

    // Closes the held file if it is open, then opens `fileName` as QFile::open() does with `mode`; but a pipe
    // or device is refused, with a warning of its own and without waiting. Returns false and logs one warning
    // with name, mode and whether the file exists when that fails; error() and errorString() of `file` say
    // why.
    bool open(const QString &fileName, QIODevice::OpenMode mode);

    QFile file;
};

} // namespace vesk::base
