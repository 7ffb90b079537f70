// SPDX-License-Identifier: Apache-2.0
#pragma once

// What a widget tells its painter, as properties: a painter knows no class of the toolkit.
namespace Mtk::Look {

constexpr char kSuggested[] = "mtkSuggested";     // bool, of a push button: the primary action
constexpr char kDestructive[] = "mtkDestructive"; // bool, of a push button: does what cannot be undone
constexpr char kAlert[] = "alert";                // bool, of an edit: tells of a wrong entry
constexpr char kRadius[] = "mtkFrameRadius";      // int, of a frame: of its corners, in logical pixels
constexpr char kElideMode[] = "mtkElideMode";     // Qt::TextElideMode, of a label
constexpr char kPhase[] = "mtkPhase";             // qreal, 0 to 1, of a progress bar without a range

} // namespace Mtk::Look
