// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "mobject.h"
#include "mtkglobal.h"

#include <QWidget>

class QHBoxLayout;
class QLineEdit;

namespace Mtk::Widget {

class GlyphButton;

// A themed single-line edit around a QLineEdit, which callers reach with lineEdit() for validator,
// placeholder and the like. Focus set on it, or through a label's buddy, goes to the inner edit. Its
// accessible name reaches the inner edit, which is what screen readers present; without one the text of a
// label whose buddy it is serves. While the user cannot reach the edit (a modal window is in front, the
// application is busy, its page is hidden) only setText() changes the text.
class MTK_EXPORT MLineEdit : public QWidget, public Core::MObject
{
    Q_OBJECT
    Q_PROPERTY(bool alert READ isAlert WRITE setAlert)

public:
    explicit MLineEdit(QWidget *parent = nullptr);
    ~MLineEdit() override;

    QString text();
    void setText(const QString &text);
    QLineEdit *lineEdit() const { return m_edit; }

    // Shows in red that the entry is wrong, until the caller resets it.
    void setAlert(bool alert);
    bool isAlert() const { return m_alert; }
    // Adds or removes a button that empties the edit. It shows while there is text that may be edited.
    void setClearButtonEnabled(bool enabled);
    // Sets the policy of the inner edit, which is what opens the menu, by mouse, menu key and Shift+F10.
    // Under the default policy it is Qt's own in Chinese.
    void setContextMenuPolicy(Qt::ContextMenuPolicy policy);
    void setAccessibleName(const QString &name);

    bool eventFilter(QObject *watched, QEvent *event) override;

Q_SIGNALS:
    // Sent on any change, typed or set.
    void textChanged(const QString &text);

protected:
    // Adds a button after the text and takes ownership.
    void addTrailing(GlyphButton *button);

    bool event(QEvent *event) override;
    void paintEvent(QPaintEvent *event) override;

private:
    void passNameOn();
    void updateClearButton();

    QHBoxLayout *m_layout;
    QLineEdit *m_edit;
    GlyphButton *m_clearButton = nullptr; // null until asked for
    QString m_text;                       // last one that was accepted
    bool m_alert = false;
    bool m_isSet = false; // while setText() runs
};

} // namespace Mtk::Widget
