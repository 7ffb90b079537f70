// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QMap>
#include <QString>

#include <optional>

namespace sandbox {

// What ctest wrote about its tests with --output-junit.
struct TestResults
{
    // False in the map: it failed.
    QMap<QString, bool> passed;     // by name of the test
    QMap<QString, QString> skipped; // reasons by name

    // Nothing, with one line in `error`, where the file cannot be read.
    static std::optional<TestResults> read(const QString &path, QString *error);

    // How many were skipped, and each reason with how many.
    QString skippedText() const;
};

} // namespace sandbox
