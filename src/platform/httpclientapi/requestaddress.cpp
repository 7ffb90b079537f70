// SPDX-License-Identifier: Apache-2.0
#include "requestaddress.h"

#include <QRegularExpression>
#include <QUrl>

namespace {

constexpr int kLongestDisplay = 200;

bool isUsable(const QUrl &url)
{
    return url.isValid() && url.scheme() == QLatin1String("https") && !url.host().isEmpty() &&
           url.userInfo(QUrl::FullyEncoded).isEmpty() && !url.authority().contains(QLatin1Char('@')) &&
           url.port() != 0;
}

// Works on the text, since an address that is not valid has no parts.
QString withoutSecrets(const QString &url)
{
    static const QRegularExpression queryOrFragment(QStringLiteral("[?#].*"),
                                                    QRegularExpression::DotMatchesEverythingOption);
    static const QRegularExpression userInfo(QStringLiteral("^([^/]*//)?[^/]*@"));
    static const QRegularExpression unprintable(QStringLiteral("[\\x{00}-\\x{20}\\x{7f}-\\x{9f}]+"));
    QString text = url;
    text.remove(queryOrFragment);
    text.replace(userInfo, QStringLiteral("\\1"));
    text.replace(unprintable, QStringLiteral(" "));
    return text.left(kLongestDisplay);
}

} // namespace

RequestAddress::RequestAddress(const QString &url)
    : m_display(withoutSecrets(url))
{
    const QUrl parsed(url, QUrl::TolerantMode);
    if (isUsable(parsed))
        m_encoded = parsed.toEncoded(QUrl::RemoveFragment);
}
