// SPDX-License-Identifier: Apache-2.0
#pragma once

// The Chinese font of the desktop goes by many names. Where one is missing, Qt would have fontconfig sort all
// fonts of the machine by likeness, once for each weight and script.
namespace Mtk::FontFamilies {

// Lets the faces that are installed under the best of the names answer to the others too, in this process
// only. To be called before the application object, which reads the list of fonts. Without any such face
// nothing changes, and Qt takes what is most alike.
void complete();

} // namespace Mtk::FontFamilies
