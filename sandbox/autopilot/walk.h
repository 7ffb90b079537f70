// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "accessibletree.h"
#include "camera.h"
#include "logbook.h"
#include "pages.h"

namespace sandbox {

/// One journey through the program, as a patient user makes it: reads the page in front, fills its fields,
/// presses the button that leads on, and waits for what comes of it; reads and dismisses message boxes;
/// presses again as long as the program is not where the scenario expects it. Never presses while the program
/// is still at work on the press before.
///
/// run() returns when the program stands where the scenario expects it and is at rest there, so that no box
/// can follow, however late; it throws a Trouble otherwise.
class Walk
{
public:
    /// The references must outlive the walk.
    Walk(Journey journey, const ScenarioInput &input, const ScenarioExpectation &expect,
         const AccessibleTree &tree, const Logbook &logbook, const Camera &camera,
         const QDeadlineTimer &deadline);

    void run();

    /// Once the journal has a line with this text, the walk presses nothing more on a page, and returns when
    /// the program has ended.
    void stayAfter(const QString &text) { m_lastLine = text; }

private:
    std::optional<Window> next();
    bool isNews(const Window &window) const;
    bool wantsAnotherPress(const Window &window) const;
    bool isBehind(const Page &page) const;
    bool isGoal(const Page *page) const;
    std::optional<Window> look() const;
    bool hasEnded() const;

    void visit(const Window &window);
    void tellPage(const Window &window) const;
    void fill(const Page &page);
    void type(const Page &page, const Field &field, const QString &value);
    QString answerTo(const Page &page) const;
    void press(const Page &page);
    void pressButton(const Element &button) const;
    bool isAfterLastLine() const;
    void dismiss(const Window &box);
    void checkBox(const QString &message) const;

    Window awaitPage(const Page &page, const QString &purpose,
                     const std::function<bool(const Window &)> &isReady);
    void photograph(const QString &name, const Window &window) const;
    QString expectation() const;
    QString whereabouts() const;

    Journey m_journey;
    const ScenarioInput &m_input;
    const ScenarioExpectation &m_expect;
    const AccessibleTree &m_tree;
    const Logbook &m_logbook;
    const Camera &m_camera;
    QDeadlineTimer m_deadline;

    QString m_lastLine;            ///< empty: none
    const Page *m_page = nullptr;  ///< the page that was met last
    ObjectRef m_answered;          ///< the box that was dismissed last
    bool m_mayPressAgain = false;  ///< a box was dismissed since the last press
    bool m_cancelled = false;      ///< the scenario has a dialog cancelled, and so it was
    int m_boxes = 0;               ///< how many came so far
    bool m_hasPressedLast = false; ///< the program may end
    bool m_finished = false;
};

} // namespace sandbox
