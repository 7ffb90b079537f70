// SPDX-License-Identifier: Apache-2.0
#include "tlspeer.h"

#include <openssl/pem.h>
#include <openssl/ssl.h>

#include <algorithm>
#include <atomic>
#include <chrono>
#include <csignal>
#include <mutex>
#include <thread>
#include <vector>

#include <arpa/inet.h>
#include <netinet/in.h>
#include <sys/socket.h>
#include <unistd.h>

namespace {

struct Free
{
    void operator()(SSL *ssl) const { SSL_free(ssl); }
    void operator()(SSL_CTX *context) const { SSL_CTX_free(context); }
    void operator()(BIO *bio) const { BIO_free_all(bio); }
    void operator()(X509 *certificate) const { X509_free(certificate); }
    void operator()(EVP_PKEY *key) const { EVP_PKEY_free(key); }
};
template <typename T>
using Owned = std::unique_ptr<T, Free>;

Owned<BIO> reading(const QByteArray &pem)
{
    return Owned<BIO>(BIO_new_mem_buf(pem.constData(), pem.size()));
}

Owned<X509> certificateOf(const QByteArray &pem)
{
    return Owned<X509>(PEM_read_bio_X509(reading(pem).get(), nullptr, nullptr, nullptr));
}

// Speaks HTTP/2 with whoever offers it, which then is no request that this peer can read.
int chooseProtocol(SSL *, const unsigned char **chosen, unsigned char *size, const unsigned char *offered,
                   unsigned int offeredSize, void *)
{
    static const unsigned char known[] = "\x02h2\x08http/1.1";
    auto **selected = const_cast<unsigned char **>(chosen);
    return SSL_select_next_proto(selected, size, known, sizeof known - 1, offered, offeredSize) ==
                   OPENSSL_NPN_NEGOTIATED
               ? SSL_TLSEXT_ERR_OK
               : SSL_TLSEXT_ERR_NOACK;
}

Owned<SSL_CTX> makeContext(const sandbox::KeyPair &identity, const QByteArray &clientCa, int clientMode)
{
    Owned<SSL_CTX> context(SSL_CTX_new(TLS_server_method()));
    const Owned<EVP_PKEY> key(
        PEM_read_bio_PrivateKey(reading(identity.keyPem).get(), nullptr, nullptr, nullptr));
    SSL_CTX_use_certificate(context.get(), certificateOf(identity.certificatePem).get());
    SSL_CTX_use_PrivateKey(context.get(), key.get());
    SSL_CTX_set_alpn_select_cb(context.get(), chooseProtocol, nullptr);
    if (!clientCa.isEmpty()) {
        X509_STORE_add_cert(SSL_CTX_get_cert_store(context.get()), certificateOf(clientCa).get());
        SSL_CTX_set_verify(context.get(), clientMode, nullptr);
    }
    return context;
}

QString nameOfClient(SSL *ssl)
{
    const Owned<X509> certificate(SSL_get1_peer_certificate(ssl));
    if (!certificate)
        return {};
    const Owned<BIO> bio(BIO_new(BIO_s_mem()));
    PEM_write_bio_X509(bio.get(), certificate.get());
    char *text = nullptr;
    const auto size = BIO_get_mem_data(bio.get(), &text);
    return sandbox::certificateCommonName(QByteArray(text, static_cast<int>(size)));
}

void setReset(int socket)
{
    const linger now{1, 0};
    ::setsockopt(socket, SOL_SOCKET, SO_LINGER, &now, sizeof now);
}

int listenOnLoopback(quint16 *port)
{
    const int listener = ::socket(AF_INET, SOCK_STREAM | SOCK_CLOEXEC, 0);
    sockaddr_in address = {};
    address.sin_family = AF_INET;
    address.sin_addr.s_addr = htonl(INADDR_LOOPBACK);
    socklen_t size = sizeof address;
    auto *generic = reinterpret_cast<sockaddr *>(&address);
    if (::bind(listener, generic, size) != 0 || ::listen(listener, 16) != 0 ||
        ::getsockname(listener, generic, &size) != 0)
        qFatal("no listening socket on loopback");
    *port = ntohs(address.sin_port);
    return listener;
}

// Size of the request at the start of `bytes`, 0 while it is not complete.
int requestSize(const QByteArray &bytes)
{
    const int headerEnd = bytes.indexOf("\r\n\r\n");
    if (headerEnd < 0)
        return 0;
    const QByteArray header = bytes.left(headerEnd).toLower();
    const int field = header.indexOf("\r\ncontent-length:");
    const int length = field < 0 ? 0 : header.mid(field + 17).split('\r').value(0).trimmed().toInt();
    const int size = headerEnd + 4 + length;
    return bytes.size() < size ? 0 : size;
}

} // namespace

class TlsPeer::Engine
{
public:
    Engine(const sandbox::KeyPair &identity, Script script, Style style);
    ~Engine();
    Q_DISABLE_COPY_MOVE(Engine)

    quint16 port = 0;
    mutable std::mutex mutex; // of what follows here
    sandbox::KeyPair identity;
    QByteArray clientCa;
    int clientMode = SSL_VERIFY_NONE;
    QList<QByteArray> requests;
    QByteArray plainBytes;
    QString clientName;
    int connections = 0;

private:
    void accept();
    void serve(int socket);
    void serveTls(int socket);
    void serveText(int socket);
    void handleRequests(SSL *ssl, int socket);
    QByteArray readRequest(SSL *ssl, QByteArray &buffer);
    bool finish(SSL *ssl, int socket, PeerAnswer::End end);
    bool pause(int milliseconds) const;

    template <typename Write>
    bool send(const PeerAnswer &answer, Write write) const;

    Script m_script;
    Style m_style;
    int m_listener;
    std::atomic<bool> m_stop = false;
    std::mutex m_socketMutex;
    std::vector<int> m_sockets;
    std::vector<std::thread> m_workers; // touched by the accepting thread only, until it has ended
    std::thread m_accepting;
};

TlsPeer::Engine::Engine(const sandbox::KeyPair &firstIdentity, Script script, Style style)
    : identity(firstIdentity)
    , m_script(std::move(script))
    , m_style(style)
    , m_listener(listenOnLoopback(&port))
{
    // A write to a connection that the client has closed must not end the test; the client's own are its
    // matter.
    sigset_t pipeOnly;
    sigset_t before;
    sigemptyset(&pipeOnly);
    sigaddset(&pipeOnly, SIGPIPE);
    pthread_sigmask(SIG_BLOCK, &pipeOnly, &before);
    m_accepting = std::thread([this] { accept(); });
    pthread_sigmask(SIG_SETMASK, &before, nullptr);
}

TlsPeer::Engine::~Engine()
{
    m_stop = true;
    ::shutdown(m_listener, SHUT_RDWR);
    m_accepting.join();
    {
        const std::lock_guard<std::mutex> lock(m_socketMutex);
        for (const int socket : m_sockets)
            ::shutdown(socket, SHUT_RDWR);
    }
    for (std::thread &worker : m_workers)
        worker.join();
    ::close(m_listener);
}

void TlsPeer::Engine::accept()
{
    for (;;) {
        const int socket = ::accept4(m_listener, nullptr, nullptr, SOCK_CLOEXEC);
        if (socket < 0 || m_stop)
            return;
        {
            const std::lock_guard<std::mutex> lock(mutex);
            ++connections;
        }
        const std::lock_guard<std::mutex> lock(m_socketMutex);
        m_sockets.push_back(socket);
        m_workers.emplace_back([this, socket] { serve(socket); });
    }
}

void TlsPeer::Engine::serve(int socket)
{
    if (m_style == Style::PlainText)
        serveText(socket);
    else if (m_style == Style::Mute)
        while (pause(100)) {
        }
    else
        serveTls(socket);
    const std::lock_guard<std::mutex> lock(m_socketMutex);
    m_sockets.erase(std::find(m_sockets.begin(), m_sockets.end(), socket));
    ::close(socket);
}

void TlsPeer::Engine::serveText(int socket)
{
    char bytes[4096];
    const ssize_t size = ::recv(socket, bytes, sizeof bytes, 0);
    const QByteArray request(bytes, static_cast<int>(std::max<ssize_t>(size, 0)));
    {
        const std::lock_guard<std::mutex> lock(mutex);
        plainBytes = request;
    }
    send(m_script(request),
         [&](const char *data, int count) { return ::write(socket, data, count) == count; });
}

void TlsPeer::Engine::serveTls(int socket)
{
    Owned<SSL_CTX> context;
    {
        const std::lock_guard<std::mutex> lock(mutex);
        context = makeContext(identity, clientCa, clientMode);
    }
    if (m_style == Style::OldTls) {
        SSL_CTX_set_cipher_list(context.get(), "ALL:@SECLEVEL=0");
        SSL_CTX_set_max_proto_version(context.get(), TLS1_1_VERSION);
    }
    const Owned<SSL> ssl(SSL_new(context.get()));
    SSL_set_fd(ssl.get(), socket);
    if (SSL_accept(ssl.get()) != 1)
        return;
    if (m_style == Style::ResetAfterHandshake) {
        setReset(socket);
        return;
    }
    {
        const std::lock_guard<std::mutex> lock(mutex);
        clientName = nameOfClient(ssl.get());
    }
    handleRequests(ssl.get(), socket);
}

void TlsPeer::Engine::handleRequests(SSL *ssl, int socket)
{
    QByteArray buffer;
    for (;;) {
        const QByteArray request = readRequest(ssl, buffer);
        if (request.isEmpty())
            return;
        {
            const std::lock_guard<std::mutex> lock(mutex);
            requests.append(request);
        }
        const PeerAnswer answer = m_script(request);
        const bool sent =
            send(answer, [&](const char *data, int count) { return SSL_write(ssl, data, count) == count; });
        if (!sent || !finish(ssl, socket, answer.end))
            return;
    }
}

QByteArray TlsPeer::Engine::readRequest(SSL *ssl, QByteArray &buffer)
{
    char bytes[4096];
    while (requestSize(buffer) == 0) {
        const int size = SSL_read(ssl, bytes, sizeof bytes);
        if (size <= 0)
            return {};
        buffer.append(bytes, size);
    }
    QByteArray request = buffer.left(requestSize(buffer));
    buffer.remove(0, request.size());
    return request;
}

// True when more requests are to be read.
bool TlsPeer::Engine::finish(SSL *ssl, int socket, PeerAnswer::End end)
{
    if (end == PeerAnswer::End::CloseNotify)
        SSL_shutdown(ssl);
    if (end == PeerAnswer::End::Reset)
        setReset(socket);
    return end == PeerAnswer::End::KeepOpen;
}

bool TlsPeer::Engine::pause(int milliseconds) const
{
    std::this_thread::sleep_for(std::chrono::milliseconds(milliseconds));
    return !m_stop;
}

template <typename Write>
bool TlsPeer::Engine::send(const PeerAnswer &answer, Write write) const
{
    if (!answer.bytes.isEmpty() && !write(answer.bytes.constData(), answer.bytes.size()))
        return false;
    while (!answer.repeat.isEmpty()) {
        if (!write(answer.repeat.constData(), answer.repeat.size()) || !pause(answer.pauseMs))
            return false;
    }
    return true;
}

TlsPeer::TlsPeer(const sandbox::KeyPair &identity, Script script, Style style)
    : m_engine(std::make_unique<Engine>(identity, std::move(script), style))
{
}

TlsPeer::~TlsPeer() = default;

quint16 TlsPeer::port() const
{
    return m_engine->port;
}

QString TlsPeer::url(const QString &path) const
{
    return QStringLiteral("https://localhost:%1%2").arg(port()).arg(path);
}

void TlsPeer::setIdentity(const sandbox::KeyPair &identity)
{
    const std::lock_guard<std::mutex> lock(m_engine->mutex);
    m_engine->identity = identity;
}

void TlsPeer::askForClientCertificate(const QByteArray &caPem, bool required)
{
    const std::lock_guard<std::mutex> lock(m_engine->mutex);
    m_engine->clientMode = SSL_VERIFY_PEER | (required ? SSL_VERIFY_FAIL_IF_NO_PEER_CERT : 0);
    m_engine->clientCa = caPem;
}

QList<QByteArray> TlsPeer::requests() const
{
    const std::lock_guard<std::mutex> lock(m_engine->mutex);
    return m_engine->requests;
}

int TlsPeer::connections() const
{
    const std::lock_guard<std::mutex> lock(m_engine->mutex);
    return m_engine->connections;
}

QByteArray TlsPeer::plainBytes() const
{
    const std::lock_guard<std::mutex> lock(m_engine->mutex);
    return m_engine->plainBytes;
}

QString TlsPeer::clientName() const
{
    const std::lock_guard<std::mutex> lock(m_engine->mutex);
    return m_engine->clientName;
}

QByteArray httpReply(int status, const QByteArray &body, const QByteArray &headerLines)
{
    return "HTTP/1.1 " + QByteArray::number(status) + " Text\r\n" + headerLines +
           "Content-Length: " + QByteArray::number(body.size()) + "\r\n\r\n" + body;
}
