// SPDX-License-Identifier: Apache-2.0
#include "xserver.h"

XServer::XServer()
{
    m_process.setProcessChannelMode(QProcess::SeparateChannels);
    m_process.start(QStringLiteral("Xvfb"),
                    {QStringLiteral("-displayfd"), QStringLiteral("1"), QStringLiteral("-screen"),
                     QStringLiteral("0"), QStringLiteral("800x600x24"), QStringLiteral("-nolisten"),
                     QStringLiteral("tcp")});
    while (!m_process.canReadLine() && m_process.waitForReadyRead()) {
    }
    const QByteArray number = m_process.readLine().trimmed();
    if (!number.isEmpty())
        m_display = ':' + number;
}

XServer::~XServer()
{
    m_process.terminate();
    m_process.waitForFinished();
}
