// SPDX-License-Identifier: Apache-2.0
// What the transport itself reads: header lines, addresses, PEM files.
#include "certificate.h"
#include "curl/pemcheck.h"
#include "curl/replyreader.h"
#include "fileconfig.h"
#include "pemfile.h"
#include "programfiles.h"
#include "replies.h"
#include "requestaddress.h"
#include "require.h"
#include "sslconfiguration.h"
#include "targets.h"

#include <QDir>
#include <QUrl>

namespace fuzz {

namespace {

constexpr int kFirstFinalStatus = 200;

void checkFile(const QString &path, const QByteArray &content, PemFile::Content kind)
{
    const PemFile file = PemFile::read(path, kind);
    require((file.state == PemFile::State::Read) == !content.isEmpty(), "a private file is read");
    require(file.contents == content, "a file is read whole");
}

} // namespace

void replyHeader(const QByteArray &input)
{
    const QVector<QByteArray> parts = partsOf(input);
    ReplyReader reader;
    bool goesOn = true;
    const auto lines = parts.first().split('\n');
    for (int i = 0; goesOn && i < lines.size(); ++i)
        goesOn = reader.takeHeaderLine(lines.at(i) + '\n');
    require(goesOn == reader.abortReason().isEmpty(), "an aborted reply has its reason");
    require(reader.status() == 0 || reader.status() >= kFirstFinalStatus, "an interim status is none");
    const QByteArray body = parts.value(1);
    if (goesOn && reader.takeBody(body.constData(), static_cast<size_t>(body.size())))
        require(reader.body() == body, "the body is taken as it came");
}

void requestTarget(const QByteArray &input)
{
    const int lineEnd = input.indexOf('\n');
    FileConfig *config = FileConfig::GetInstance();
    config->setDomainHost(QString::fromUtf8(input.left(lineEnd)));
    config->setDomainPort(lineEnd < 0 ? QString() : QString::fromUtf8(input.mid(lineEnd + 1)));
    const QString path = QStringLiteral("/uim/v3/client/auth");
    const QUrl url = config->getDomainUrl(path);
    const RequestAddress address(url.url());
    require(!address.display().contains(QLatin1Char('\n')), "an address is one line in the log");
    if (!address.isValid())
        return;
    const QUrl sent = QUrl::fromEncoded(address.encoded());
    require(sent.path() == path && !sent.hasQuery() && sent.userInfo().isEmpty(),
            "what the user types as a host is nothing but a host");
    require(sent.port() != 0 && sent.port() <= 65535, "a port is one, or the usual one");
}

void pemFiles(const QByteArray &input)
{
    const QVector<QByteArray> parts = partsOf(input);
    const QString directory = QDir::tempPath() + QStringLiteral("/pem/");
    const QStringList paths{directory + QStringLiteral("ca"), directory + QStringLiteral("certificate"),
                            directory + QStringLiteral("key")};
    for (int i = 0; i < paths.size(); ++i) {
        programfiles::write(paths.at(i), parts.value(i));
        QFile::setPermissions(paths.at(i), QFile::ReadOwner | QFile::WriteOwner);
        checkFile(paths.at(i), parts.value(i), i == 2 ? PemFile::Content::Secret : PemFile::Content::Public);
    }
    SslConfiguration configuration(paths.at(0), paths.at(1), paths.at(2));
    require((configuration.resolved().trust == SslConfiguration::Trust::Verified) ==
                (!parts.value(0).isEmpty() && !parts.value(1).isEmpty() && !parts.value(2).isEmpty()),
            "an empty file is refused, never taken as absent");

    const bool fits = isPair(parts.value(1), parts.value(2));
    require(fits == sandbox::keyFits(parts.value(1), parts.value(2)),
            "transport and sandbox agree on a pair");
    require(!fits || !sandbox::certificateDer(parts.value(1)).isEmpty(), "a pair has a certificate");
    require(!holdsCertificates(parts.value(0)) || parts.value(0).contains("-----BEGIN"),
            "there is no certificate without its first line");
}

} // namespace fuzz
