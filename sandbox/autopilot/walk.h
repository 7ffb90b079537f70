// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "accessibletree.h"
#include "logbook.h"
#include "pages.h"

namespace sandbox {

/// What a walk is to do.
struct WalkPlan
{
    Journey journey = Journey::Join;
    ScenarioInput input;
    ScenarioExpectation expect;
    QString screenshots; ///< directory for a screenshot of each page and message box; empty: none are taken
    /// Part of a line. Once the journal has it, the walk presses nothing more on a page, and returns when the
    /// program has ended. Empty: none.
    QString stayAfter;
};

/// One journey through the program, as a patient user makes it: reads the page in front, fills its fields,
/// presses the button that leads on, and waits for what comes of it; reads and dismisses message boxes;
/// presses again as long as the program is not where the scenario expects it. Never presses while the program
/// is still at work on the press before.
///
/// run() returns when the program stands where the scenario expects it and is at rest there, so that no
/// message box can follow, however late; it throws an Error otherwise.
class Walk
{
public:
    /// The references must outlive the walk.
    Walk(WalkPlan plan, const AccessibleTree &tree, const Logbook &logbook, const QDeadlineTimer &deadline);

    void run();

private:
    std::optional<Window> next();
    bool isNews(const Window &window) const;
    bool wantsAnotherPress(const Window &window) const;
    bool isBehind(const Page &page) const;
    bool isGoal(const Page *page) const;

    bool visit(const Window &window);
    void note(const QString &what, const QString &text, const Window &window) const;
    void fill(const Page &page) const;
    void type(const Element &edit, const Field &field) const;
    void press(const Page &page);
    void pressButton(const Element &button) const;
    void dismiss(const Window &messageBox);

    Window awaitPage(const Page &page, const QString &purpose,
                     const std::function<bool(const Window &)> &isReady) const;
    void takeScreenshot(const QString &name, const Window &window) const;
    QString whereabouts() const;

    WalkPlan m_plan;
    const AccessibleTree &m_tree;
    const Logbook &m_logbook;
    QDeadlineTimer m_deadline;
    QString m_expectation; ///< in words

    const Page *m_page = nullptr;  ///< the page that was met last
    ObjectRef m_answered;          ///< the message box that was dismissed last
    bool m_mayPressAgain = false;  ///< a message box was dismissed since the last press
    bool m_cancelled = false;      ///< the scenario has a dialog cancelled, and so it was
    int m_messages = 0;            ///< how many came so far
    bool m_hasPressedLast = false; ///< the program may end
};

} // namespace sandbox
