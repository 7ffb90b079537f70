// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QApplication>
#include <QPushButton>
#include <QStringList>
#include <QTimer>

#include <functional>

// Reads every modal message box that opens during its lifetime and presses its first button, as a user would.
// The name of a box for a screen reader is its message.
class BoxReader : public QObject
{
public:
    BoxReader()
    {
        m_timer.callOnTimeout(this, [this] { dismiss(); });
        m_timer.start(10);
    }

    QStringList texts() const { return m_texts; }

    // Called while a box stands, before it is dismissed.
    std::function<void()> whileOpen;

private:
    void dismiss()
    {
        QWidget *box = QApplication::activeModalWidget();
        if (box == nullptr || !box->isVisible())
            return;
        auto *button = box->findChild<QPushButton *>();
        if (button == nullptr)
            return;
        m_texts.append(box->accessibleName());
        if (whileOpen)
            whileOpen();
        button->click();
    }

    QTimer m_timer;
    QStringList m_texts;
};
