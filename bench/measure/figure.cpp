// SPDX-License-Identifier: Apache-2.0
#include "figure.h"

#include <QJsonArray>
#include <QJsonDocument>
#include <QJsonObject>
#include <QSaveFile>

#include <algorithm>
#include <cstdio>

namespace {

QString number(double value)
{
    return QString::number(value, 'f', value < 1000 ? 2 : 0);
}

QString verdict(const Figure &figure)
{
    if (!figure.hasTarget())
        return QString();
    const QString target = QStringLiteral("at most %1").arg(figure.target, 0, 'f', 2);
    return target + (figure.isMet() ? QStringLiteral("  met") : QStringLiteral("  NOT MET"));
}

} // namespace

double Figure::ratio() const
{
    if (pairedRatio > 0)
        return pairedRatio;
    return baselineValue > 0 ? value / baselineValue : 0;
}

bool Figure::isMet() const
{
    return !hasTarget() || (baseline.isEmpty() ? value : ratio()) <= target;
}

void printTable(const Figures &figures)
{
    std::printf("%-52s %14s %-4s %-12s %14s %7s  %s\n", "figure", "value", "", "baseline", "", "ratio",
                "target");
    for (const Figure &figure : figures) {
        const bool compared = !figure.baseline.isEmpty();
        std::printf("%-52s %14s %-4s %-12s %14s %7s  %s\n", qPrintable(figure.what),
                    qPrintable(number(figure.value)), qPrintable(figure.unit), qPrintable(figure.baseline),
                    qPrintable(compared ? number(figure.baselineValue) : QString()),
                    qPrintable(compared ? QString::number(figure.ratio(), 'f', 3) : QString()),
                    qPrintable(verdict(figure)));
        if (!figure.remark.isEmpty())
            std::printf("    %s\n", qPrintable(figure.remark));
    }
}

bool writeJson(const Figures &figures, const QString &path)
{
    QJsonArray rows;
    for (const Figure &figure : figures) {
        QJsonObject row{{QStringLiteral("figure"), figure.what},
                        {QStringLiteral("value"), figure.value},
                        {QStringLiteral("unit"), figure.unit}};
        if (!figure.baseline.isEmpty()) {
            row.insert(QStringLiteral("baseline"), figure.baseline);
            row.insert(QStringLiteral("baseline_value"), figure.baselineValue);
            row.insert(QStringLiteral("ratio"), figure.ratio());
        }
        if (figure.hasTarget()) {
            row.insert(QStringLiteral("target"), figure.target);
            row.insert(QStringLiteral("met"), figure.isMet());
        }
        if (!figure.remark.isEmpty())
            row.insert(QStringLiteral("remark"), figure.remark);
        rows.append(row);
    }
    QSaveFile file(path);
    return file.open(QIODevice::WriteOnly) && file.write(QJsonDocument(rows).toJson()) > 0 && file.commit();
}

double median(std::vector<double> values)
{
    if (values.empty())
        return 0;
    std::sort(values.begin(), values.end());
    const size_t middle = values.size() / 2;
    return values.size() % 2 == 1 ? values[middle] : (values[middle - 1] + values[middle]) / 2;
}

Figure pairedTimes(const QString &what, const std::vector<double> &values, const QString &baseline,
                   const std::vector<double> &baselineValues, double target)
{
    std::vector<double> ratios;
    for (size_t round = 0; round < values.size() && round < baselineValues.size(); ++round)
        ratios.push_back(values[round] / baselineValues[round]);
    Figure figure{what, median(values), QStringLiteral("ms"), baseline, median(baselineValues), target, {}};
    figure.pairedRatio = median(ratios);
    return figure;
}
