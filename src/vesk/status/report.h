// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QByteArray>
#include <QString>

// Writes a text for whoever looks into a failure: `status` (JSON), a listing of the directories, versions of
// the packages, and the program's lines in the journal. Taken out: PEM keys, long Base64, values called a
// password or the like, user information of addresses. Makes a new file for its owner alone; what is there, a
// link included, is left as it is. False with a reason in `error` when it cannot be made or written.
bool writeReport(const QString &path, const QByteArray &status, QString *error);
