// SPDX-License-Identifier: Apache-2.0
#include "mlineedit.h"

#include "parts/editmenu.h"
#include "parts/glyphbutton.h"
#include "style/theme.h"
#include "system/inputgate.h"

#include <QEvent>
#include <QHBoxLayout>
#include <QLabel>
#include <QLineEdit>
#include <QPainter>
#include <QScopedValueRollback>
#include <QStyle>
#include <QStyleOptionFrame>

namespace Mtk::Widget {

namespace {

// The text of the label whose buddy `widget` is, without the mark of its shortcut.
QString buddyText(const QWidget *widget)
{
    const QList<QLabel *> labels = widget->window()->findChildren<QLabel *>();
    for (const QLabel *label : labels) {
        if (label->buddy() == widget)
            return label->text().remove(QLatin1Char('&'));
    }
    return {};
}

} // namespace

MLineEdit::MLineEdit(QWidget *parent)
    : QWidget(parent)
    , m_layout(new QHBoxLayout(this))
    , m_edit(new QLineEdit(this))
{
    const Theme &t = theme();
    // QLineEdit itself keeps two pixels beside the text.
    m_layout->setContentsMargins(t.editPadding - 2, 0, t.glyphPadding, 0);
    m_layout->setSpacing(0);
    m_layout->addWidget(m_edit);
    m_edit->setFrame(false);
    m_edit->setFixedHeight(t.controlHeight - 2 * t.focusRing);
    m_edit->installEventFilter(this);
    setSizePolicy(QSizePolicy::Expanding, QSizePolicy::Fixed);
    setMinimumHeight(t.controlHeight);
    setAttribute(Qt::WA_Hover);
    // Not by Tab, which would stop here and again at the inner edit. Without any policy a label would not
    // focus it.
    setFocusPolicy(Qt::ClickFocus);
    // After the policy, which would be passed on to the inner edit otherwise.
    setFocusProxy(m_edit);
    connect(m_edit, &QLineEdit::textChanged, this, [this](const QString &text) {
        if (text == m_text)
            return;
        // Assistive technology writes into the inner edit whether the user could reach that or not.
        if (!m_isSet && window()->isVisible() && !InputGate::isOpen(*m_edit)) {
            m_edit->setText(m_text);
            return;
        }
        m_text = text;
        Q_EMIT textChanged(text);
    });
}

MLineEdit::~MLineEdit() = default;

QString MLineEdit::text()
{
    return m_edit->text();
}

void MLineEdit::setText(const QString &text)
{
    const QScopedValueRollback<bool> set(m_isSet, true);
    m_edit->setText(text);
}

void MLineEdit::setAlert(bool alert)
{
    m_alert = alert;
    update();
}

void MLineEdit::setClearButtonEnabled(bool enabled)
{
    if (!enabled) {
        delete m_clearButton;
        m_clearButton = nullptr;
        return;
    }
    if (m_clearButton)
        return;
    m_clearButton = new GlyphButton(Glyph::Clear, QStringLiteral("清除"), this);
    m_layout->insertWidget(m_layout->indexOf(m_edit) + 1, m_clearButton);
    connect(m_clearButton, &GlyphButton::clicked, m_edit, [this] {
        m_edit->clear();
        m_edit->setFocus(Qt::OtherFocusReason);
    });
    connect(m_edit, &QLineEdit::textChanged, m_clearButton, [this] { updateClearButton(); });
    updateClearButton();
}

void MLineEdit::setContextMenuPolicy(Qt::ContextMenuPolicy policy)
{
    m_edit->setContextMenuPolicy(policy);
}

void MLineEdit::setAccessibleName(const QString &name)
{
    QWidget::setAccessibleName(name);
    passNameOn();
}

void MLineEdit::addTrailing(GlyphButton *button)
{
    m_layout->addWidget(button);
}

bool MLineEdit::eventFilter(QObject *watched, QEvent *event)
{
    if (event->type() == QEvent::FocusIn || event->type() == QEvent::FocusOut)
        update();
    if (event->type() == QEvent::ReadOnlyChange)
        updateClearButton();
    return opensEditMenu(*m_edit, *event) || QWidget::eventFilter(watched, event);
}

bool MLineEdit::event(QEvent *event)
{
    // The name may also have been set through QWidget's interface, or a label have taken this edit as its
    // buddy.
    if (event->type() == QEvent::Show)
        passNameOn();
    if (event->type() == QEvent::EnabledChange || event->type() == QEvent::HoverEnter ||
        event->type() == QEvent::HoverLeave)
        update();
    return QWidget::event(event);
}

void MLineEdit::paintEvent(QPaintEvent * /*event*/)
{
    QStyleOptionFrame option;
    option.initFrom(this);
    option.lineWidth = 1;
    option.state.setFlag(QStyle::State_HasFocus, m_edit->hasFocus());
    QPainter painter(this);
    style()->drawPrimitive(QStyle::PE_PanelLineEdit, &option, &painter, this);
}

void MLineEdit::passNameOn()
{
    const QString name = accessibleName().isEmpty() ? buddyText(this) : accessibleName();
    if (!name.isEmpty() && name != m_edit->accessibleName())
        m_edit->setAccessibleName(name);
}

void MLineEdit::updateClearButton()
{
    if (m_clearButton)
        m_clearButton->setVisible(!m_edit->text().isEmpty() && !m_edit->isReadOnly());
}

} // namespace Mtk::Widget
