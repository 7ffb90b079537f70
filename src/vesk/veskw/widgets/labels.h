// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QLabel>

namespace mcc::widgets {

// Four labels that differ by type alone, so that a style sheet can give each kind of text its look. They set
// none themselves. TipsLabel is a SmallLabel to style sheets as well.

class LargeLabel : public QLabel
{
    Q_OBJECT

public:
    using QLabel::QLabel;
};

class NormalLabel : public QLabel
{
    Q_OBJECT

public:
    using QLabel::QLabel;
};

class SmallLabel : public QLabel
{
    Q_OBJECT

public:
    using QLabel::QLabel;
};

class TipsLabel : public SmallLabel
{
    Q_OBJECT

public:
    using SmallLabel::SmallLabel;
};

} // namespace mcc::widgets
