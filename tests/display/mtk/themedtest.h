// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "buttonnamed.h"

#include "mtk/mapplication.h"

#include <QtTest>

// What a widget looks like.
inline QImage imageOf(QWidget &widget)
{
    return widget.grab().toImage().convertToFormat(QImage::Format_RGB32);
}

// Puts a window on the screen, with the keyboard's focus.
inline bool activate(QWidget &window)
{
    window.show();
    window.activateWindow();
    return QTest::qWaitForWindowActive(&window);
}

// Runs a test under the toolkit's own application object, so that it sees what users see.
#define THEMED_TEST_MAIN(TestClass)                                                                          \
    int main(int argc, char **argv)                                                                          \
    {                                                                                                        \
        Mtk::Widget::MApplication application(argc, argv);                                                   \
        TestClass test;                                                                                      \
        return QTest::qExec(&test, argc, argv);                                                              \
    }
