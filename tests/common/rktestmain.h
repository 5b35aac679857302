#pragma once

#include "app/rkapp.h"
#include "app/rkmainwindow.h"
#include "app/rkstyle.h"
#include "support/rkgldriver.h"

#include <QApplication>
#include <QStandardPaths>
#include <QtTest>

#include <memory>

// main() for a QtTest program that needs the host core: a QApplication with the host style, then
// the RkApp that owns the scene, the undo stack and the script engine (marked running, as after
// start-up), then the test object.
#define RK_TEST_MAIN(TestObject)                                                                   \
    int main(int argc, char** argv)                                                                \
    {                                                                                              \
        QStandardPaths::setTestModeEnabled(true);                                                  \
        QApplication app(argc, argv);                                                              \
        rkKeepGLDriverLoaded();                                                                    \
        RkStyle::install();                                                                        \
        RkApp core;                                                                                \
        core.setRunning(true);                                                                     \
        TestObject tc;                                                                             \
        QTEST_SET_MAIN_SOURCE_PATH                                                                 \
        return QTest::qExec(&tc, argc, argv);                                                      \
    }

// A main window for one test: while it lives, rkApp->getInterface() answers it. Pane settings go
// to the test's private settings folder. Not shown; call show() and QTest::qWaitForWindowExposed
// when the test needs real geometry.
inline std::unique_ptr<RkMainWindow> rkMakeTestMainWindow()
{
    auto window = std::make_unique<RkMainWindow>();
    window->resize(1024, 768);
    return window;
}
