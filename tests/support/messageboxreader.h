// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QApplication>
#include <QDialog>
#include <QEvent>
#include <QPointer>
#include <QPushButton>
#include <QStringList>
#include <QTimer>

#include <functional>

// Reads every modal dialog that opens during its lifetime and presses its last button, as a user would who
// goes on. The name of one for a screen reader is its message.
class MessageBoxReader : public QObject
{
public:
    MessageBoxReader() { qApp->installEventFilter(this); }

    QStringList texts() const { return m_texts; }

    // Called while one is open, before its button is pressed.
    std::function<void(QDialog &dialog)> whileOpen;

protected:
    bool eventFilter(QObject *watched, QEvent *event) override
    {
        auto *dialog = event->type() == QEvent::Show ? qobject_cast<QDialog *>(watched) : nullptr;
        if (dialog != nullptr && dialog->isModal())
            QTimer::singleShot(0, this, [this, shown = QPointer<QDialog>(dialog)] { answer(shown); });
        return false;
    }

private:
    void answer(QDialog *dialog)
    {
        if (dialog == nullptr)
            return;
        m_texts.append(dialog->accessibleName());
        if (whileOpen)
            whileOpen(*dialog);
        QPushButton *last = nullptr;
        for (QPushButton *button : dialog->findChildren<QPushButton *>())
            last = button->isVisibleTo(dialog) && !button->text().isEmpty() ? button : last;
        if (last == nullptr)
            qFatal("a dialog without a button: %s", qPrintable(m_texts.last()));
        last->click();
    }

    QStringList m_texts;
};
