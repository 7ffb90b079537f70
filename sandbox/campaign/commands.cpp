// SPDX-License-Identifier: Apache-2.0
#include "campaign/commands.h"

#include "campaign/campaign.h"
#include "campaign/manyjoins.h"
#include "campaign/rowneeds.h"
#include "campaign/rowrun.h"

#include <cstdio>

namespace sandbox {

namespace {

constexpr int kUsageError = 2;

int fail(const QString &reason)
{
    std::fprintf(stderr, "vesk-sandbox: %s (campaign --help tells more)\n", qPrintable(reason));
    return kUsageError;
}

} // namespace

int runCampaign(const QStringList &arguments)
{
    QStringList words = arguments;
    words.removeAt(1);
    if (words.contains(QStringLiteral("--help"))) {
        std::printf("%s", qPrintable(CampaignOptions::usage()));
        return 0;
    }
    CampaignOptions options;
    QString error;
    if (!CampaignOptions::parse(words, &options, &error))
        return fail(error);
    const auto tables = CampaignTables::load(CampaignTables::standardFolder(), &error);
    return tables ? Campaign(*tables, options).run() : fail(error);
}

int runCampaignRow(const QStringList &arguments)
{
    if (arguments.size() != 7 || arguments.at(3) != QLatin1String("--state") ||
        arguments.at(5) != QLatin1String("--program"))
        return fail(QStringLiteral("usage: vesk-sandbox campaign-row ID --state FOLDER --program PATH"));
    QString error;
    const auto tables = CampaignTables::load(CampaignTables::standardFolder(), &error);
    if (!tables)
        return fail(error);
    const Row *row = tables->row(arguments.at(2));
    if (row == nullptr)
        return fail(QStringLiteral("no row %1").arg(arguments.at(2)));
    const QString lack = rowneeds::lacking(*row);
    if (!lack.isEmpty()) {
        std::printf("%s\n", qPrintable(lack));
        return rowneeds::kLeftOut;
    }
    const int smallTmp = row->start.value(QLatin1String("small_tmp")).toInt();
    const QString tmp = StateFolder(arguments.at(4)).inside(QStringLiteral("/tmp"));
    if (smallTmp > 0 && !rowneeds::enterSmallTmp(tmp, smallTmp, &error))
        return fail(error);
    const bool joins = row->start.contains(QLatin1String("joins"));
    const QStringList complaints = joins ? ManyJoins(*tables, *row, arguments.at(4)).run()
                                         : RowRun(*tables, *row, arguments.at(4), arguments.at(6)).run();
    for (const QString &complaint : complaints)
        std::printf("%s\n", qPrintable(complaint));
    return complaints.isEmpty() ? 0 : 1;
}

} // namespace sandbox
