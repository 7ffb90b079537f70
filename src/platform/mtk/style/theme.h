// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QColor>
#include <QMargins>
#include <QPalette>

namespace Mtk {

// Every color, length and duration of the theme, in one plain value that widgets and style read. Lengths are
// in logical pixels, durations in milliseconds. Unless it is disabled, text has a contrast of at least 4.5 to
// 1 with its background, and the outline of what can be operated one of at least 3 to 1.
struct Theme
{
    QColor window = QColor(247, 247, 247);
    QColor windowBorder = QColor(122, 132, 145);
    QColor shade = QColor(0, 0, 0, 110); // over a window that waits behind a modal one
    QColor titlebar = QColor(239, 241, 244);
    QColor surface = QColor(255, 255, 255); // edits, popups, menus
    QColor text = QColor(29, 39, 51);
    QColor textMuted = QColor(91, 102, 115); // glyphs
    QColor placeholder = QColor(104, 113, 124);
    QColor textDisabled = QColor(160, 168, 178);

    QColor accent = QColor(42, 95, 208);
    QColor accentHover = QColor(53, 106, 217);
    QColor accentPressed = QColor(31, 78, 178);
    QColor accentDisabled = QColor(176, 194, 234);
    QColor onAccent = QColor(255, 255, 255);

    QColor control = QColor(230, 233, 238);
    QColor controlHover = QColor(220, 225, 231);
    QColor controlPressed = QColor(206, 212, 221);
    QColor controlDisabled = QColor(237, 239, 242);

    QColor border = QColor(126, 136, 149);
    QColor borderHover = QColor(91, 102, 115);
    QColor borderDisabled = QColor(225, 229, 234);
    QColor separator = QColor(216, 221, 228);
    QColor track = QColor(222, 226, 232); // what a bar, a spinner or a scroll bar runs on
    QColor switchOff = QColor(126, 136, 149);
    QColor switchOffDisabled = QColor(211, 216, 222);

    QColor alert = QColor(184, 36, 28);
    QColor alertPressed = QColor(150, 28, 20);
    QColor alertSurface = QColor(255, 246, 245);
    QColor caution = QColor(240, 163, 26);

    QColor itemBackground = QColor(237, 239, 242);
    QColor frameShadowBorder = QColor(232, 236, 242);

    int controlHeight = 36;
    int controlMinimumWidth = 80;
    int controlPadding = 12;
    int controlRadius = 8;
    int panelRadius = 8;
    int windowRadius = 12;
    int focusRing = 2;
    int focusGap = 1;
    int editPadding = 10;
    int glyphButton = 28;
    int glyph = 14;
    int glyphPadding = 4;

    int titlebarHeight = 50;
    int titlebarPadding = 10;
    int titlebarSpacing = 8;
    int titleIcon = 24;
    int titleButton = 32;

    int dialogWidth = 380;
    int dialogTextWidth = 480; // lines of a message are not made longer than this
    int dialogTitlebarHeight = 40;
    int dialogIcon = 40;
    int dialogSpacing = 12;
    int dialogPadding = 20;

    int progressHeight = 8;
    int progressWidth = 160;
    int spinner = 20;
    int switchWidth = 40;
    int switchHeight = 22;
    int switchKnobInset = 3;
    int scrollBar = 8;
    int scrollHandle = 24;

    int arrowLength = 8;
    int arrowWidth = 16;
    int arrowInset = 24; // the arrow's tip from the nearer corner of the popup
    int popupPadding = 2;
    int menuMargin = 4; // above the first entry and below the last

    int slideDuration = 140;
    int turnDuration = 1000; // one turn of the spinner, one run of the bar
    int frameInterval = 33;

    int fontPixelSize = 14;
};

const Theme &theme();

// The theme's colors as Qt's roles, for widgets that the style doesn't paint by itself.
QPalette themePalette();

} // namespace Mtk
