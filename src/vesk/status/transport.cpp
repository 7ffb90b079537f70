// SPDX-License-Identifier: Apache-2.0
#include "transport.h"

#include "sslconfiguration.h"
#include "wellknownpaths.h"

Finding transportFinding(bool needsPair, Credentials &credentials)
{
    const QString key = QStringLiteral("transport");
    SslConfiguration configuration(QString::fromUtf8(vesk::kServerCertPath),
                                   QString::fromUtf8(vesk::kPublicKeyPath),
                                   QString::fromUtf8(vesk::kPrivateKeyPath));
    const SslConfiguration::Resolved &resolved = configuration.resolved();
    credentials = resolved.credentials;
    const bool hasPair = !credentials.certificate.isEmpty();
    const bool isFirst = resolved.trust == SslConfiguration::Trust::FirstContact;
    const QString kind = isFirst ? QStringLiteral("first-contact") : QStringLiteral("verified");
    if (resolved.trust == SslConfiguration::Trust::Refused)
        return Finding::fault(
            key, QStringLiteral("refused"), Text::tr("every request is refused: %1").arg(resolved.reason),
            Text::tr("/etc/vesk holds CA, certificate and key, or before a join at most a CA: "
                     "regular files of root's, mode 0644, the key 0640"));
    if (needsPair && !hasPair)
        return Finding::fault(key, kind, Text::tr("requests are made without client certificate"),
                              Text::tr("restore CA, certificate and key"));
    if (isFirst)
        return Finding::none(key, kind, Text::tr("no CA here: the first server that is asked is trusted"),
                             Text::tr("to have the first call verified, install the server's CA as %1")
                                 .arg(QString::fromUtf8(vesk::kServerCertPath)));
    return Finding::ok(key, kind,
                       hasPair ? Text::tr("requests are verified, and made with the client certificate")
                               : Text::tr("requests are verified under the CA"));
}
