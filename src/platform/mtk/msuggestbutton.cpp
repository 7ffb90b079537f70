// SPDX-License-Identifier: Apache-2.0
#include "msuggestbutton.h"

#include "style/looks.h"

#include <QVariant>

namespace Mtk::Widget {

MSuggestButton::MSuggestButton(QWidget *parent)
    : MSuggestButton(QString(), parent)
{
}

MSuggestButton::MSuggestButton(const QString &text, QWidget *parent)
    : QPushButton(text, parent)
{
    setProperty(Look::kSuggested, true);
}

MSuggestButton::~MSuggestButton() = default;

} // namespace Mtk::Widget
