// SPDX-License-Identifier: Apache-2.0
#include "messagelabel.h"

#include <QApplication>
#include <QClipboard>
#include <QDebug>
#include <QPaintEvent>
#include <QPainter>

#include <cmath>

namespace Mtk::Widget {

namespace {

// Line ends as QTextLayout knows them.
QString layoutText(QString text)
{
    text.replace(QLatin1String("\r\n"), QLatin1String("\n"));
    return text.replace(QLatin1Char('\n'), QChar::LineSeparator);
}

constexpr QChar kJoiner(0x034f);

// Shaping a run of combining marks takes time that grows with the square of its length. The joiner that the
// Unicode Standard's stream-safe text format puts after thirty of them shows as nothing and ends the run.
QString streamSafe(const QString &text)
{
    constexpr int kMaxMarks = 30;
    QString safe;
    int marks = 0;
    for (const uint character : text.toUcs4()) {
        marks = QChar::isMark(character) ? marks + 1 : 0;
        if (marks > kMaxMarks) {
            safe += kJoiner;
            marks = 1;
        }
        safe += QString::fromUcs4(&character, 1);
    }
    return safe;
}

QString bounded(const QString &text)
{
    if (text.size() <= MessageLabel::kMaxLength)
        return text;
    qWarning() << "A message of" << text.size() << "characters is shown up to" << MessageLabel::kMaxLength;
    QString start = text.left(MessageLabel::kMaxLength);
    if (start.at(start.size() - 1).isHighSurrogate())
        start.chop(1);
    return start + QChar(0x2026);
}

} // namespace

MessageLabel::MessageLabel(QWidget *parent)
    : QLabel(parent)
{
    setTextFormat(Qt::PlainText);
    setAlignment(Qt::AlignHCenter);
    setCursor(Qt::IBeamCursor);
    QSizePolicy policy(QSizePolicy::Expanding, QSizePolicy::Minimum);
    policy.setHeightForWidth(true);
    setSizePolicy(policy);
}

void MessageLabel::setText(const QString &text)
{
    QLabel::setText(bounded(text));
    m_anchor = m_end = 0;
    forget();
}

QSize MessageLabel::sizeHint() const
{
    const int width = naturalWidth();
    return {width, heightForWidth(width)};
}

QSize MessageLabel::minimumSizeHint() const
{
    return {fontMetrics().maxWidth(), fontMetrics().lineSpacing()};
}

int MessageLabel::heightForWidth(int width) const
{
    return text().isEmpty() ? 0 : int(std::ceil(extentFor(width).height()));
}

int MessageLabel::naturalWidth() const
{
    return int(std::ceil(extentFor(QWIDGETSIZE_MAX).width()));
}

void MessageLabel::selectAll()
{
    select(0, m_layout.text().size());
}

// As it was set, without what the layout needed.
QString MessageLabel::selectedText() const
{
    QString selected = m_layout.text().mid(qMin(m_anchor, m_end), qAbs(m_end - m_anchor));
    return selected.replace(QChar::LineSeparator, QLatin1Char('\n')).remove(kJoiner);
}

void MessageLabel::select(int anchor, int end)
{
    m_anchor = anchor;
    m_end = end;
    update();
}

int MessageLabel::positionAt(const QPoint &place) const
{
    layOut(width());
    for (int i = 0; i < m_layout.lineCount(); ++i) {
        const QTextLine line = m_layout.lineAt(i);
        if (place.y() < line.naturalTextRect().bottom())
            return line.xToCursor(place.x());
    }
    return m_layout.text().size();
}

void MessageLabel::mousePressEvent(QMouseEvent *event)
{
    event->setAccepted(event->button() == Qt::LeftButton);
    if (event->isAccepted())
        select(positionAt(event->pos()), positionAt(event->pos()));
}

void MessageLabel::mouseMoveEvent(QMouseEvent *event)
{
    if (event->buttons() & Qt::LeftButton)
        select(m_anchor, positionAt(event->pos()));
}

void MessageLabel::mouseReleaseEvent(QMouseEvent * /*event*/)
{
    QClipboard *clipboard = QApplication::clipboard();
    if (clipboard->supportsSelection() && m_anchor != m_end)
        clipboard->setText(selectedText(), QClipboard::Selection);
}

void MessageLabel::changeEvent(QEvent *event)
{
    QLabel::changeEvent(event);
    if (event->type() == QEvent::FontChange)
        forget();
}

void MessageLabel::paintEvent(QPaintEvent *event)
{
    layOut(width());
    QPainter painter(this);
    painter.setPen(palette().color(foregroundRole()));
    QTextLayout::FormatRange selection{qMin(m_anchor, m_end), qAbs(m_end - m_anchor), {}};
    selection.format.setBackground(palette().highlight());
    selection.format.setForeground(palette().highlightedText());
    m_layout.draw(&painter, QPointF(), {selection}, event->rect());
}

void MessageLabel::forget()
{
    m_extents.clear();
    m_layoutWidth = kNotLaidOut;
}

QSizeF MessageLabel::extentFor(int width) const
{
    const auto known = m_extents.constFind(width);
    if (known != m_extents.constEnd())
        return *known;
    layOut(width);
    return m_extents.value(width);
}

void MessageLabel::layOut(int width) const
{
    // Wrapped lines read better from a straight left edge.
    const bool wraps = width < QWIDGETSIZE_MAX && naturalWidth() > width;
    const Qt::Alignment side = wraps ? Qt::AlignLeft : alignment();
    if (m_layoutWidth == width && m_layout.textOption().alignment() == side)
        return;
    QTextOption option(side);
    option.setWrapMode(QTextOption::WrapAtWordBoundaryOrAnywhere);
    m_layout.setFont(font());
    m_layout.setText(streamSafe(layoutText(text())));
    m_layout.setTextOption(option);
    qreal height = 0;
    m_layout.beginLayout();
    for (QTextLine line = m_layout.createLine(); line.isValid(); line = m_layout.createLine()) {
        line.setLineWidth(width);
        line.setPosition({0, height});
        height += line.height();
    }
    m_layout.endLayout();
    m_layoutWidth = width;
    m_extents.insert(width, QSizeF(m_layout.maximumWidth(), height));
}

} // namespace Mtk::Widget
