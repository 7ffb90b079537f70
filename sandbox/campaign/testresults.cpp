// SPDX-License-Identifier: Apache-2.0
#include "campaign/testresults.h"

#include <QFile>
#include <QXmlStreamReader>

namespace sandbox {

std::optional<TestResults> TestResults::read(const QString &path, QString *error)
{
    QFile file(path);
    TestResults results;
    QString name;
    bool isSkipped = false;
    if (!file.open(QIODevice::ReadOnly)) {
        *error = QStringLiteral("%1: cannot be read: %2").arg(path, file.errorString());
        return std::nullopt;
    }
    QXmlStreamReader xml(&file);
    while (!xml.atEnd()) {
        if (xml.readNext() != QXmlStreamReader::StartElement)
            continue;
        if (xml.name() == QLatin1String("testcase")) {
            name = xml.attributes().value(QLatin1String("name")).toString();
            const auto status = xml.attributes().value(QLatin1String("status"));
            isSkipped = status == QLatin1String("notrun");
            if (!isSkipped)
                results.passed.insert(name, status == QLatin1String("run"));
        } else if (xml.name() == QLatin1String("system-out") && isSkipped) {
            results.skipped.insert(name, xml.readElementText().trimmed());
        }
    }
    if (!xml.hasError())
        return results;
    *error = QStringLiteral("%1: %2").arg(path, xml.errorString());
    return std::nullopt;
}

QString TestResults::skippedText() const
{
    QMap<QString, int> reasons;
    for (const QString &reason : skipped)
        ++reasons[reason];
    QString text =
        QStringLiteral("%1 tests passed, %2 skipped\n").arg(passed.values().count(true)).arg(skipped.size());
    for (auto reason = reasons.begin(); reason != reasons.end(); ++reason)
        text += QStringLiteral("%1 skipped: %2\n").arg(*reason).arg(reason.key());
    return text;
}

} // namespace sandbox
