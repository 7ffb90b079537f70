// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "mtk/mapplication.h"

#include <QtTest>

// Runs a test under the toolkit's own application object, so that it sees what users see.
#define THEMED_TEST_MAIN(TestClass)                                                                          \
    int main(int argc, char **argv)                                                                          \
    {                                                                                                        \
        Mtk::Widget::MApplication application(argc, argv);                                                   \
        TestClass test;                                                                                      \
        return QTest::qExec(&test, argc, argv);                                                              \
    }
