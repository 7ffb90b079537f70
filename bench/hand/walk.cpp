// SPDX-License-Identifier: Apache-2.0
#include "walk.h"

#include <QFile>
#include <QJsonObject>

#include <algorithm>

namespace {

constexpr char kTab[] = "Tab";
constexpr char kReturn[] = "Return";
constexpr int kLimitMs = 120000;

using sandbox::Field;
using sandbox::Journey;
using sandbox::Page;
using sandbox::ScenarioInput;
using Kind = TraceEvent::Kind;
using Events = std::vector<TraceEvent>;

int countOf(const Events &events, Kind kind)
{
    return static_cast<int>(std::count_if(events.begin(), events.end(),
                                          [kind](const TraceEvent &event) { return event.kind == kind; }));
}

Events::const_iterator lastOf(Events::const_iterator begin, Events::const_iterator end, Kind kind)
{
    auto found = end;
    for (auto event = begin; event != end; ++event) {
        if (event->kind == kind)
            found = event;
    }
    return found;
}

// The frame of the next page is the first one after the last bytes of the server.
Events::const_iterator paintAfterReply(const Events &events)
{
    const auto reply = lastOf(events.begin(), events.end(), Kind::Receive);
    return std::find_if(reply, events.end(),
                        [](const TraceEvent &event) { return event.kind == Kind::Paint; });
}

// Of the first exchange: the last bytes sent before the last bytes received, since the handshake goes before
// the request and the farewell comes after the reply.
qint64 requestTime(const Events &events)
{
    const auto isConnect = [](const TraceEvent &event) {
        return event.kind == Kind::Connect;
    };
    const auto first = std::find_if(events.begin(), events.end(), isConnect);
    const auto second = std::find_if(first + 1, events.end(), isConnect);
    const auto reply = lastOf(first, second, Kind::Receive);
    return lastOf(first, reply, Kind::Send)->time;
}

double milliseconds(qint64 from, qint64 to)
{
    return static_cast<double>(to - from) / 1e6;
}

int residentKilobytes(qint64 process)
{
    QFile file(QStringLiteral("/proc/%1/status").arg(process));
    if (!file.open(QIODevice::ReadOnly))
        return 0;
    const QList<QByteArray> lines = file.readAll().split('\n');
    for (const QByteArray &line : lines) {
        if (line.startsWith("VmRSS:"))
            return line.mid(6).trimmed().split(' ').constFirst().toInt();
    }
    return 0;
}

} // namespace

Walk::Walk(bench::Screen &screen, Trace &trace, int quietMs)
    : m_screen(screen)
    , m_trace(trace)
    , m_quietMs(quietMs)
{
}

QJsonArray Walk::join(const QString &port)
{
    ScenarioInput input;
    input.port = port;
    bool arrived = awaitPaint();
    for (const Page &page : sandbox::allPages()) {
        if (page.journey == Journey::Join && !page.button.isEmpty() && !page.isLast())
            arrived = arrived && goOn(page, input);
    }
    return arrived ? m_steps : QJsonArray();
}

QJsonArray Walk::failAtAccount(const QString &port, int attempts, qint64 process)
{
    const std::vector<Page> &pages = sandbox::allPages();
    ScenarioInput input;
    input.port = port;
    input.password = QStringLiteral("wrong");
    QJsonArray samples;
    if (!awaitPaint() || !goOn(pages.at(0), input))
        return {};
    for (int attempt = 1; attempt <= attempts; ++attempt) {
        if (!goOn(pages.at(1), input))
            return {};
        input.user.clear(); // what was typed stays
        input.password.clear();
        m_screen.press(kReturn); // dismisses the message box
        if (!awaitPaint())
            return {};
        if (attempt % 10 == 0)
            samples.append(QJsonObject{{QStringLiteral("attempt"), attempt},
                                       {QStringLiteral("rss_kb"), residentKilobytes(process)}});
    }
    return samples;
}

bool Walk::awaitPaint()
{
    const Events events = m_trace.collect([](const Events &seen) { return countOf(seen, Kind::Paint) > 0; },
                                          m_quietMs, kLimitMs);
    if (events.empty())
        m_error = QStringLiteral("nothing was painted");
    return !events.empty() && m_screen.focusTopWindow();
}

void Walk::settle()
{
    m_trace.collect([](const Events & /*seen*/) { return true; }, m_quietMs, kLimitMs);
}

// Fills the fields where there is a text, presses Enter and waits for the exchanges of the page and the page
// after them.
bool Walk::goOn(const Page &page, const ScenarioInput &input)
{
    const bool isFirst = page.name == QLatin1String("server");
    const bool isLast = page.name == QLatin1String("summary");
    const int exchanges = isFirst ? 2 : 1; // certificate and status
    for (const Field &field : page.fields) {
        const QString text = input.*field.value;
        if (text.isEmpty())
            break;
        if (&field != &page.fields.front())
            m_screen.press(kTab);
        m_screen.type(text);
    }
    for (int tabs = 0; isLast && tabs < 2; ++tabs) // from the page to its second button
        m_screen.press(kTab);
    settle();
    const qint64 click = Trace::now();
    m_screen.press(kReturn);
    const Events events = m_trace.collect(
        [exchanges](const Events &seen) {
            return countOf(seen, Kind::Connect) >= exchanges && countOf(seen, Kind::Receive) > 0 &&
                   paintAfterReply(seen) != seen.end();
        },
        m_quietMs, kLimitMs);
    if (events.empty()) {
        m_error = QStringLiteral("no page after page %1").arg(page.name);
        return false;
    }
    const qint64 painted = paintAfterReply(events)->time;
    const qint64 replied = lastOf(events.begin(), events.end(), Kind::Receive)->time;
    QJsonObject step{{QStringLiteral("page"), page.name},
                     {QStringLiteral("reply_to_paint_ms"), milliseconds(replied, painted)},
                     {QStringLiteral("click_to_paint_ms"), milliseconds(click, painted)}};
    if (!isLast)
        step.insert(QStringLiteral("click_to_request_ms"), milliseconds(click, requestTime(events)));
    m_steps.append(step);
    return m_screen.focusTopWindow();
}
