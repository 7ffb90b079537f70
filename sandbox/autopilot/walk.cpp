// SPDX-License-Identifier: Apache-2.0
#include "walk.h"

#include "screenshot.h"
#include "waitfor.h"

#include <algorithm>

namespace sandbox {

namespace {

const QString kDismiss = QStringLiteral("确定");

// Looks in a row that must find the program at rest: between the end of a dialog and what comes after it the
// program may answer one more question.
constexpr int kMinPolls = 2;

// A message on one line, and visible when it is empty.
QString quoted(const QString &message)
{
    QString line = message;
    line.replace(QLatin1Char('\n'), QLatin1String("\\n"));
    return QLatin1Char('"') + line + QLatin1Char('"');
}

QString inWords(const ScenarioExpectation &expect)
{
    QStringList messages;
    std::transform(expect.messages.begin(), expect.messages.end(), std::back_inserter(messages), quoted);
    const QString after = messages.isEmpty() ? QString() : QStringLiteral(" after ");
    return QStringLiteral("page ") + expect.page + after + messages.join(QStringLiteral(", "));
}

} // namespace

Walk::Walk(WalkPlan plan, const AccessibleTree &tree, const Logbook &logbook, const QDeadlineTimer &deadline)
    : m_plan(std::move(plan))
    , m_tree(tree)
    , m_logbook(logbook)
    , m_deadline(deadline)
    , m_expectation(inWords(m_plan.expect))
{
}

void Walk::run()
{
    bool goesOn = true;
    while (goesOn) {
        const std::optional<Window> window = next();
        if (window && window->page == nullptr)
            dismiss(*window);
        else
            goesOn = window && visit(*window);
    }
    m_logbook.note(QStringLiteral("end"), QStringLiteral("as expected: %1").arg(m_expectation));
}

// The next thing that wants an answer, or nothing when the program has come to rest where it should, or has
// ended after the last press.
std::optional<Window> Walk::next()
{
    std::optional<Window> news;
    int polls = 0;
    waitFor(m_deadline, QStringLiteral("out of time: %1, expected %2").arg(whereabouts(), m_expectation),
            [&] {
                std::optional<Window> window;
                try {
                    window = Window::inFront(m_tree.windows());
                } catch (const Error &) {
                    if (m_hasPressedLast && !m_tree.isAlive())
                        return true;
                    throw;
                }
                const bool wantsPress = window && wantsAnotherPress(*window);
                const bool isOver = window && window->isAtRest() && (wantsPress || isGoal(window->page));
                polls = isOver ? polls + 1 : 0;
                if (window && (isNews(*window) || (polls == kMinPolls && wantsPress)))
                    news = window;
                return news || polls == kMinPolls;
            });
    return news;
}

bool Walk::isNews(const Window &window) const
{
    if (window.page != nullptr)
        return window.page != m_page && !isBehind(*window.page);
    const Element *button = window.element.button(kDismiss);
    return !(window.element.object == m_answered) && (button == nullptr || button->enabled);
}

// After a message box, on the page that it leaves the user on.
bool Walk::wantsAnotherPress(const Window &window) const
{
    if (!m_mayPressAgain || window.page == nullptr)
        return false;
    if (window.page != m_page)
        return isBehind(*window.page);
    const Element *button = window.element.button(m_page->button);
    return !isGoal(m_page) && button != nullptr && button->enabled;
}

// The page that a dialog was opened from shows again while the program is at work on the dialog's answer.
bool Walk::isBehind(const Page &page) const
{
    return m_page != nullptr && page.journey == m_page->journey && page.number < m_page->number;
}

bool Walk::isGoal(const Page *page) const
{
    return page != nullptr && page->name == m_plan.expect.page && m_messages == m_plan.expect.messages.size();
}

// False when the walk ends here.
bool Walk::visit(const Window &window)
{
    const Page &page = *window.page;
    if (m_page != &page)
        note(QStringLiteral("page"), QStringLiteral("%1  title %2").arg(page.name, page.title), window);
    m_page = &page;
    m_mayPressAgain = false;

    if (!m_plan.stayAfter.isEmpty() && m_logbook.has(m_plan.stayAfter)) {
        waitFor(m_deadline, whereabouts(), [this] { return !m_tree.isAlive(); });
        return false;
    }
    const bool isForeign = page.journey != m_plan.journey;
    if ((page.isLast() || isForeign) && !isGoal(&page))
        throw Error(QStringLiteral("%1, expected %2").arg(whereabouts(), m_expectation));
    const bool hasEnded = (m_messages > 0 || m_cancelled) && isGoal(&page) && !page.isLast();
    if (page.button.isEmpty() || isForeign || hasEnded) {
        takeScreenshot(page.name, window);
    } else {
        fill(page);
        press(page);
    }
    return true;
}

// With what a screen reader says of it.
void Walk::note(const QString &what, const QString &text, const Window &window) const
{
    m_logbook.note(what, text);
    for (const QString &line : window.element.spoken())
        m_logbook.note(QStringLiteral("hear"), line);
}

void Walk::fill(const Page &page) const
{
    for (const Field &field : page.fields) {
        const auto hasField = [&field](const Window &each) {
            return each.element.edit(field.caption) != nullptr;
        };
        waitFor(m_deadline, QStringLiteral("the field %1 does not answer").arg(field.caption), [&] {
            const QString purpose = QStringLiteral("has the field %1").arg(field.caption);
            type(*awaitPage(page, purpose, hasField).element.edit(field.caption), field);
            return true;
        });
    }
}

// An empty value leaves what the program has put there.
void Walk::type(const Element &edit, const Field &field) const
{
    const QString value = m_plan.input.*field.value;
    if (!value.isEmpty())
        m_tree.type(edit, value);
    const QString text = m_tree.text(edit);
    const QString wanted = edit.isSecret() ? QString(value.size(), QLatin1Char('*')) : value;
    if (!value.isEmpty() && text != wanted)
        throw Error(QStringLiteral("the field %1 reads %2 after %3 was typed")
                        .arg(field.caption, quoted(text), quoted(wanted)));
    m_logbook.note(
        value.isEmpty() ? QStringLiteral("keep") : QStringLiteral("type"),
        QStringLiteral("%1 = %2").arg(field.caption, edit.isSecret() ? QStringLiteral("***") : text));
}

void Walk::press(const Page &page)
{
    const bool cancels = !m_plan.input.authorise && !page.cancelButton.isEmpty();
    const QString answer = cancels ? page.cancelButton : page.button;
    const auto isEnabled = [&answer](const Window &each) {
        const Element *button = each.element.button(answer);
        return button != nullptr && button->enabled;
    };
    const Window window = awaitPage(page, QStringLiteral("lets %1 be pressed").arg(answer), isEnabled);
    takeScreenshot(page.name, window);
    pressButton(*window.element.button(answer));
    m_cancelled = m_cancelled || cancels;
    m_hasPressedLast = page.isLast();
}

void Walk::pressButton(const Element &button) const
{
    m_logbook.note(QStringLiteral("press"), button.name);
    waitFor(m_deadline, QStringLiteral("the button %1 has disappeared").arg(button.name), [&] {
        m_tree.press(button, m_deadline);
        return true;
    });
}

void Walk::dismiss(const Window &messageBox)
{
    const QString message = messageBox.element.labels().join(QLatin1Char('\n'));
    note(QStringLiteral("message"), quoted(message), messageBox);
    ++m_messages;
    const QString name =
        m_page == nullptr ? QStringLiteral("start-box") : m_page->name + QLatin1String("-box");
    takeScreenshot(m_messages == 1 ? name : QStringLiteral("%1-%2").arg(name).arg(m_messages), messageBox);

    const QStringList &expected = m_plan.expect.messages;
    if (messageBox.element.name.simplified() != message.simplified())
        throw Error(QStringLiteral("the message box %1 is named %2")
                        .arg(quoted(message), quoted(messageBox.element.name)));
    if (m_messages > expected.size())
        throw Error(
            QStringLiteral("the message box %1 came, expected %2").arg(quoted(message), m_expectation));
    if (message != expected.at(m_messages - 1))
        throw Error(QStringLiteral("the message box says %1, expected %2")
                        .arg(quoted(message), quoted(expected.at(m_messages - 1))));
    const Element *button = messageBox.element.button(kDismiss);
    if (button == nullptr)
        throw Error(QStringLiteral("the message box %1 has no button %2").arg(quoted(message), kDismiss));
    pressButton(*button);
    m_answered = messageBox.element.object;
    m_mayPressAgain = true;
}

// Waits until the page is in front and ready. Another page or a message box does not count.
Window Walk::awaitPage(const Page &page, const QString &purpose,
                       const std::function<bool(const Window &)> &isReady) const
{
    return *waitFor(m_deadline, QStringLiteral("the page %1 never %2").arg(page.name, purpose), [&] {
        std::optional<Window> window = Window::inFront(m_tree.windows());
        if (window && !(window->page == &page && isReady(*window)))
            window.reset();
        return window;
    });
}

// A message box over what is behind it.
void Walk::takeScreenshot(const QString &name, const Window &window) const
{
    if (m_plan.screenshots.isEmpty())
        return;
    const QString file = QStringLiteral("%1-%2").arg(m_page == nullptr ? 0 : m_page->number).arg(name);
    const auto look = [&]() -> std::optional<Shot> {
        const std::vector<Element> windows = m_tree.windows();
        const std::optional<Window> now = Window::inFront(windows);
        if (!now || !(now->element.object == window.element.object && now->page == window.page))
            return Shot();
        Shot shot{m_tree.extents(now->element), {}};
        for (const Element &each : windows)
            shot.whole |= m_tree.extents(each);
        return shot;
    };
    saveScreenshot(m_plan.screenshots, file, [&] { return *waitFor(m_deadline, whereabouts(), look); });
}

QString Walk::whereabouts() const
{
    if (m_page == nullptr)
        return QStringLiteral("no known page came");
    return QStringLiteral("the program stands on page %1 (%2) after %3 message boxes")
        .arg(m_page->name, m_page->title)
        .arg(m_messages);
}

} // namespace sandbox
