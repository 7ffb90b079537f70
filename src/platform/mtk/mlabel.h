// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "mobject.h"
#include "mtkglobal.h"

#include <QLabel>

namespace Mtk::Widget {

// A label in the theme's font. Shows plain text unless setTextFormat() says otherwise, so that what a server
// or a user wrote is not taken for markup.
class MTK_EXPORT MLabel : public QLabel, public Core::MObject
{
    Q_OBJECT

public:
    explicit MLabel(QWidget *parent = nullptr, Qt::WindowFlags flags = {});
    ~MLabel() override;
};

} // namespace Mtk::Widget
