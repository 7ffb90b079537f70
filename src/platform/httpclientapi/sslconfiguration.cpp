// SPDX-License-Identifier: Apache-2.0
#include "sslconfiguration.h"

namespace {

using Resolved = SslConfiguration::Resolved;
using Trust = SslConfiguration::Trust;

Resolved refused(const QString &reason)
{
    return {Trust::Refused, {}, reason, {}};
}

} // namespace

SslConfiguration::SslConfiguration(const QString &caFile, const QString &certificateFile,
                                   const QString &keyFile)
    : m_caFile(caFile)
    , m_certificateFile(certificateFile)
    , m_keyFile(keyFile)
    , m_resolved(read())
{
}

const Resolved &SslConfiguration::resolved()
{
    if (m_resolved.trust != Trust::Verified)
        m_resolved = read();
    return m_resolved;
}

QString SslConfiguration::namingFault() const
{
    if (m_certificateFile.isEmpty() != m_keyFile.isEmpty())
        return QStringLiteral("client certificate and client key are only used together");
    if (!m_caFile.isEmpty())
        return {};
    return m_certificateFile.isEmpty()
               ? QStringLiteral("no CA file is configured")
               : QStringLiteral("a client certificate is configured without a CA file");
}

Resolved SslConfiguration::read() const
{
    const QString fault = namingFault();
    if (!fault.isEmpty())
        return refused(fault);
    return resolve(PemFile::read(m_caFile, PemFile::Content::Public),
                   PemFile::read(m_certificateFile, PemFile::Content::Public),
                   PemFile::read(m_keyFile, PemFile::Content::Secret));
}

Resolved SslConfiguration::resolve(const PemFile &ca, const PemFile &certificate, const PemFile &key) const
{
    for (const PemFile *file : {&ca, &certificate, &key}) {
        if (file->state == PemFile::State::Refused)
            return refused(file->reason);
    }
    const bool pairNamed = !m_certificateFile.isEmpty();
    const bool pairAbsent = certificate.isAbsent() && key.isAbsent();
    if (ca.isAbsent()) {
        if (pairNamed && pairAbsent)
            return {Trust::FirstContact, {false, {}, {}, {}}, {}, {}};
        return refused(QStringLiteral("CA file %1 does not exist").arg(m_caFile));
    }
    if (certificate.isAbsent() != key.isAbsent())
        return refused(QStringLiteral("%1 does not exist, though the other half of the client pair does")
                           .arg(certificate.isAbsent() ? m_certificateFile : m_keyFile));
    return {Trust::Verified, {true, ca.contents, certificate.contents, key.contents}, {}, key.advice};
}
