// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QFile>

// Files that hold a key or certificate: made so that nobody but their owner could ever read them.
namespace privatefile {

// Makes the file that `file` names anew and opens it for writing. What stood at the path is gone first, so
// that a failure leaves nothing old behind; a link there is removed, not followed. Missing folders are made.
// False when the file could not be made, for example because the path is a folder.
bool create(QFile &file);

} // namespace privatefile
