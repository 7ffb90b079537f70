// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QIcon>
#include <QWidget>

namespace Mtk::Widget {

// The icon beside a dialog's text; hidden while there is none.
class DialogIcon : public QWidget
{
    Q_OBJECT

public:
    explicit DialogIcon(QWidget *parent);

    void setIcon(const QIcon &icon);

protected:
    void paintEvent(QPaintEvent *event) override;

private:
    QIcon m_icon;
};

} // namespace Mtk::Widget
