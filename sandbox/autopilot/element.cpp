// SPDX-License-Identifier: Apache-2.0
#include "element.h"

#include <algorithm>

namespace sandbox {

namespace {

template <typename Visit>
void walkThrough(const Element &element, const Visit &visit)
{
    visit(element);
    for (const Element &child : element.children)
        walkThrough(child, visit);
}

const Element *firstEdit(const Element &element)
{
    const Element *found = nullptr;
    walkThrough(element, [&found](const Element &each) {
        if (found == nullptr && each.role == Element::Role::Edit)
            found = &each;
    });
    return found;
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
    const Element *found = nullptr;
    walkThrough(*this, [&](const Element &each) {
        if (found == nullptr && bareCaption(each.name) == wanted)
            found = firstEdit(each);
    });
    return found;
}

const Element *Element::button(const QString &text) const
{
    const std::vector<const Element *> all = buttons();
    const auto found = std::find_if(all.begin(), all.end(),
                                    [&text](const Element *each) { return each->name.trimmed() == text; });
    return found == all.end() ? nullptr : *found;
}

std::vector<const Element *> Element::buttons() const
{
    std::vector<const Element *> found;
    walkThrough(*this, [&found](const Element &each) {
        if (each.role == Role::Button && !each.name.trimmed().isEmpty())
            found.push_back(&each);
    });
    return found;
}

QStringList Element::labels() const
{
    QStringList found;
    walkThrough(*this, [&found](const Element &each) {
        if (each.role == Role::Label && !each.name.trimmed().isEmpty())
            found.append(each.name);
    });
    return found;
}

} // namespace sandbox
