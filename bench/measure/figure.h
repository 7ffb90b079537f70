// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QString>

#include <vector>

// One line of the table.
struct Figure
{
    QString what;
    double value = 0;
    QString unit;
    QString baseline; // what it is compared with; empty for a figure that stands alone
    double baselineValue = 0;
    double target = 0; // highest ratio, or highest value where there is no baseline; 0: none is set
    QString remark;

    double pairedRatio = 0; // of times: the median of the ratios of each round; 0 where there are no rounds

    double ratio() const;
    bool hasTarget() const { return target > 0; }
    bool isMet() const;
};

using Figures = std::vector<Figure>;

// Prints the table on standard output.
void printTable(const Figures &figures);

// Writes the same as JSON: an array of objects. False where the file cannot be written.
bool writeJson(const Figures &figures, const QString &path);

double median(std::vector<double> values);

// A figure of times that were taken in turns, in milliseconds.
Figure pairedTimes(const QString &what, const std::vector<double> &values, const QString &baseline,
                   const std::vector<double> &baselineValues, double target);
