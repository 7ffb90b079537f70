// SPDX-License-Identifier: Apache-2.0
#pragma once

class QString;

namespace Gallery {

// Writes one PNG file for each section to `directory`, which is created when missing. Returns false after a
// line on standard error that names what could not be written.
bool writeScreenshots(const QString &directory);

} // namespace Gallery
