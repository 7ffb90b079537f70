// SPDX-License-Identifier: Apache-2.0
#include "sslconfiguration.h"

namespace {

using Material = SslConfiguration::Material;
using Trust = SslConfiguration::Trust;

Material refused(const QString &reason)
{
    Material material;
    material.reason = reason;
    return material;
}

} // namespace

SslConfiguration::SslConfiguration(const QString &caFile, const QString &certificateFile,
                                   const QString &keyFile)
    : m_caFile(caFile)
    , m_certificateFile(certificateFile)
    , m_keyFile(keyFile)
    , m_material(read())
{
}

const Material &SslConfiguration::material()
{
    if (m_material.trust != Trust::Verified)
        m_material = read();
    return m_material;
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

Material SslConfiguration::read() const
{
    const QString fault = namingFault();
    if (!fault.isEmpty())
        return refused(fault);
    return judge(PemFile::read(m_caFile, PemFile::Content::Public),
                 PemFile::read(m_certificateFile, PemFile::Content::Public),
                 PemFile::read(m_keyFile, PemFile::Content::Secret));
}

Material SslConfiguration::judge(const PemFile &ca, const PemFile &certificate, const PemFile &key) const
{
    for (const PemFile *file : {&ca, &certificate, &key}) {
        if (file->state == PemFile::State::Refused)
            return refused(file->reason);
    }
    const bool pairNamed = !m_certificateFile.isEmpty();
    const bool pairAbsent = certificate.isAbsent() && key.isAbsent();
    if (ca.isAbsent()) {
        if (pairNamed && pairAbsent)
            return {Trust::FirstContact, {}, {}, {}, {}, {}};
        return refused(QStringLiteral("CA file %1 does not exist").arg(m_caFile));
    }
    if (certificate.isAbsent() != key.isAbsent())
        return refused(QStringLiteral("%1 does not exist, though the other half of the client pair does")
                           .arg(certificate.isAbsent() ? m_certificateFile : m_keyFile));
    return {Trust::Verified, ca.contents, certificate.contents, key.contents, {}, key.advice};
}
