// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "element.h"

#include "scenario/scenario.h"

#include <optional>

namespace sandbox {

/// One field of a page and the part of a scenario's input that belongs into it.
struct Field
{
    QString caption;
    QString ScenarioInput::*value;
};

/// One page of the program, as users recognise it: by its title, which one reads and another hears as the
/// description of the window or the name of the dialog.
struct Page
{
    Journey journey;
    QString name; ///< as scenario files call it
    int number;   ///< place in its journey, from 1; first part of the screenshot's file name
    QString title;
    QString button; ///< leads on; empty when the page goes on by itself
    std::vector<Field> fields;
    QString cancelButton; ///< where a scenario may take it in place of `button`

    bool isLast() const { return name == QLatin1String("success"); } ///< its button ends the run

    /// While joining, the program waits for a service without holding up its window.
    bool isNeverAtRest() const { return button.isEmpty() && journey == Journey::Join; }
};

/// All pages of both journeys, in the order in which a user meets them.
const std::vector<Page> &allPages();

/// What stands in front of the user at one moment: a page, or a message box on top of it. Walk asks for it
/// again and again; it is a copy that never changes.
struct Window
{
    Element element;
    const Page *page; ///< null when this is a message box

    /// The front of these windows, or nothing when no page and no message box is among them.
    static std::optional<Window> inFront(const std::vector<Element> &windows);

    /// Whether the program waits for its user only: some button can be pressed, which none
    /// can while a call is in progress or a message box is open, and none is on its way up from a press.
    bool isAtRest() const;
};

} // namespace sandbox
