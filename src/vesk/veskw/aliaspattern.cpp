// SPDX-License-Identifier: Apache-2.0
#include "aliaspattern.h"

#include <QStringView>
#include <QVector>

namespace aliaspattern {

namespace {

// Measured: a thousand optional characters in a row take a second to compile, and twice as many five.
constexpr int kMostAtoms = 1000; // repetitions written out
constexpr int kDeepestGroup = 100;
constexpr int kDeepestLookAhead = 2;
constexpr int kLongestPattern = 4096;     // characters
constexpr int kHighestBackReference = 14; // what the expression class takes

// Adds up what a pattern costs, from left to right. Knows of the syntax no more than that takes, and counts
// too much rather than too little.
class Scan
{
public:
    explicit Scan(QStringView pattern)
        : m_pattern(pattern)
    {
    }

    bool isBearable()
    {
        while (m_at < m_pattern.size()) {
            take(m_pattern.at(m_at++));
            if (m_isMalformed || m_groups.size() > kDeepestGroup || m_lookAheads > kDeepestLookAhead ||
                atoms() > kMostAtoms)
                return false;
        }
        return true;
    }

private:
    struct Group
    {
        int atoms = 0; // without the latest one
        bool isLookAhead = false;
    };

    int atoms() const { return m_group.atoms + m_latest; }

    void take(QChar character)
    {
        switch (character.unicode()) {
        case '(':
            open();
            break;
        case ')':
            close();
            break;
        case '{':
            repeat();
            break;
        case '[':
            skipClass();
            add(1);
            break;
        case '\\':
            escape();
            break;
        case '?':
        case '*':
        case '+':
            break;
        default:
            add(1);
        }
    }

    void add(int cost)
    {
        m_group.atoms += m_latest;
        m_latest = cost;
    }

    void open()
    {
        add(0);
        m_groups.append(m_group);
        const QStringView rest = m_pattern.mid(m_at);
        m_group = Group();
        m_group.isLookAhead = rest.startsWith(QLatin1String("?=")) || rest.startsWith(QLatin1String("?!"));
        m_lookAheads += m_group.isLookAhead ? 1 : 0;
    }

    void close()
    {
        if (m_groups.isEmpty())
            return;
        const int inside = atoms();
        m_lookAheads -= m_group.isLookAhead ? 1 : 0;
        m_group = m_groups.takeLast();
        m_latest = inside;
    }

    // The number of a back reference goes on to its last digit. The expression class makes room for as many
    // captures before it finds the number too large, and crashes at one that overflows.
    void escape()
    {
        const bool isBackReference =
            m_at < m_pattern.size() && isDigit(m_pattern.at(m_at)) && m_pattern.at(m_at) != QLatin1Char('0');
        if (isBackReference)
            m_isMalformed = number() > kHighestBackReference;
        else
            ++m_at;
        add(1);
    }

    // "{3}", "{1,3}", "{3,}": the larger number is how often the latest atom is written out. What begins like
    // a repetition and is none makes the whole pattern invalid; the expression class would go on behind it,
    // with another view of what is a group than this one, and write out the rest all the same.
    void repeat()
    {
        int most = qMax(1, number());
        if (skip(QLatin1Char(',')))
            most = qMax(most, number());
        m_isMalformed = !skip(QLatin1Char('}'));
        m_latest = qMin(m_latest, kMostAtoms + 1) * most;
    }

    // Digits at the present place, passed by; 0: there are none.
    int number()
    {
        int number = 0;
        for (; m_at < m_pattern.size() && isDigit(m_pattern.at(m_at)); ++m_at)
            number = qMin(number * 10 + m_pattern.at(m_at).digitValue(), kMostAtoms + 1);
        return number;
    }

    static bool isDigit(QChar character)
    {
        return character >= QLatin1Char('0') && character <= QLatin1Char('9');
    }

    bool skip(QChar character)
    {
        if (m_at == m_pattern.size() || m_pattern.at(m_at) != character)
            return false;
        ++m_at;
        return true;
    }

    // A bracket right at the beginning stands for itself.
    void skipClass()
    {
        if (m_at < m_pattern.size() && m_pattern.at(m_at) == QLatin1Char('^'))
            ++m_at;
        const auto first = m_at;
        for (; m_at < m_pattern.size(); ++m_at) {
            if (m_pattern.at(m_at) == QLatin1Char('\\'))
                ++m_at;
            else if (m_pattern.at(m_at) == QLatin1Char(']') && m_at != first)
                break;
        }
        ++m_at;
    }

    QStringView m_pattern;
    qsizetype m_at = 0;
    Group m_group;
    QVector<Group> m_groups; // around the present one
    int m_latest = 0;        // atoms of what a repetition would repeat
    int m_lookAheads = 0;    // around the present place
    bool m_isMalformed = false;
};

} // namespace

bool isBearable(const QString &pattern)
{
    return pattern.size() <= kLongestPattern && Scan(pattern).isBearable();
}

} // namespace aliaspattern
