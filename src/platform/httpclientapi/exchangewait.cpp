// SPDX-License-Identifier: Apache-2.0
#include "exchangewait.h"

#include "inputguard.h"

#include <QCoreApplication>
#include <QEvent>
#include <QThread>

#include <atomic>
#include <csignal>
#include <system_error>
#include <thread>

namespace {

// A thread starts with its maker's signal mask. This one must get none: a handler of the program's would run
// in it, and SIGPIPE of a broken connection would end the process.
class SignalsBlocked
{
public:
    SignalsBlocked()
    {
        sigset_t all;
        sigfillset(&all);
        pthread_sigmask(SIG_BLOCK, &all, &m_before);
    }
    ~SignalsBlocked() { pthread_sigmask(SIG_SETMASK, &m_before, nullptr); }
    Q_DISABLE_COPY_MOVE(SignalsBlocked)

private:
    sigset_t m_before = {};
};

template <typename Work>
std::thread startThread(Work work, ExchangeOutcome &outcome)
{
    const SignalsBlocked blocked;
    try {
        return std::thread(work);
    } catch (const std::system_error &error) {
        outcome.failure = QStringLiteral("no thread: ") + QString::fromLocal8Bit(error.what());
        return {};
    }
}

bool inApplicationThread()
{
    const QCoreApplication *application = QCoreApplication::instance();
    return application != nullptr && application->thread() == QThread::currentThread();
}

ExchangeOutcome block(ExchangeFunction exchange, const ExchangeRequest &request)
{
    ExchangeOutcome outcome;
    std::thread worker = startThread([&] { exchange(request, outcome); }, outcome);
    if (worker.joinable())
        worker.join();
    return outcome;
}

// No event loop of its own: QCoreApplication::quit() would end it before the exchange.
ExchangeOutcome processEvents(ExchangeFunction exchange, const ExchangeRequest &request)
{
    ExchangeOutcome outcome;
    std::atomic<bool> ended = false;
    QObject receiver;
    const InputGuard guard;
    std::thread worker = startThread(
        [&] {
            exchange(request, outcome);
            ended = true;
            QCoreApplication::postEvent(&receiver, new QEvent(QEvent::User));
        },
        outcome);
    if (!worker.joinable())
        return outcome;
    while (!ended)
        QCoreApplication::processEvents(QEventLoop::WaitForMoreEvents);
    worker.join();
    InputGuard::drain();
    return outcome;
}

} // namespace

ExchangeOutcome waitForExchange(ExchangeFunction exchange, const ExchangeRequest &request,
                                bool keepWindowAlive)
{
    if (keepWindowAlive && inApplicationThread())
        return processEvents(exchange, request);
    return block(exchange, request);
}
