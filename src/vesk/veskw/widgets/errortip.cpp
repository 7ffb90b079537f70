// SPDX-License-Identifier: Apache-2.0
#include "widgets/errortip.h"

#include <QLabel>

namespace mcc::widgets {

ErrorTip::ErrorTip(QWidget *parent)
    : MArrowRectangle(ArrowTop, parent)
    , m_label(new QLabel)
{
    m_label->setObjectName(QStringLiteral("New_Account_errorTip"));
    m_label->setAccessibleName(m_label->objectName());
    m_label->setStyleSheet(QStringLiteral("padding: 5px 10px; color: #f9704f"));
    m_label->setTextFormat(Qt::PlainText);
    m_label->setWordWrap(true);
    setContent(m_label);
}

void ErrorTip::setText(const QString &text)
{
    m_label->setText(text);
    m_label->setAccessibleDescription(text);
    m_label->adjustSize();
    resizeWithContent();
}

void ErrorTip::clear()
{
    m_label->clear();
    hide();
}

bool ErrorTip::isEmpty() const
{
    return m_label->text().isEmpty();
}

void ErrorTip::appearIfNotEmpty()
{
    if (!isEmpty() && !isVisible())
        QWidget::show();
}

} // namespace mcc::widgets
