#include "app/rkapp.h"
#include "rktestmain.h"
#include "scene/rkscene.h"
#include "undo/rkundostack.h"

#include <QPointer>
#include <QSignalSpy>

class TestRkApp : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void logReachesListenersAndIsKept();
    void mainWindowIsTheInterfaceWhileItLives();
    void busyCursorNests();
    void staticObjectsGoWithTheApp();
};

void TestRkApp::logReachesListenersAndIsKept()
{
    QSignalSpy spy(rkApp, &RkApp::logged);
    rkApp->log(QStringLiteral("hello"));
    QCOMPARE(spy.count(), 1);
    QCOMPARE(spy.at(0).at(0).toString(), QStringLiteral("hello"));
    QCOMPARE(rkApp->getLog().constLast(), QStringLiteral("hello"));
}

void TestRkApp::mainWindowIsTheInterfaceWhileItLives()
{
    QCOMPARE(rkApp->getInterface(), static_cast<RkMainWindow*>(nullptr));
    {
        auto window = rkMakeTestMainWindow();
        QCOMPARE(rkApp->getInterface(), window.get());
    }
    QCOMPARE(rkApp->getInterface(), static_cast<RkMainWindow*>(nullptr));
}

void TestRkApp::busyCursorNests()
{
    QVERIFY(!QApplication::overrideCursor());
    RkApp::setBusyCursor();
    RkApp::setBusyCursor();
    QCOMPARE(QApplication::overrideCursor()->shape(), Qt::WaitCursor);
    RkApp::clearBusyCursor();
    QVERIFY(QApplication::overrideCursor());
    RkApp::clearBusyCursor();
    QVERIFY(!QApplication::overrideCursor());
    // One clear too many must not pop a cursor that someone else set.
    QApplication::setOverrideCursor(Qt::CrossCursor);
    RkApp::clearBusyCursor();
    QCOMPARE(QApplication::overrideCursor()->shape(), Qt::CrossCursor);
    QApplication::restoreOverrideCursor();
}

void TestRkApp::staticObjectsGoWithTheApp()
{
    // A second application core cannot coexist with the test's; take it down and up again.
    QStringList order;
    QPointer<QObject> first, second, gone;
    {
        RkApp* saved = rkApp;
        RkScene* savedScene = rkScene;
        RkUndoStack* savedUndoStack = rkUndoStack;
        rkApp = nullptr;
        {
            RkApp local;
            first = new QObject;
            second = new QObject;
            gone = new QObject;
            connect(first, &QObject::destroyed, [&] { order.append("first"); });
            connect(second, &QObject::destroyed, [&] { order.append("second"); });
            rkRegisterStaticObject(first);
            rkRegisterStaticObject(second);
            rkRegisterStaticObject(gone);
            delete gone.data(); // deleted early: no double delete later
        }
        rkApp = saved;
        rkScene = savedScene;
        rkUndoStack = savedUndoStack;
    }
    QVERIFY(rkScene);
    QVERIFY(!first);
    QVERIFY(!second);
    QCOMPARE(order, QStringList({"second", "first"}));
}

RK_TEST_MAIN(TestRkApp)
#include "tst_rkapp.moc"
