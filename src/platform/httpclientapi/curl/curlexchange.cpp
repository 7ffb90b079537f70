// SPDX-License-Identifier: Apache-2.0
#include "curlexchange.h"

#include "curloptions.h"
#include "pemcheck.h"
#include "replyreader.h"
#include "tlswatch.h"

#include <array>

namespace {

constexpr int kLongestCause = 200;

struct HandleDeleter
{
    void operator()(CURL *handle) const { curl_easy_cleanup(handle); }
};
using Handle = std::unique_ptr<CURL, HandleDeleter>;

// What the callbacks of one exchange share.
struct Progress
{
    TlsWatch tls;
    bool wantsFingerprint = false;
    bool sending = false;
    QString fingerprint;
    ReplyReader reply;
};

// Called once, between the end of the TLS handshake and the first byte of the request.
int onReadyToSend(void *data, char *, char *, int, int)
{
    auto *progress = static_cast<Progress *>(data);
    if (progress->wantsFingerprint)
        progress->fingerprint = progress->tls.peerFingerprint();
    progress->sending = true;
    return CURL_PREREQFUNC_OK;
}

size_t onHeaderLine(char *bytes, size_t, size_t size, void *data)
{
    auto *progress = static_cast<Progress *>(data);
    return progress->reply.takeHeaderLine(QByteArray(bytes, static_cast<int>(size))) ? size : 0;
}

size_t onBody(char *bytes, size_t, size_t size, void *data)
{
    auto *progress = static_cast<Progress *>(data);
    return progress->reply.takeBody(bytes, size) ? size : 0;
}

bool setCallbacks(CURL *handle, Progress &progress, char *errorText)
{
    return progress.tls.attach(handle) &&
           curl_easy_setopt(handle, CURLOPT_ERRORBUFFER, errorText) == CURLE_OK &&
           curl_easy_setopt(handle, CURLOPT_PREREQFUNCTION, onReadyToSend) == CURLE_OK &&
           curl_easy_setopt(handle, CURLOPT_PREREQDATA, &progress) == CURLE_OK &&
           curl_easy_setopt(handle, CURLOPT_HEADERFUNCTION, onHeaderLine) == CURLE_OK &&
           curl_easy_setopt(handle, CURLOPT_HEADERDATA, &progress) == CURLE_OK &&
           curl_easy_setopt(handle, CURLOPT_WRITEFUNCTION, onBody) == CURLE_OK &&
           curl_easy_setopt(handle, CURLOPT_WRITEDATA, &progress) == CURLE_OK;
}

// Empty when the exchange ended with a complete reply. libcurl is content with a header that breaks off, and
// with any end of a reply that does not tell its length.
QString failureOf(CURLcode code, const Progress &progress, const char *errorText)
{
    if (!progress.reply.breakReason().isEmpty())
        return progress.reply.breakReason();
    if (code == CURLE_OK && progress.reply.status() == 0)
        return QStringLiteral("the reply ends within its header");
    if (code == CURLE_OK && !progress.reply.tellsItsLength() && !progress.tls.endedInOrder())
        return QStringLiteral("the connection was cut");
    if (code == CURLE_OK)
        return {};
    const QString text = QString::fromUtf8(errorText).simplified().left(kLongestCause);
    return text.isEmpty() ? QString::fromLatin1(curl_easy_strerror(code)) : text;
}

ExchangeOutcome::Stage stageOf(const Progress &progress)
{
    if (progress.reply.status() != 0)
        return ExchangeOutcome::Stage::Answered;
    return progress.sending ? ExchangeOutcome::Stage::Sent : ExchangeOutcome::Stage::NothingSent;
}

void refuse(ExchangeOutcome &outcome, ExchangeOutcome::Culprit culprit, const char *reason)
{
    outcome.culprit = culprit;
    outcome.failure = QString::fromLatin1(reason);
}

bool materialIsSound(const ExchangeRequest &request, ExchangeOutcome &outcome)
{
    if (request.verifyPeer && !holdsCertificates(request.ca)) {
        refuse(outcome, ExchangeOutcome::Culprit::CaFile, "holds no certificate, or a damaged one");
        return false;
    }
    const bool hasPair = !request.certificate.isEmpty() || !request.key.isEmpty();
    if (hasPair && !isPair(request.certificate, request.key)) {
        refuse(outcome, ExchangeOutcome::Culprit::ClientPair, "damaged, or its key does not belong to it");
        return false;
    }
    return true;
}

} // namespace

void exchangeByCurl(const ExchangeRequest &request, ExchangeOutcome &outcome)
{
    if (!materialIsSound(request, outcome))
        return;

    Progress progress;
    std::array<char, CURL_ERROR_SIZE> errorText = {};
    const HeaderList headers = headersFor(request);
    const Handle handle(curl_easy_init());
    progress.wantsFingerprint = !request.verifyPeer;
    if (!headers || !handle || !setOptions(handle.get(), request, headers) ||
        !setCallbacks(handle.get(), progress, errorText.data())) {
        refuse(outcome, ExchangeOutcome::Culprit::Other, "libcurl refuses the request's options");
        return;
    }

    const CURLcode code = curl_easy_perform(handle.get());
    outcome.stage = stageOf(progress);
    outcome.status = progress.reply.status();
    outcome.failure = failureOf(code, progress, errorText.data());
    outcome.peerFingerprint = progress.fingerprint;
    if (code == CURLE_PEER_FAILED_VERIFICATION)
        outcome.culprit = ExchangeOutcome::Culprit::Peer;
    if (outcome.failure.isEmpty())
        outcome.body = progress.reply.body();
}
