// SPDX-License-Identifier: Apache-2.0
#pragma once

class QString;

namespace Gallery {

// Writes one PNG file for each section into `folder`, which is made when it is missing. Returns false after a
// line on standard error that names the file which could not be written.
bool writePictures(const QString &folder);

} // namespace Gallery
