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

    // The red state that tells of a wrong entry. Only the caller ends it.
    void setAlert(bool alert);
    bool isAlert() const { return m_alert; }
    // A button that empties the edit, there while it holds text.
    void setClearButtonEnabled(bool enabled);
    // Of the inner edit, which is the one that would open a menu.
    void setContextMenuPolicy(Qt::ContextMenuPolicy policy);
    void setAccessibleName(const QString &name);

    bool eventFilter(QObject *watched, QEvent *event) override;

Q_SIGNALS:
    // On any change, typed or set.
    void textChanged(const QString &text);

protected:
    // Puts a button behind the text; the edit takes it.
    void addTrailing(GlyphButton *button);

    bool event(QEvent *event) override;
    void paintEvent(QPaintEvent *event) override;

private:
    void passNameOn();
    void updateClearButton();

    QHBoxLayout *m_layout;
    QLineEdit *m_edit;
    GlyphButton *m_clearButton = nullptr; // null until asked for
    QString m_text;                       // the latest one that was let in
    bool m_alert = false;
    bool m_isSet = false; // by setText(), just now
};

} // namespace Mtk::Widget
