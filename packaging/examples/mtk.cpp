// SPDX-License-Identifier: Apache-2.0
#include <mtk/mapplication.h>
#include <mtk/mdialog.h>

int main(int argc, char **argv)
{
    const Mtk::Widget::MApplication application(argc, argv);
    Mtk::Widget::MDialog dialog(nullptr);
    return dialog.addButton(QStringLiteral("OK"), true, Mtk::Widget::MDialog::ButtonNormal) == 0 ? 0 : 1;
}
