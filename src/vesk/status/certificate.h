// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QByteArray>
#include <QDateTime>
#include <QJsonObject>
#include <QString>

#include <optional>

// The first certificate of a PEM text, as people know it; there is none in an encrypted block.
struct Certificate
{
    QString subject; // distinguished names as in RFC 2253
    QString issuer;
    QString fingerprint; // SHA-256, hexadecimal pairs with colons
    QDateTime from;
    QDateTime to;

    static std::optional<Certificate> read(const QByteArray &pem);

    // Whole days until it expires; negative once it has.
    qint64 daysLeft() const;
    void describeTo(QJsonObject &object) const;
};
