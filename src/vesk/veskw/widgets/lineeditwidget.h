// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "widgets/settingsitem.h"

class QHBoxLayout;
class QLabel;

namespace Mtk::Widget {
class MLineEdit;
} // namespace Mtk::Widget

namespace mcc::widgets {

class ErrorTip;

// A form row: a title on the left, a text edit on the right, and a popup that tells of a wrong entry. A click
// anywhere on the row leads into the edit. The row checks nothing; its owner says what is wrong, and the next
// change of the text, typed or set, takes popup and alert away.
class LineEditWidget : public SettingsItem
{
    Q_OBJECT

public:
    explicit LineEditWidget(QFrame *parent = nullptr);
    // `isPasswordMode` true masks the text. No default for `parent`: a lone pointer would be taken for the
    // bool.
    LineEditWidget(bool isPasswordMode, QWidget *parent);

    QLabel *titleLabel() const { return m_title; }
    Mtk::Widget::MLineEdit *edit() const { return m_edit; }

    // Puts `widget` behind the edit; the row becomes its parent.
    void addRightWidget(QWidget *widget);
    // The red state of the edit alone: isErr() stays as it is.
    void setIsErr(bool err) override;
    void setReadOnly(bool readOnly);

    // Points the popup at the lower left corner of the edit. It stays there when the row moves, and doesn't
    // make the edit red: that is setIsErr(). An empty `text` changes nothing.
    void showAlertMessage(const QString &text);
    // Takes away the popup, and the edit's red state too.
    void hideAlertMessage();

public Q_SLOTS:
    // Also names row and edit for a screen reader.
    void setTitle(const QString &title);
    void setText(const QString &text);
    void setPlaceholderText(const QString &text);

protected:
    void mousePressEvent(QMouseEvent *event) override;

private:
    QHBoxLayout *m_mainLayout;
    QLabel *m_title;
    Mtk::Widget::MLineEdit *m_edit;
    ErrorTip *m_errTip; // a window of its own, in no layout
};

} // namespace mcc::widgets
