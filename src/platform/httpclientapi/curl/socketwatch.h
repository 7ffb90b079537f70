// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <curl/curl.h>

#include <chrono>
#include <condition_variable>
#include <mutex>
#include <thread>
#include <vector>

// Ends one exchange that outlasts its time limits. libcurl looks at its own between two steps, but some of
// them last for as long as the other end goes on sending. A tenth of a second after a limit the exchange is
// given up at its next sign of life; half a second later a thread shuts its sockets down. Must outlive the
// handle.
class SocketWatch
{
public:
    // Both limits count from here: `reachLimit` until requestStarts(), `limit` for the whole exchange.
    SocketWatch(std::chrono::milliseconds reachLimit, std::chrono::milliseconds limit);
    ~SocketWatch();
    SocketWatch(const SocketWatch &) = delete;
    SocketWatch &operator=(const SocketWatch &) = delete;

    // Starts the thread, which has the caller's signal mask. False when there can be none.
    bool start();
    // False when libcurl refuses.
    bool attach(CURL *handle);

    // To be called between the handshake with the server and the request.
    void requestStarts();

    bool hasGivenUp() const;
    bool hasShutDown() const;

private:
    using Clock = std::chrono::steady_clock;

    static curl_socket_t onOpen(void *watch, curlsocktype purpose, curl_sockaddr *address);
    static int onClose(void *watch, curl_socket_t socket);
    static int onProgress(void *watch, curl_off_t, curl_off_t, curl_off_t, curl_off_t);

    void run();
    Clock::time_point limit() const { return m_reaching ? m_reachLimit : m_limit; }

    const Clock::time_point m_limit;
    const Clock::time_point m_reachLimit; // not after m_limit
    std::thread m_thread;

    mutable std::mutex m_mutex; // for what follows
    std::condition_variable m_changed;
    std::vector<curl_socket_t> m_sockets;
    bool m_reaching = true;
    bool m_ended = false;
    bool m_gaveUp = false;
    bool m_shutDown = false;
};
