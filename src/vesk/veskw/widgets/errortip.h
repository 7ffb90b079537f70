// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "mtk/marrowrectangle.h"

#include <QString>

class QLabel;

namespace mcc::widgets {

// The small floating popup in which a row tells what is wrong with its entry. It points upwards at the entry,
// takes no focus, and stays where it was shown until its row hides it. Its text is plain: markup in it is
// shown as it stands.
class ErrorTip : public Mtk::Widget::MArrowRectangle
{
    Q_OBJECT

public:
    explicit ErrorTip(QWidget *parent = nullptr);

    // Fits the popup to `text`; neither shows nor hides it.
    void setText(const QString &text);
    // Empties and hides it.
    void clear();
    bool isEmpty() const;

public Q_SLOTS:
    // Shows it at the place it had last, unless it is empty or there already.
    void appearIfNotEmpty();

private:
    QLabel *m_label;
};

} // namespace mcc::widgets
