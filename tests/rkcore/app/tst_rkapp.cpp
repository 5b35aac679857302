#include "rkapp.h"
#include "rkscene.h"
#include "rktestmain.h"
#include "rkundostack.h"

#include <QSignalSpy>

class TestRkApp : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void globalsLiveWithTheApp();
};

void TestRkApp::globalsLiveWithTheApp()
{
    QVERIFY(rkApp);
    QVERIFY(rkScene);
    QVERIFY(rkUndoStack);
    QSignalSpy spy(rkApp, &RkApp::logged);
    rkApp->log(QStringLiteral("hello"));
    QCOMPARE(spy.count(), 1);
    QCOMPARE(spy.at(0).at(0).toString(), QStringLiteral("hello"));
}

RK_TEST_MAIN(TestRkApp)
#include "tst_rkapp.moc"
