// SPDX-License-Identifier: Apache-2.0
#include "fileproxy.h"

#include "logtext.h"
#include "regularfile.h"

#include <QDebug>

namespace vesk::base {

FileProxy::FileProxy(QObject *parent)
    : QObject(parent)
{
}

FileProxy::~FileProxy()
{
    if (file.isOpen())
        file.close();
}

bool FileProxy::open(const QString &fileName, QIODevice::OpenMode mode)
{
    if (file.isOpen())
        file.close();

    file.setFileName(fileName);
    if (regularfile::open(file, mode))
        return true;

    qWarning().noquote() << "open file failed, file:" << logText(fileName) << ", mode:" << mode
                         << ", exist:" << (QFile::exists(fileName) ? "true" : "false");
    return false;
}

} // namespace vesk::base
