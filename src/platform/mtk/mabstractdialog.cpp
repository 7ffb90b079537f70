// SPDX-License-Identifier: Apache-2.0
#include "mabstractdialog.h"

#include "parts/windowframe.h"

namespace Mtk::Widget {

MAbstractDialog::MAbstractDialog(QWidget *parent)
    : QDialog(parent, Qt::Dialog | Qt::FramelessWindowHint | Qt::WindowTitleHint | Qt::WindowCloseButtonHint)
{
    setModal(true);
    WindowFrame::prepare(this);
}

MAbstractDialog::~MAbstractDialog() = default;

void MAbstractDialog::paintEvent(QPaintEvent * /*event*/)
{
    WindowFrame::paint(this, palette().color(QPalette::Window));
}

} // namespace Mtk::Widget
