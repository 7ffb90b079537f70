// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "mlineedit.h"

namespace Mtk::Widget {

// An MLineEdit that masks its text, with a button to show it. While masked nothing can be copied out of it,
// nor read by assistive technology, which is told of bullets only, also while the text shows. It masks again
// when it is hidden, and showing never brings back text that was typed and deleted before.
class MTK_EXPORT MPasswordEdit : public MLineEdit
{
    Q_OBJECT

public:
    explicit MPasswordEdit(QWidget *parent = nullptr);
    ~MPasswordEdit() override;

protected:
    void hideEvent(QHideEvent *event) override;

private:
    void setRevealed(bool revealed);

    GlyphButton *m_revealButton;
};

} // namespace Mtk::Widget
