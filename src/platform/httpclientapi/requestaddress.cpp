// SPDX-License-Identifier: Apache-2.0
#include "requestaddress.h"

#include <QUrl>

namespace {

constexpr int kMaxDisplayLength = 200;

bool isUsable(const QUrl &url)
{
    return url.isValid() && url.scheme() == QLatin1String("https") && !url.host().isEmpty() &&
           url.userInfo(QUrl::FullyEncoded).isEmpty() && !url.authority().contains(QLatin1Char('@')) &&
           url.port() != 0;
}

// Works on the text, since an address that is not valid has no parts: what stands before the last '@' of such
// a one may be a password, a '?' in it included.
QString withoutSecrets(QString text, bool valid)
{
    const int at = text.lastIndexOf(QLatin1Char('@'));
    for (const char mark : {'?', '#'})
        text = text.left(text.indexOf(QLatin1Char(mark))); // -1: all of it
    if (!valid && at >= 0) {
        const int slashes = text.indexOf(QLatin1String("//"));
        const int start = slashes >= 0 && slashes < at ? slashes + 2 : 0;
        text.remove(start, at + 1 - start);
    }
    return text.left(kMaxDisplayLength);
}

} // namespace

RequestAddress::RequestAddress(const QString &url)
{
    const QUrl parsed(url, QUrl::TolerantMode);
    if (isUsable(parsed))
        m_encoded = parsed.toEncoded(QUrl::RemoveFragment);
    m_display = withoutSecrets(url, isValid());
}
