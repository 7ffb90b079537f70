// SPDX-License-Identifier: Apache-2.0
#include "curlexchange.h"

#include "curloptions.h"
#include "pemcheck.h"
#include "replyreader.h"
#include "socketwatch.h"
#include "tlswatch.h"
#include "wipingmemory.h"

#include <QRegularExpression>

#include <array>
#include <chrono>
#include <cstdlib>
#include <cstring>

namespace {

constexpr int kMaxCauseLength = 200;

// What libcurl and the callbacks of one exchange fill in.
struct Progress
{
    explicit Progress(std::chrono::milliseconds limit)
        : sockets(std::chrono::milliseconds(kReachLimitMs), limit)
    {
    }

    TlsWatch tls;
    SocketWatch sockets;
    std::array<char, CURL_ERROR_SIZE> errorText = {};
    bool wantsFingerprint = false;
    bool sending = false;
    QString fingerprint;
    ReplyReader reply;
};

// Called once, between the end of the TLS handshake and the first byte of the request.
int onReadyToSend(void *data, char *, char *, int, int)
{
    auto *progress = static_cast<Progress *>(data);
    progress->tls.requestStarts();
    progress->sockets.requestStarts();
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

bool setCallbacks(CURL *handle, Progress &progress)
{
    return progress.tls.attach(handle) && progress.sockets.attach(handle) &&
           curl_easy_setopt(handle, CURLOPT_ERRORBUFFER, progress.errorText.data()) == CURLE_OK &&
           curl_easy_setopt(handle, CURLOPT_PREREQFUNCTION, onReadyToSend) == CURLE_OK &&
           curl_easy_setopt(handle, CURLOPT_PREREQDATA, &progress) == CURLE_OK &&
           curl_easy_setopt(handle, CURLOPT_HEADERFUNCTION, onHeaderLine) == CURLE_OK &&
           curl_easy_setopt(handle, CURLOPT_HEADERDATA, &progress) == CURLE_OK &&
           curl_easy_setopt(handle, CURLOPT_WRITEFUNCTION, onBody) == CURLE_OK &&
           curl_easy_setopt(handle, CURLOPT_WRITEDATA, &progress) == CURLE_OK;
}

// libcurl's own words. They quote a proxy's address that it cannot read, password and all: what stands before
// the last '@' goes, and when libcurl has cut its text off, so that the '@' may be missing, all that it
// quotes.
QString causeOf(CURLcode code, const char *errorText)
{
    static const QRegularExpression userInfo(QStringLiteral("^([^']*'(?:[a-z][a-z0-9+.-]*://)?|.*?//)?.*@"),
                                             QRegularExpression::CaseInsensitiveOption |
                                                 QRegularExpression::DotMatchesEverythingOption);
    QString text = QString::fromUtf8(errorText).simplified();
    text.replace(userInfo, QStringLiteral("\\1"));
    if (std::strlen(errorText) >= CURL_ERROR_SIZE - 1)
        text = text.left(text.indexOf(QLatin1Char('\''))) + QStringLiteral("..."); // -1: all of it
    return text.isEmpty() ? QString::fromLatin1(curl_easy_strerror(code)) : text.left(kMaxCauseLength);
}

// The length that libcurl expects, -1 when it knows none.
curl_off_t lengthOf(CURL *handle)
{
    curl_off_t length = -1;
    return curl_easy_getinfo(handle, CURLINFO_CONTENT_LENGTH_DOWNLOAD_T, &length) == CURLE_OK ? length : -1;
}

// Empty when the exchange ended with a complete reply. libcurl is content with a header that ends early, and
// with any end of a reply that does not tell its length.
QString failureOf(CURL *handle, CURLcode code, const Progress &progress)
{
    const ReplyReader &reply = progress.reply;
    if (!reply.abortReason().isEmpty())
        return reply.abortReason();
    // So says libcurl of a line that is longer than it will keep.
    if (code == CURLE_OUT_OF_MEMORY && progress.sending && reply.status() == 0)
        return QStringLiteral("header line too long");
    if (code != CURLE_OK && progress.sockets.hasShutDown())
        return QStringLiteral("timed out, connection shut down");
    if (code == CURLE_ABORTED_BY_CALLBACK && progress.sockets.hasGivenUp())
        return QStringLiteral("timed out, given up");
    if (code != CURLE_OK)
        return causeOf(code, progress.errorText.data());
    if (reply.status() == 0)
        return QStringLiteral("the reply ends within its header");
    return reply.isComplete(lengthOf(handle), progress.tls.endedInOrder())
               ? QString()
               : QStringLiteral("the connection was cut");
}

ExchangeOutcome::Stage stageOf(const Progress &progress)
{
    if (progress.reply.status() != 0)
        return ExchangeOutcome::Stage::Answered;
    return progress.sending ? ExchangeOutcome::Stage::Sent : ExchangeOutcome::Stage::NothingSent;
}

void refuse(ExchangeOutcome &outcome, ExchangeOutcome::FailureSource source, const char *reason)
{
    outcome.source = source;
    outcome.failure = QString::fromLatin1(reason);
}

bool areUsable(const Credentials &credentials, ExchangeOutcome &outcome)
{
    if (credentials.verifyPeer && !holdsCertificates(credentials.ca)) {
        refuse(outcome, ExchangeOutcome::FailureSource::CaFile, "holds no certificate, or a damaged one");
        return false;
    }
    const bool hasPair = !credentials.certificate.isEmpty() || !credentials.key.isEmpty();
    if (hasPair && !isPair(credentials.certificate, credentials.key)) {
        refuse(outcome, ExchangeOutcome::FailureSource::ClientPair,
               "damaged, or its key does not belong to it");
        return false;
    }
    return true;
}

void conclude(CURL *handle, CURLcode code, const Progress &progress, ExchangeOutcome &outcome)
{
    outcome.stage = stageOf(progress);
    outcome.status = progress.reply.status();
    outcome.failure = failureOf(handle, code, progress);
    outcome.peerFingerprint = progress.fingerprint;
    if (code == CURLE_PEER_FAILED_VERIFICATION)
        outcome.source = ExchangeOutcome::FailureSource::Peer;
    if (outcome.failure.isEmpty())
        outcome.body = progress.reply.body();
}

ExchangeTrace::Reached reachedBy(CURL *handle, const Progress &progress)
{
    if (progress.sending)
        return ExchangeTrace::Reached::Tls;
    if (progress.tls.hasBegun())
        return ExchangeTrace::Reached::Tcp;
    curl_off_t lookupTime = 0;
    return curl_easy_getinfo(handle, CURLINFO_NAMELOOKUP_TIME_T, &lookupTime) == CURLE_OK && lookupTime > 0
               ? ExchangeTrace::Reached::Name
               : ExchangeTrace::Reached::Nothing;
}

void note(CURL *handle, const Progress &progress, ExchangeTrace &trace)
{
    const char *address = nullptr;
    if (curl_easy_getinfo(handle, CURLINFO_PRIMARY_IP, &address) == CURLE_OK)
        trace.address = QString::fromLatin1(address);
    trace.reached = reachedBy(handle, progress);
    trace.date = progress.reply.date();
}

} // namespace

bool setUpCurl()
{
    // libcurl opens the key log while it is set up, and only then.
    constexpr char kKeyLogVariable[] = "SSLKEYLOGFILE";
    const QByteArray keyLog = qgetenv(kKeyLogVariable);
    const bool wasSet = qEnvironmentVariableIsSet(kKeyLogVariable);
    qunsetenv(kKeyLogVariable);
    // Without effect where somebody else in this process has set it up before.
    const CURLcode code = curl_global_init_mem(CURL_GLOBAL_DEFAULT, std::malloc, wipingFree, wipingRealloc,
                                               ::strdup, std::calloc);
    if (wasSet)
        qputenv(kKeyLogVariable, keyLog);
    return code == CURLE_OK;
}

void exchangeByCurl(const ExchangeRequest &request, ExchangeOutcome &outcome)
{
    ExchangeTrace trace;
    traceExchange(request, outcome, trace);
}

void traceExchange(const ExchangeRequest &request, ExchangeOutcome &outcome, ExchangeTrace &trace)
{
    if (!areUsable(request.credentials, outcome))
        return;
    Progress progress{std::chrono::milliseconds(request.limitMs)};
    progress.wantsFingerprint = !request.credentials.verifyPeer;
    const HeaderList headers = headersFor(request);
    const Owned<CURL, curl_easy_cleanup> handle(curl_easy_init());
    if (!progress.sockets.start()) {
        refuse(outcome, ExchangeOutcome::FailureSource::Other, "no thread to watch over the time limits");
        return;
    }
    if (headers && handle && setOptions(handle.get(), request, headers) &&
        setCallbacks(handle.get(), progress)) {
        conclude(handle.get(), curl_easy_perform(handle.get()), progress, outcome);
        note(handle.get(), progress, trace);
    } else {
        refuse(outcome, ExchangeOutcome::FailureSource::Other, "libcurl refuses the request's options");
    }
}
