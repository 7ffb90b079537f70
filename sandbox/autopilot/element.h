// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "accessiblebus.h"

#include <QStringList>

namespace sandbox {

/// What a screen reader learns of one widget, with all that is showing inside it: a copy taken at one moment.
/// AccessibleTree makes it; everything that looks for something in a window looks in the copy.
struct Element
{
    enum class Role { Other, Dialog, Label, Button, Edit };

    ObjectRef object;
    Role role = Role::Other;
    QString name;
    bool enabled = false;
    bool pressed = false; ///< held down still; a press takes effect in the moment of release
    bool secret = false;  ///< an edit that shows no clear text
    std::vector<Element> children;

    /// The edit with this caption, which may be its own name or that of a widget around it, or null.
    const Element *edit(const QString &caption) const;

    /// The button with this text, or null.
    const Element *button(const QString &text) const;

    /// Every button that carries a text, in the order of the tree.
    std::vector<const Element *> buttons() const;

    /// Texts of all labels that are not blank, in the order of the tree.
    QStringList labels() const;
};

/// A caption without blanks and colons: "   密     码:" and "密码" name the same field.
QString bareCaption(const QString &caption);

} // namespace sandbox
