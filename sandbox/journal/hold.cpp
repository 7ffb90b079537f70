// SPDX-License-Identifier: Apache-2.0
#include "journal/hold.h"

#include <QFile>
#include <QFileInfo>
#include <QThread>

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

namespace sandbox {

Hold::Hold(const Journal &journal)
    : m_path(QFileInfo(journal.path()).path() + QStringLiteral("/hold"))
{
}

Hold::~Hold()
{
    if (m_pipe < 0)
        return;
    ::close(m_pipe);
    QFile::remove(m_path);
}

// Opened for both directions, so that it neither waits for the other side nor breaks without one.
bool Hold::create()
{
    QFile::remove(m_path);
    const QByteArray path = QFile::encodeName(m_path);
    if (::mkfifo(path.constData(), 0644) == 0)
        m_pipe = ::open(path.constData(), O_RDWR | O_CLOEXEC);
    return m_pipe >= 0;
}

void Hold::release() const
{
    TEMP_FAILURE_RETRY(::write(m_pipe, "", 1));
}

int Hold::open() const
{
    return ::open(QFile::encodeName(m_path).constData(), O_RDONLY | O_NONBLOCK | O_CLOEXEC);
}

void Hold::wait() const
{
    const int pipe = open();
    if (pipe < 0)
        return;
    ::fcntl(pipe, F_SETFL, 0); // blocks from now on
    char byte = 0;
    TEMP_FAILURE_RETRY(::read(pipe, &byte, 1));
    ::close(pipe);
}

void waitAsScripted(const Journal &journal, const QString &source, const QString &call, int delayMs,
                    bool isHeld)
{
    if (delayMs > 0) {
        journal.write(source, QStringLiteral("%1 is held for %2 ms").arg(call).arg(delayMs));
        QThread::msleep(static_cast<unsigned long>(delayMs));
    }
    if (isHeld) {
        journal.write(source, QStringLiteral("%1 is held for now").arg(call));
        Hold(journal).wait();
    }
}

} // namespace sandbox
