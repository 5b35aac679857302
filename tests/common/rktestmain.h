#pragma once

#include "rkapp.h"

#include <QApplication>
#include <QStandardPaths>
#include <QtTest>

// main() for a QtTest program that needs the host core: a QApplication, then the RkApp that owns
// the scene, the undo stack and the script engine, then the test object.
#define RK_TEST_MAIN(TestObject)                                                                   \
    int main(int argc, char** argv)                                                                \
    {                                                                                              \
        QStandardPaths::setTestModeEnabled(true);                                                  \
        QApplication app(argc, argv);                                                              \
        RkApp core;                                                                                \
        TestObject tc;                                                                             \
        QTEST_SET_MAIN_SOURCE_PATH                                                                 \
        return QTest::qExec(&tc, argc, argv);                                                      \
    }
