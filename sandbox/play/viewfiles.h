// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "state/statedirectory.h"

#include <QMap>

namespace sandbox {

// What stands at a path of the view that a program has.
struct ViewEntry
{
    QString look;    // mode in octal digits, a blank and the type: "0644 file"; a link is "link to TARGET"
    QString content; // of a regular file: what changes with every write to it, and its hash
    bool isTemporary = false; // there only while a program runs in the view

    bool operator==(const ViewEntry &other) const { return look == other.look && content == other.content; }
    bool operator!=(const ViewEntry &other) const { return !(*this == other); }
};

// The beginning of the SHA-256 hash of a file's content, as the journal has those of keys and certificates.
QString contentHash(const QString &path);

// By path: absolute as the program sees it, "~/..." below its home. Links are not followed.
using ViewFiles = QMap<QString, ViewEntry>;

// Everything in a world that the program could write to.
ViewFiles viewFiles(const StateDirectory &state);

// Where a path of ViewFiles lies on this machine.
QString hostPath(const StateDirectory &state, const QString &path);

// Does to `before` what was done to the files between `earlier` and `later`.
void follow(const ViewFiles &earlier, const ViewFiles &later, ViewFiles *before);

} // namespace sandbox
