// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QByteArray>

// Looks at the contents of the configured files before anything is connected.

// For the PEM readers of OpenSSL, which ask on the terminal without such a callback: gives no passphrase.
int noPassphrase(char *, int, int, void *);

// False when there is no certificate in `pem`, or anything damaged.
bool holdsCertificates(const QByteArray &pem);

// False when one of the two cannot be read (an encrypted key included) or the key belongs to another
// certificate.
bool isPair(const QByteArray &certificatePem, const QByteArray &keyPem);
