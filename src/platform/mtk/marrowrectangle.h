// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "mtkglobal.h"

#include <QPainterPath>
#include <QPointer>
#include <QWidget>

namespace Mtk::Widget {

// A floating popup with an arrow. Takes neither focus nor grab, so that the user can go on typing in the
// field it points at. Stays where it was shown, and hides together with its parent's window.
class MTK_EXPORT MArrowRectangle : public QWidget
{
    Q_OBJECT

public:
    // The edge of the popup that carries the arrow. The numbers are part of the binary interface.
    enum ArrowDirection {
        ArrowLeft = 0,
        ArrowRight = 1,
        ArrowTop = 2,
        ArrowBottom = 3,
    };
    Q_ENUM(ArrowDirection)

    explicit MArrowRectangle(ArrowDirection direction, QWidget *parent = nullptr);
    ~MArrowRectangle() override;

    // Takes ownership and deletes the previous content. Null leaves the popup empty.
    void setContent(QWidget *content);
    // Fits the popup to its content; call it after the content changed. Does nothing without content.
    void resizeWithContent();

    // Shows the popup with the tip of its arrow at (x, y), in global logical pixels. At the edge of the
    // screen the body moves and the arrow stays.
    virtual void show(int x, int y);

    bool eventFilter(QObject *watched, QEvent *event) override;

protected:
    void paintEvent(QPaintEvent *event) override;
    void showEvent(QShowEvent *event) override;
    void resizeEvent(QResizeEvent *event) override;

private:
    bool isHorizontal() const;
    QMargins bodyMargins() const;
    QPainterPath outline() const;
    void updateShape();

    const ArrowDirection m_direction;
    QPointer<QWidget> m_content;
    int m_tipOffset = 0; // of the arrow's tip along its edge
};

} // namespace Mtk::Widget
