// SPDX-License-Identifier: Apache-2.0
#include "dialogtext.h"

#include "messagelabel.h"
#include "style/theme.h"

#include <QEvent>
#include <QFont>
#include <QVBoxLayout>

namespace Mtk::Widget {

namespace {

QFont heading(QFont font)
{
    font.setWeight(QFont::DemiBold);
    return font;
}

} // namespace

DialogText::DialogText(QWidget *parent)
    : QScrollArea(parent)
    , m_limit(QWIDGETSIZE_MAX)
{
    auto *body = new QWidget;
    auto *column = new QVBoxLayout(body);
    column->setContentsMargins(0, 0, 0, 0);
    column->setSpacing(theme().dialogSpacing / 2);
    m_title = new MessageLabel(body);
    m_title->setFont(heading(QFont()));
    m_message = new MessageLabel(body);
    column->addWidget(m_title);
    column->addWidget(m_message);
    column->addStretch();
    setWidget(body);
    setWidgetResizable(true);
    setFrameShape(QFrame::NoFrame);
    setHorizontalScrollBarPolicy(Qt::ScrollBarAlwaysOff);
    setFocusPolicy(Qt::NoFocus);
    // The dialog's own background shows through.
    body->setAutoFillBackground(false);
    viewport()->setAutoFillBackground(false);
    QSizePolicy policy(QSizePolicy::Expanding, QSizePolicy::Fixed);
    policy.setHeightForWidth(true);
    setSizePolicy(policy);
    changed();
}

void DialogText::setTitle(const QString &title)
{
    m_title->setText(title);
    changed();
}

void DialogText::setMessage(const QString &message)
{
    m_message->setText(message);
    changed();
}

void DialogText::setTextAlignment(Qt::Alignment alignment)
{
    m_title->setAlignment(alignment);
    m_message->setAlignment(alignment);
}

QString DialogText::title() const
{
    return m_title->text();
}

QString DialogText::message() const
{
    return m_message->text();
}

void DialogText::selectAll()
{
    m_title->selectAll();
    m_message->selectAll();
}

QString DialogText::selectedText() const
{
    QStringList parts{m_title->selectedText(), m_message->selectedText()};
    if (parts.join(QString()).isEmpty())
        parts = QStringList{title(), message()};
    parts.removeAll(QString());
    return parts.join(QLatin1Char('\n'));
}

void DialogText::setHeightLimit(int limit)
{
    if (limit == m_limit)
        return;
    m_limit = limit;
    updateGeometry();
}

QSize DialogText::sizeHint() const
{
    const int natural = qMax(m_title->naturalWidth(), m_message->naturalWidth());
    const int width = qBound(0, natural, theme().dialogTextWidth);
    return {width, heightForWidth(width)};
}

QSize DialogText::minimumSizeHint() const
{
    return {0, 0};
}

int DialogText::heightForWidth(int width) const
{
    return qMin(textHeight(width), m_limit);
}

void DialogText::changeEvent(QEvent *event)
{
    QScrollArea::changeEvent(event);
    if (event->type() == QEvent::FontChange)
        updateGeometry();
}

void DialogText::resizeEvent(QResizeEvent *event)
{
    QScrollArea::resizeEvent(event);
    const bool scrolls = textHeight(width()) > height();
    setFocusPolicy(scrolls ? Qt::StrongFocus : Qt::NoFocus);
}

int DialogText::textHeight(int width) const
{
    const int spacing = !title().isEmpty() && !message().isEmpty() ? widget()->layout()->spacing() : 0;
    return m_title->heightForWidth(width) + spacing + m_message->heightForWidth(width);
}

void DialogText::changed()
{
    m_title->setVisible(!title().isEmpty());
    m_message->setVisible(!message().isEmpty());
    setVisible(!title().isEmpty() || !message().isEmpty());
    updateGeometry();
}

} // namespace Mtk::Widget
