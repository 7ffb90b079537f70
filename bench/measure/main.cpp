// SPDX-License-Identifier: Apache-2.0
// Measures the program of this build and prints one table.
//
//   vesk-bench [JSON_FILE]
//
// Ends with 1 where a figure misses its target.
#include "figure.h"
#include "joincost.h"
#include "stage.h"
#include "startcost.h"

#include <QCoreApplication>

#include <algorithm>
#include <cstdio>

int main(int argc, char **argv)
{
    const QCoreApplication application(argc, argv);
    const QStringList arguments = QCoreApplication::arguments().mid(1);
    Figures figures;
    {
        const Stage stage;
        double firstPaint = 0;
        figures = measureStart(stage, &firstPaint);
        const Figures join = measureJoin(stage, firstPaint);
        figures.insert(figures.end(), join.begin(), join.end());
    }
    printTable(figures);
    if (!arguments.isEmpty() && !writeJson(figures, arguments.constFirst())) {
        std::fprintf(stderr, "vesk-bench: cannot write %s\n", qPrintable(arguments.constFirst()));
        return 1;
    }
    return std::all_of(figures.begin(), figures.end(), [](const Figure &figure) { return figure.isMet(); })
               ? 0
               : 1;
}
