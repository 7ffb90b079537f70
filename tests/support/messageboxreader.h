// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QApplication>
#include <QPushButton>
#include <QStringList>
#include <QTimer>

#include <functional>

// Reads every modal message box that opens during its lifetime and presses its first button, as a user would.
// The name of one for a screen reader is its message.
class MessageBoxReader : public QObject
{
public:
    MessageBoxReader()
    {
        m_timer.callOnTimeout(this, [this] { dismiss(); });
        m_timer.start(10);
    }

    QStringList texts() const { return m_texts; }

    // Called while one is open, before it is dismissed.
    std::function<void()> whileOpen;

private:
    void dismiss()
    {
        QWidget *dialog = QApplication::activeModalWidget();
        if (dialog == nullptr || !dialog->isVisible())
            return;
        auto *button = dialog->findChild<QPushButton *>();
        if (button == nullptr)
            return;
        m_texts.append(dialog->accessibleName());
        if (whileOpen)
            whileOpen();
        button->click();
    }

    QTimer m_timer;
    QStringList m_texts;
};
