// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "screen.h"
#include "trace.h"

#include "pages.h"

#include <QJsonArray>
#include <QString>

// Goes through the wizard as a user at the keyboard does, and takes the times on the way.
class Walk
{
public:
    // quietMs: how long nothing may happen before a page counts as shown; more for a program that runs in
    // slow motion.
    Walk(bench::Screen &screen, Trace &trace, int quietMs);

    // From the first page to the success window, one element for each click: page, click_to_request_ms
    // (absent for the last one, where local steps come between), reply_to_paint_ms, click_to_paint_ms. Empty
    // where the walk got stuck; then error() says where.
    QJsonArray join(const QString &port);

    // To the account page, and there `attempts` times a wrong password; one element for each tenth attempt:
    // attempt and rss_kb of the process.
    QJsonArray failAtAccount(const QString &port, int attempts, qint64 process);

    QString error() const { return m_error; }

private:
    bool goOn(const sandbox::Page &page, const sandbox::ScenarioInput &input);
    void settle();
    bool awaitPaint();

    bench::Screen &m_screen;
    Trace &m_trace;
    int m_quietMs;
    QJsonArray m_steps;
    QString m_error;
};
