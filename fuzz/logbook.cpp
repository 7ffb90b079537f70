// SPDX-License-Identifier: Apache-2.0
#include "logbook.h"

#include <algorithm>

namespace logbook {

namespace {

QStringList &book()
{
    static QStringList lines;
    return lines;
}

void take(QtMsgType /*type*/, const QMessageLogContext & /*context*/, const QString &message)
{
    book().append(message);
}

} // namespace

void open()
{
    qInstallMessageHandler(take);
}

void clear()
{
    book().clear();
}

bool contains(const QString &text)
{
    return std::any_of(book().cbegin(), book().cend(),
                       [&](const QString &line) { return line.contains(text); });
}

} // namespace logbook
