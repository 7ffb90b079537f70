// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "mobject.h"
#include "mtkglobal.h"

#include <QDialog>

namespace Mtk::Widget {

// Base of all dialogs of the toolkit: modal, with the thin frame of a main window, not resizable.
// Programs use MDialog.
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
