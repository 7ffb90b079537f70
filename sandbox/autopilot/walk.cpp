// SPDX-License-Identifier: Apache-2.0
#include "walk.h"

#include "patience.h"

#include <algorithm>

namespace sandbox {

namespace {

const QString kDismiss = QStringLiteral("确定");

// Looks in a row that must find the program at rest: between the end of a dialog and what comes after it the
// program may answer one more question.
constexpr int kLooks = 2;

// A message on one line, and visible when it is empty.
QString quoted(const QString &message)
{
    QString line = message;
    line.replace(QLatin1Char('\n'), QLatin1String("\\n"));
    return QLatin1Char('"') + line + QLatin1Char('"');
}

// What a page says beside its title and the captions of its fields.
QString restOf(const Window &window)
{
    QStringList texts = window.element().labels();
    texts.removeAll(window.page()->title);
    for (const Field &field : window.page()->fields) {
        const auto isCaption = [&field](const QString &text) {
            return bareCaption(text) == field.caption;
        };
        texts.erase(std::remove_if(texts.begin(), texts.end(), isCaption), texts.end());
    }
    return texts.join(QLatin1Char(' ')).simplified();
}

} // namespace

Walk::Walk(Journey journey, const ScenarioInput &input, const ScenarioExpectation &expect,
           const AccessibleTree &tree, const Logbook &logbook, const Camera &camera,
           const QDeadlineTimer &deadline)
    : m_journey(journey)
    , m_input(input)
    , m_expect(expect)
    , m_tree(tree)
    , m_logbook(logbook)
    , m_camera(camera)
    , m_deadline(deadline)
{
}

void Walk::run()
{
    while (!m_finished) {
        const std::optional<Window> window = next();
        if (!window)
            break;
        if (window->page() == nullptr)
            dismiss(*window);
        else
            visit(*window);
    }
    m_logbook.note(QStringLiteral("end"), QStringLiteral("as expected: %1").arg(expectation()));
}

// The next thing that wants an answer, or nothing when the program has come to rest where it should.
std::optional<Window> Walk::next()
{
    const auto complaint = [this] {
        return QStringLiteral("out of time: %1, expected %2").arg(whereabouts(), expectation());
    };
    std::optional<Window> news;
    int looks = 0;
    waitFor(m_deadline, complaint, [&] {
        const std::optional<Window> window = look();
        if (hasEnded())
            return true;
        const bool wantsPress = window && wantsAnotherPress(*window);
        const bool isOver = window && window->isAtRest() && (wantsPress || isGoal(window->page()));
        looks = isOver ? looks + 1 : 0;
        if (window && (isNews(*window) || (looks == kLooks && wantsPress)))
            news = window;
        return news || looks == kLooks;
    });
    return news;
}

// The window in front. The program may end while it is looked at, which after the last press is no trouble.
std::optional<Window> Walk::look() const
{
    try {
        return Window::inFront(m_tree.windows());
    } catch (const Trouble &) {
        if (hasEnded())
            return std::nullopt;
        throw;
    }
}

// The last press may end the program, or make it wait for a machine that goes down.
bool Walk::hasEnded() const
{
    return m_hasPressedLast && !m_tree.isAlive();
}

bool Walk::isNews(const Window &window) const
{
    if (window.page() == nullptr) {
        const Element *button = window.element().button(kDismiss);
        return !(window.element().object == m_answered) && (button == nullptr || button->enabled);
    }
    return window.page() != m_page && !isBehind(*window.page());
}

// After a message box, on the page that it leaves the user on.
bool Walk::wantsAnotherPress(const Window &window) const
{
    if (!m_mayPressAgain || window.page() == nullptr)
        return false;
    if (window.page() != m_page)
        return isBehind(*window.page());
    const Element *button = window.element().button(m_page->button);
    return !isGoal(m_page) && button != nullptr && button->enabled;
}

// The page that a dialog was opened from shows again while the program is at work on the dialog's answer.
bool Walk::isBehind(const Page &page) const
{
    return m_page != nullptr && page.journey == m_page->journey && page.number < m_page->number;
}

bool Walk::isGoal(const Page *page) const
{
    return page != nullptr && page->name == m_expect.page && m_boxes == m_expect.boxes.size();
}

void Walk::visit(const Window &window)
{
    const Page &page = *window.page();
    if (m_page != &page)
        tellPage(window);
    m_page = &page;
    m_mayPressAgain = false;

    if (isAfterLastLine()) {
        waitFor(
            m_deadline, [this] { return whereabouts(); }, [this] { return !m_tree.isAlive(); });
        m_finished = true;
        return;
    }
    const bool hasEnded = (m_boxes > 0 || m_cancelled) && isGoal(&page);
    const bool leadsOn = !page.button.isEmpty() && page.journey == m_journey;
    if ((page.isLast || page.journey != m_journey) && !isGoal(&page))
        throw Trouble(QStringLiteral("%1, expected %2").arg(whereabouts(), expectation()));
    if (leadsOn && (page.isLast || !hasEnded)) {
        fill(page);
        press(page);
    } else {
        photograph(page.name, window);
    }
}

bool Walk::isAfterLastLine() const
{
    return !m_lastLine.isEmpty() && m_logbook.has(m_lastLine);
}

void Walk::tellPage(const Window &window) const
{
    m_logbook.note(QStringLiteral("page"),
                   QStringLiteral("%1  title %2").arg(window.page()->name, window.page()->title));
    const QString rest = restOf(window);
    if (!rest.isEmpty())
        m_logbook.note(QStringLiteral("read"), rest);
}

void Walk::fill(const Page &page)
{
    for (const Field &field : page.fields)
        type(page, field, m_input.*field.value);
}

// An empty value leaves what the program has put there.
void Walk::type(const Page &page, const Field &field, const QString &value)
{
    const auto hasField = [&field](const Window &each) {
        return each.element().edit(field.caption) != nullptr;
    };
    waitFor(
        m_deadline, [&] { return QStringLiteral("the field %1 does not answer").arg(field.caption); },
        [&] {
            const Window window =
                awaitPage(page, QStringLiteral("has the field %1").arg(field.caption), hasField);
            const Element &edit = *window.element().edit(field.caption);
            if (!value.isEmpty())
                m_tree.type(edit, value);
            const QString text = m_tree.text(edit);
            const QString wanted = edit.secret ? QString(value.size(), QLatin1Char('*')) : value;
            if (!value.isEmpty() && text != wanted) {
                throw Trouble(QStringLiteral("the field %1 reads %2 after %3 was typed")
                                  .arg(field.caption, quoted(text), quoted(wanted)));
            }
            m_logbook.note(
                value.isEmpty() ? QStringLiteral("keep") : QStringLiteral("type"),
                QStringLiteral("%1 = %2").arg(field.caption, edit.secret ? QStringLiteral("***") : text));
            return true;
        });
}

QString Walk::answerTo(const Page &page) const
{
    return m_input.authorise || page.cancelButton.isEmpty() ? page.button : page.cancelButton;
}

void Walk::press(const Page &page)
{
    const QString answer = answerTo(page);
    const auto isEnabled = [&answer](const Window &each) {
        const Element *button = each.element().button(answer);
        return button != nullptr && button->enabled;
    };
    const Window window = awaitPage(page, QStringLiteral("lets %1 be pressed").arg(answer), isEnabled);
    photograph(page.name, window);
    const Element &button = *window.element().button(answer);
    pressButton(button);
    m_cancelled = m_cancelled || answer == page.cancelButton;
    m_hasPressedLast = page.isLast;
}

void Walk::pressButton(const Element &button) const
{
    m_logbook.note(QStringLiteral("press"), button.name);
    waitFor(
        m_deadline, [&] { return QStringLiteral("the button %1 went away").arg(button.name); },
        [&] {
            m_tree.press(button, m_deadline);
            return true;
        });
}

void Walk::dismiss(const Window &box)
{
    const QString message = box.message();
    m_logbook.note(QStringLiteral("box"), quoted(message));
    ++m_boxes;
    const QString place = m_page == nullptr ? QStringLiteral("start") : m_page->name;
    photograph(m_boxes == 1 ? place + QStringLiteral("-box")
                            : QStringLiteral("%1-box-%2").arg(place).arg(m_boxes),
               box);
    checkBox(message);

    const Element *button = box.element().button(kDismiss);
    if (button == nullptr)
        throw Trouble(QStringLiteral("the message box %1 has no button %2").arg(quoted(message), kDismiss));
    pressButton(*button);
    m_answered = box.element().object;
    m_mayPressAgain = true;
}

void Walk::checkBox(const QString &message) const
{
    if (m_boxes > m_expect.boxes.size())
        throw Trouble(
            QStringLiteral("the message box %1 came, expected %2").arg(quoted(message), expectation()));
    const QString wanted = m_expect.boxes.at(m_boxes - 1);
    if (message != wanted)
        throw Trouble(
            QStringLiteral("the message box says %1, expected %2").arg(quoted(message), quoted(wanted)));
}

// Waits until the page is in front and ready. Another page or a box in front means that it will not be.
Window Walk::awaitPage(const Page &page, const QString &purpose,
                       const std::function<bool(const Window &)> &isReady)
{
    const auto complaint = [&] {
        return QStringLiteral("the page %1 never %2").arg(page.name, purpose);
    };
    const auto found = waitFor(m_deadline, complaint, [&]() -> std::optional<Window> {
        std::optional<Window> window = Window::inFront(m_tree.windows());
        if (window && window->page() == &page && isReady(*window))
            return window;
        return std::nullopt;
    });
    return *found;
}

void Walk::photograph(const QString &name, const Window &window) const
{
    const int number = m_page == nullptr ? 0 : m_page->number;
    m_camera.take(QStringLiteral("%1-%2").arg(number).arg(name), [&] {
        try {
            const std::optional<Window> now = Window::inFront(m_tree.windows());
            const bool isSame =
                now && now->element().object == window.element().object && now->page() == window.page();
            return isSame ? m_tree.extents(now->element()) : QRect();
        } catch (const Vanished &) {
            return QRect();
        }
    });
}

QString Walk::expectation() const
{
    QStringList boxes;
    for (const QString &box : m_expect.boxes)
        boxes.append(quoted(box));
    const QString after = QStringLiteral(" after %1").arg(boxes.join(QStringLiteral(", ")));
    return QStringLiteral("page %1").arg(m_expect.page) + (boxes.isEmpty() ? QString() : after);
}

QString Walk::whereabouts() const
{
    if (m_page == nullptr)
        return QStringLiteral("no page that we know came");
    return QStringLiteral("the program stands on page %1 (%2) after %3 message boxes")
        .arg(m_page->name, m_page->title)
        .arg(m_boxes);
}

} // namespace sandbox
