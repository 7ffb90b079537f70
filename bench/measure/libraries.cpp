// SPDX-License-Identifier: Apache-2.0
#include "libraries.h"

#include <QMap>
#include <QRegularExpression>

namespace {

// None of HTTP, TLS, OpenGL or QtNetwork may ever stand here: the first frame has no use for them.
const QMap<QString, QString> &reasons()
{
    static const QMap<QString, QString> table{
        {QStringLiteral("libmtk"), QStringLiteral("the toolkit that draws the window")},
        {QStringLiteral("libhttpclientapi"),
         QStringLiteral("the transport's thin half, without HTTP or TLS")},
        {QStringLiteral("libqsvgicon"), QStringLiteral("the titlebar is given the logo, which is an SVG")},
        {QStringLiteral("libQt5Svg"), QStringLiteral("needed by libqsvgicon")},
    };
    return table;
}

} // namespace

QStringList librariesIn(const QByteArray &maps)
{
    static const QRegularExpression name(QStringLiteral("/([^/\\s]+)\\.so[.0-9]*(?= |$)"),
                                         QRegularExpression::MultilineOption);
    QStringList found;
    auto match = name.globalMatch(QString::fromLocal8Bit(maps));
    while (match.hasNext())
        found.append(match.next().captured(1));
    found.sort();
    found.removeDuplicates();
    return found;
}

Figure librariesFigure(const QString &page, const QStringList &libraries, const QStringList &baseline)
{
    QStringList told;
    int withoutReason = 0;
    for (const QString &library : libraries) {
        if (baseline.contains(library))
            continue;
        const QString reason = reasons().value(library);
        withoutReason += reason.isEmpty() ? 1 : 0;
        told.append(library + QStringLiteral(" (") +
                    (reason.isEmpty() ? QStringLiteral("NO REASON") : reason) + QLatin1Char(')'));
    }
    Figure figure{
        page + QStringLiteral(": libraries without a reason"), double(withoutReason), {}, {}, 0, 0.5, {}};
    figure.remark = QStringLiteral("beyond bare-lean: ") + told.join(QStringLiteral(", "));
    return figure;
}
