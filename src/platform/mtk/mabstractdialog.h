// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "mobject.h"
#include "mtkglobal.h"

#include <QDialog>

namespace Mtk::Widget {

// What all dialogs of the toolkit share: modal, a thin frame of their own like the main window's, no
// resizing. Programs use MDialog.
class MTK_EXPORT MAbstractDialog : public QDialog, public Core::MObject
{
    Q_OBJECT

public:
    explicit MAbstractDialog(QWidget *parent = nullptr);
    ~MAbstractDialog() override;

protected:
    void paintEvent(QPaintEvent *event) override;
};

} // namespace Mtk::Widget
