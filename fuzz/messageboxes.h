// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QDialog>
#include <QObject>
#include <QStringList>

#include <functional>

namespace fuzz {

// Answers every modal dialog that opens during its lifetime as soon as it stands: presses its last button,
// and keeps its name for a screen reader, which holds title and message.
class MessageBoxes : public QObject
{
public:
    MessageBoxes();

    QStringList texts() const { return m_texts; }

    // Called for a dialog before its button is pressed.
    std::function<void(QDialog &)> whileOpen;

protected:
    bool eventFilter(QObject *watched, QEvent *event) override;

private:
    void answer(QDialog &dialog);

    QStringList m_texts;
};

} // namespace fuzz
