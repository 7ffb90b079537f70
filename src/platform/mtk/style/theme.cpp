// SPDX-License-Identifier: Apache-2.0
#include "theme.h"

namespace Mtk {

const Theme &theme()
{
    static const Theme value;
    return value;
}

QPalette themePalette()
{
    const Theme &t = theme();
    QPalette palette(t.text, t.control, t.surface, t.borderHover, t.border, t.text, t.onAccent, t.surface,
                     t.window);
    palette.setColor(QPalette::PlaceholderText, t.placeholder);
    palette.setColor(QPalette::AlternateBase, t.itemBackground);
    palette.setColor(QPalette::ToolTipBase, t.surface);
    palette.setColor(QPalette::ToolTipText, t.text);
    palette.setColor(QPalette::Highlight, t.accent);
    palette.setColor(QPalette::HighlightedText, t.onAccent);
    palette.setColor(QPalette::Link, t.accent);
    for (const QPalette::ColorRole role : {QPalette::WindowText, QPalette::Text, QPalette::ButtonText})
        palette.setColor(QPalette::Disabled, role, t.textDisabled);
    palette.setColor(QPalette::Disabled, QPalette::Base, t.controlDisabled);
    return palette;
}

} // namespace Mtk
