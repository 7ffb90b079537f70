// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "mtkglobal.h"

#include <QPushButton>

namespace Mtk::Widget {

// The button of the primary action, filled with the theme's accent. Otherwise a QPushButton.
class MTK_EXPORT MSuggestButton : public QPushButton
{
    Q_OBJECT

public:
    explicit MSuggestButton(QWidget *parent = nullptr);
    explicit MSuggestButton(const QString &text, QWidget *parent = nullptr);
    ~MSuggestButton() override;
};

} // namespace Mtk::Widget
