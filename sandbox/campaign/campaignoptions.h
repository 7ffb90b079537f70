// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QString>
#include <QStringList>

namespace sandbox {

// The command line of `vesk-sandbox campaign`.
struct CampaignOptions
{
    bool isFast = false; // a chosen part of the rows
    QString only;        // wildcards over GROUP/STAGE/FAULT; empty: all
    int jobs = 2;
    QString report; // file for the summary; empty: none
    QString keep;   // folder in which every world stays; empty: only those of failed rows
    bool isListed = false;
    QString program; // what is started in veskw's place; empty: veskw

    static QString usage();
    // False with one line in `error`.
    static bool parse(const QStringList &arguments, CampaignOptions *options, QString *error);
};

} // namespace sandbox
