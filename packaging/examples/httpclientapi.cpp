// SPDX-License-Identifier: Apache-2.0
#include <httpclientapi.h>

#include <QCoreApplication>

namespace {

QString warnings;

void listen(QtMsgType, const QMessageLogContext &, const QString &text)
{
    warnings += text;
}

} // namespace

// Nobody listens at this port, so there is no answer. The reason is libcurl's own only where the library has
// found its private module.
int main(int argc, char **argv)
{
    const QCoreApplication application(argc, argv);
    qInstallMessageHandler(listen);
    HttpClientApi client(nullptr, false);
    const QString nowhere = QStringLiteral("/nonexistent");
    client.setSSLConfig(nowhere, nowhere, nowhere);
    QString reply;
    const int status = client.getRequest(reply, QStringLiteral("https://127.0.0.1:9/"), QString(), true);
    return status == 0 && warnings.contains(QStringLiteral("Failed to connect")) ? 0 : 1;
}
