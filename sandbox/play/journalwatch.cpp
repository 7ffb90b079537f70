// SPDX-License-Identifier: Apache-2.0
#include "play/journalwatch.h"

namespace sandbox {

namespace {

constexpr int kIntervalMs = 10;

} // namespace

JournalWatch::JournalWatch(const QString &path)
    : m_file(path)
{
    connect(&m_timer, &QTimer::timeout, this, &JournalWatch::read);
    m_timer.start(kIntervalMs);
}

void JournalWatch::read()
{
    if (!m_file.isOpen() && !m_file.open(QIODevice::ReadOnly))
        return;
    m_text += m_file.readAll();
    for (int end = m_text.indexOf('\n', m_told); end >= 0; end = m_text.indexOf('\n', m_told)) {
        const QByteArray line = m_text.mid(m_told, end - m_told);
        m_told = end + 1;
        Q_EMIT came(line);
    }
}

} // namespace sandbox
