// SPDX-License-Identifier: Apache-2.0
#include "data/data.h"

#include <QFile>

// A static library's resources are not there by themselves; the macro wants to stand outside of namespaces.
static void initData()
{
    Q_INIT_RESOURCE(data);
}

QByteArray sandbox::data::read(const char *name)
{
    initData();
    QFile file(QLatin1String(":/sandbox/") + QLatin1String(name));
    const bool isOpen = file.open(QIODevice::ReadOnly);
    Q_ASSERT(isOpen);
    return isOpen ? file.readAll() : QByteArray();
}
