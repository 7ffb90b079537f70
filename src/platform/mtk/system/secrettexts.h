// SPDX-License-Identifier: Apache-2.0
#pragma once

// What listeners on the accessibility bus are told of texts. Qt tells every one of them each letter that is
// typed, deleted or set, whatever the eye sees instead. With the filter they are told of bullets where the
// text is secret, which is where QLineEdit's echo mode is not normal or its hints say Qt::ImhSensitiveData,
// and of nothing in a field that does not show.
namespace Mtk::SecretTexts {

void installFilter();
void removeFilter();

} // namespace Mtk::SecretTexts
