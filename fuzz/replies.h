// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QByteArray>
#include <QString>
#include <QVector>

namespace fuzz {

// One reply of the transport: HTTP status (0: none) and text.
struct Reply
{
    int status = 0;
    QString text;
};

// The parts of an input, which stand between lines of "====".
QVector<QByteArray> partsOf(const QByteArray &input);

// A reply from its part: the first line is the status, the rest the body. What the transport never returns
// is brought into its form: a negative status is none, and without a status there is no text.
Reply replyOf(const QByteArray &part);

// All parts from `first` on as replies.
QVector<Reply> repliesOf(const QByteArray &input, int first = 0);

} // namespace fuzz
