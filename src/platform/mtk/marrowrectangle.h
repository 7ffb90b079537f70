// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "mtkglobal.h"

#include <QPainterPath>
#include <QPointer>
#include <QWidget>

namespace Mtk::Widget {

// A floating popup with an arrow that points at a place. Takes neither focus nor grab, so the user can go on
// typing in the field that it speaks of. Stays where it was shown, and goes when the window that it belongs
// to is hidden.
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

    // Takes ownership; a content set before is deleted.
    void setContent(QWidget *content);
    // Fits the popup to its content after the content changed.
    void resizeWithContent();

    // Shows the popup with the arrow's tip at the global position. Where the screen ends the body moves along
    // and the arrow stays.
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
    int m_tipOffset = 0; // where along its edge the arrow's tip stands
};

} // namespace Mtk::Widget
