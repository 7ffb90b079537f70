// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "accessiblebus.h"

#include <QStringList>

#include <vector>

namespace sandbox {

/// What a screen reader sees of one widget and of all visible ones inside it: a snapshot.
/// AccessibleTree makes it; everything that looks for something in a window looks in the copy.
struct Element
{
    Q_GADGET
public:
    /// Numbers of the AT-SPI 2 protocol; others are of no interest.
    enum Role { Dialog = 16, Window = 23, Label = 29, Password = 40, Progress = 42, Button = 43, Text = 61 };
    Q_ENUM(Role)

    ObjectRef object;
    Role role = Role();
    QString name;
    QString description;
    bool enabled = false;
    bool pressed = false; ///< held down still; a press takes effect in the moment of release
    std::vector<Element> children;

    bool isSecret() const { return role == Password; } ///< an edit that shows no clear text

    /// The edit with this caption, which may be its own name or that of a widget around it, or null.
    const Element *edit(const QString &caption) const;

    /// The button with this text, or null.
    const Element *button(const QString &text) const;

    /// All of this role that carry a text, in the order of the tree.
    std::vector<const Element *> all(Role wanted) const;

    /// Texts of all labels that are not blank, in the order of the tree.
    QStringList labels() const;

    /// What is heard of it and all inside, one line each: role, name and description.
    QStringList spoken() const;
};

/// A caption without blanks and colons: "   密     码:" and "密码" name the same field.
QString bareCaption(const QString &caption);

} // namespace sandbox
