// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QFrame>

namespace Mtk::Widget {
class MFrame;
} // namespace Mtk::Widget

namespace mcc::widgets {

// Common base of the form rows: an error state that style sheets can select on, and a background panel for
// those that want one. It lays out nothing; that is each row's own affair.
class SettingsItem : public QFrame
{
    Q_OBJECT
    Q_PROPERTY(bool isErr READ isErr DESIGNABLE true SCRIPTABLE true)

public:
    explicit SettingsItem(QWidget *parent = nullptr);

    bool isErr() const { return m_isErr; }
    // Stores the state and has style sheets looked at again when it changed.
    virtual void setIsErr(bool err);

    // Lays a rounded panel of the row's size under its content. A second call replaces the panel.
    void addBackground();

protected:
    void resizeEvent(QResizeEvent *event) override;

private:
    bool m_isErr = false;
    Mtk::Widget::MFrame *m_bgGroup = nullptr; // null until asked for
};

} // namespace mcc::widgets
