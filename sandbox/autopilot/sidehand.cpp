// SPDX-License-Identifier: Apache-2.0
#include "sidehand.h"

#include "accessibletree.h"
#include "patience.h"

#include <functional>

namespace sandbox {

namespace {

constexpr int kLimitMs = 10000;
constexpr int kMostInstances = 2;

const QString kDismiss = QStringLiteral("确定");

// The button to press in this window, or null.
using Choice = std::function<const Element *(const Element &window)>;

bool pressIn(const AccessibleTree &tree, const Choice &choice)
{
    const std::vector<Element> windows = tree.windows();
    for (const Element &window : windows) {
        if (const Element *button = choice(window)) {
            tree.press(*button, QDeadlineTimer(kLimitMs));
            return true;
        }
    }
    return false;
}

// Looks at one instance of the program after the other.
bool pressAnywhere(const QString &program, const Choice &choice)
{
    for (int instance = 0; instance < kMostInstances; ++instance) {
        try {
            const AccessibleTree tree(program, QDeadlineTimer(0), instance);
            if (pressIn(tree, choice))
                return true;
        } catch (const Trouble &) {
            return false; // there is no further one
        }
    }
    return false;
}

void pressOne(const QString &program, const QString &what, const Choice &choice)
{
    waitFor(
        QDeadlineTimer(kLimitMs), [&] { return QStringLiteral("%1 does not show").arg(what); },
        [&] { return pressAnywhere(program, choice); });
}

} // namespace

void sidehand::press(const QString &program, const QString &button)
{
    pressOne(program, button, [&button](const Element &window) { return window.button(button); });
}

void sidehand::answer(const QString &program, const QString &message)
{
    pressOne(program, message, [&message](const Element &window) -> const Element * {
        return window.labels().contains(message) ? window.button(kDismiss) : nullptr;
    });
}

} // namespace sandbox
