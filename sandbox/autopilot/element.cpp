// SPDX-License-Identifier: Apache-2.0
#include "element.h"

#include <QMetaEnum>

#include <algorithm>

namespace sandbox {

namespace {

// The first of an element and those inside it for which `isWanted` holds, or null.
template <typename Predicate>
const Element *first(const Element &element, const Predicate &isWanted)
{
    if (isWanted(element))
        return &element;
    for (const Element &child : element.children) {
        if (const Element *found = first(child, isWanted))
            return found;
    }
    return nullptr;
}

bool isEdit(const Element &element)
{
    return element.role == Element::Text || element.isSecret();
}

} // namespace

QString bareCaption(const QString &caption)
{
    QString bare;
    std::copy_if(caption.begin(), caption.end(), std::back_inserter(bare),
                 [](QChar c) { return !c.isSpace() && c != QLatin1Char(':') && c != QChar(0xff1a); });
    return bare;
}

const Element *Element::edit(const QString &caption) const
{
    const QString wanted = bareCaption(caption);
    const Element *captioned = first(*this, [&wanted](const Element &each) {
        return bareCaption(each.name) == wanted && first(each, isEdit) != nullptr;
    });
    return captioned == nullptr ? nullptr : first(*captioned, isEdit);
}

const Element *Element::button(const QString &text) const
{
    return first(*this,
                 [&text](const Element &each) { return each.role == Button && each.name.trimmed() == text; });
}

std::vector<const Element *> Element::all(Role wanted) const
{
    std::vector<const Element *> found;
    first(*this, [&](const Element &each) {
        if (each.role == wanted && !each.name.trimmed().isEmpty())
            found.push_back(&each);
        return false;
    });
    return found;
}

QStringList Element::labels() const
{
    QStringList texts;
    for (const Element *label : all(Label))
        texts.append(label->name);
    return texts;
}

QStringList Element::spoken() const
{
    QStringList lines;
    first(*this, [&lines](const Element &each) {
        const QStringList parts{QString::fromLatin1(QMetaEnum::fromType<Role>().valueToKey(each.role)),
                                each.name.simplified(), each.description};
        if (!parts.at(0).isEmpty() && !parts.at(1).isEmpty())
            lines.append(parts.join(QLatin1String(" | ")));
        return false;
    });
    return lines;
}

} // namespace sandbox
