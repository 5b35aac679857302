#pragma once

#include "rkapp.h"
#include "rkmainwindow.h"
#include "rkstyle.h"

#include <QApplication>
#include <QStandardPaths>
#include <QtTest>

#include <memory>

#if defined(__SANITIZE_ADDRESS__)
#include <dlfcn.h>
#endif

// Under the leak checker, keeps the software OpenGL driver loaded until the program ends: its own
// leftovers are then reported under its name, which the suppressions list, instead of under an
// unloaded module that no suppression can name.
inline void rkKeepGLDriverLoaded()
{
#if defined(__SANITIZE_ADDRESS__)
    for (const char* path : {"/usr/lib/x86_64-linux-gnu/dri/swrast_dri.so", "swrast_dri.so"}) {
        if (dlopen(path, RTLD_NOW | RTLD_NODELETE))
            return;
    }
#endif
}

// main() for a QtTest program that needs the host core: a QApplication with the host style, then
// the RkApp that owns the scene, the undo stack and the script engine (marked running, as after
// start-up), then the test object.
#define RK_TEST_MAIN(TestObject)                                                                   \
    int main(int argc, char** argv)                                                                \
    {                                                                                              \
        QStandardPaths::setTestModeEnabled(true);                                                  \
        rkKeepGLDriverLoaded();                                                                    \
        QApplication app(argc, argv);                                                              \
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
