// SPDX-License-Identifier: Apache-2.0
#include "socketwatch.h"

#include <algorithm>
#include <system_error>

#include <sys/socket.h>
#include <unistd.h>

namespace {

using namespace std::chrono_literals;

// Later than libcurl's own limits, so that its words stand in the log where it does notice.
constexpr auto kPatienceOfProgress = 100ms;
constexpr auto kPatienceOfThread = 600ms;

} // namespace

SocketWatch::SocketWatch(std::chrono::milliseconds reachLimit, std::chrono::milliseconds limit)
    : m_limit(Clock::now() + limit)
    , m_reachLimit(m_limit - limit + std::min(reachLimit, limit))
{
}

SocketWatch::~SocketWatch()
{
    if (!m_thread.joinable())
        return;
    {
        const std::lock_guard lock(m_mutex);
        m_ended = true;
    }
    m_changed.notify_one();
    m_thread.join();
}

bool SocketWatch::start()
{
    try {
        m_thread = std::thread(&SocketWatch::run, this);
        return true;
    } catch (const std::system_error &) {
        return false;
    }
}

bool SocketWatch::attach(CURL *handle)
{
    return curl_easy_setopt(handle, CURLOPT_OPENSOCKETFUNCTION, onOpen) == CURLE_OK &&
           curl_easy_setopt(handle, CURLOPT_OPENSOCKETDATA, this) == CURLE_OK &&
           curl_easy_setopt(handle, CURLOPT_CLOSESOCKETFUNCTION, onClose) == CURLE_OK &&
           curl_easy_setopt(handle, CURLOPT_CLOSESOCKETDATA, this) == CURLE_OK &&
           curl_easy_setopt(handle, CURLOPT_XFERINFOFUNCTION, onProgress) == CURLE_OK &&
           curl_easy_setopt(handle, CURLOPT_XFERINFODATA, this) == CURLE_OK &&
           curl_easy_setopt(handle, CURLOPT_NOPROGRESS, 0L) == CURLE_OK;
}

void SocketWatch::requestStarts()
{
    const std::lock_guard lock(m_mutex);
    m_reaching = false; // the thread finds out when it wakes up
}

bool SocketWatch::hasGivenUp() const
{
    const std::lock_guard lock(m_mutex);
    return m_gaveUp;
}

bool SocketWatch::hasShutDown() const
{
    const std::lock_guard lock(m_mutex);
    return m_shutDown;
}

void SocketWatch::run()
{
    std::unique_lock lock(m_mutex);
    while (!m_ended && Clock::now() < limit() + kPatienceOfThread)
        m_changed.wait_until(lock, limit() + kPatienceOfThread);
    m_shutDown = !m_ended;
    if (!m_shutDown)
        return;
    // Closed without ceremony then: a peer whose window is shut would not hear of an orderly end for minutes.
    constexpr linger atOnce{1, 0};
    for (const curl_socket_t socket : m_sockets) {
        ::setsockopt(socket, SOL_SOCKET, SO_LINGER, &atOnce, sizeof atOnce);
        ::shutdown(socket, SHUT_RDWR);
    }
}

curl_socket_t SocketWatch::onOpen(void *watch, curlsocktype, curl_sockaddr *address)
{
    auto *self = static_cast<SocketWatch *>(watch);
    const std::lock_guard lock(self->m_mutex);
    if (self->m_shutDown)
        return CURL_SOCKET_BAD;
    const curl_socket_t socket =
        ::socket(address->family, address->socktype | SOCK_CLOEXEC, address->protocol);
    if (socket != CURL_SOCKET_BAD)
        self->m_sockets.push_back(socket);
    return socket;
}

int SocketWatch::onClose(void *watch, curl_socket_t socket)
{
    auto *self = static_cast<SocketWatch *>(watch);
    const std::lock_guard lock(self->m_mutex);
    auto &sockets = self->m_sockets;
    sockets.erase(std::remove(sockets.begin(), sockets.end(), socket), sockets.end());
    return ::close(socket);
}

int SocketWatch::onProgress(void *watch, curl_off_t, curl_off_t, curl_off_t, curl_off_t)
{
    auto *self = static_cast<SocketWatch *>(watch);
    const std::lock_guard lock(self->m_mutex);
    self->m_gaveUp = Clock::now() >= self->limit() + kPatienceOfProgress;
    return self->m_gaveUp ? 1 : 0;
}
