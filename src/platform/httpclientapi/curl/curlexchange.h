// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "exchange.h"

// How far an exchange came, beside what ExchangeOutcome says. Not part of what library and module share.
struct ExchangeTrace
{
    enum class Reached { Nothing, Name, Tcp, Tls }; // of the server, or of a proxy in between
    Reached reached = Reached::Nothing;
    QString address; // IP address of the other end
    QByteArray date; // header "Date" of the reply
};

// To be called once, before the first exchange and while no other thread runs. False when libcurl cannot be
// set up.
bool setUpCurl();

// One exchange over a fresh handle of libcurl, and so over a connection of its own, which is closed before
// the function returns. Blocks; may run in several threads at once.
void exchangeByCurl(const ExchangeRequest &request, ExchangeOutcome &outcome);
void traceExchange(const ExchangeRequest &request, ExchangeOutcome &outcome, ExchangeTrace &trace);
