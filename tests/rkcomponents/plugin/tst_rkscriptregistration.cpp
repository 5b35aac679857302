#include "plugin/rkclassfactory.h"
#include "plugin/rkplugin.h"
#include "plugin/rkpluginmgr.h"
#include "rkcomponentsplugin.h"
#include "rkfullscreenaction.h"
#include "rktestmain.h"
#include "rktoolpane.h"
#include "rktoolpaneaction.h"

#include <QPointer>
#include <QScriptEngine>

class TestRkScriptRegistration : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void initTestCase();
    void scriptConstructsWithQtOwnership();
    void pointerConversion();
    void fullScreenFactory();
    void factoriesAreFoundByNameAndGuid();

private:
    std::unique_ptr<RkMainWindow> m_window;
};

void TestRkScriptRegistration::initTestCase()
{
    m_window = rkMakeTestMainWindow();
    QVERIFY(rkApp->getPluginMgr()->addPlugin(rkComponentsPlugin()));
}

void TestRkScriptRegistration::scriptConstructsWithQtOwnership()
{
    QScriptEngine* engine = rkApp->getScriptEngine();
    QScriptValue value = engine->evaluate(QStringLiteral("var pane = new RkToolPane(); pane"));
    QVERIFY2(!engine->hasUncaughtException(), qPrintable(value.toString()));
    QPointer<RkToolPane> pane = qobject_cast<RkToolPane*>(value.toQObject());
    QVERIFY(pane);
    QCOMPARE(pane->windowTitle(), QStringLiteral("Tool"));

    // Dropping every script reference and collecting garbage leaves the object alone.
    value = QScriptValue();
    engine->evaluate(QStringLiteral("pane = null;"));
    engine->collectGarbage();
    QCoreApplication::sendPostedEvents(nullptr, QEvent::DeferredDelete);
    QVERIFY(pane);
    delete pane.data();

    // The action class is script-enabled too; the full-screen action is not.
    value = engine->evaluate(QStringLiteral("new RkToolPaneAction()"));
    std::unique_ptr<QObject> action(value.toQObject());
    QVERIFY(qobject_cast<RkToolPaneAction*>(action.get()));
    QVERIFY(!engine->globalObject().property(QStringLiteral("RkFullScreenAction")).isValid());
}

void TestRkScriptRegistration::pointerConversion()
{
    QScriptEngine* engine = rkApp->getScriptEngine();
    RkToolPane pane;
    RkToolPaneAction action;
    QCOMPARE(qscriptvalue_cast<RkToolPane*>(engine->newQObject(&pane)), &pane);
    QCOMPARE(qscriptvalue_cast<RkToolPane*>(engine->newQObject(&action)),
             static_cast<RkToolPane*>(nullptr));
    QCOMPARE(qscriptvalue_cast<RkToolPane*>(QScriptValue(42)), static_cast<RkToolPane*>(nullptr));
    QVERIFY(QMetaType::type("RkToolPaneAction*") != QMetaType::UnknownType);

    // A pane going into the script keeps its C++ owner.
    QScriptValue wrapped = engine->toScriptValue(&pane);
    QCOMPARE(wrapped.toQObject(), static_cast<QObject*>(&pane));
    engine->collectGarbage();
}

void TestRkScriptRegistration::fullScreenFactory()
{
    RkClassFactory* factory = RkApp::findClassFactory(QStringLiteral("RkFullScreenAction"));
    QVERIFY(factory);
    QCOMPARE(factory->createInstanceFor(this), static_cast<QObject*>(nullptr));
    std::unique_ptr<QObject> fromScript(
        factory->createInstance(static_cast<QScriptContext*>(nullptr)));
    QVERIFY(qobject_cast<RkFullScreenAction*>(fromScript.get()));
    std::unique_ptr<QObject> plain(factory->createInstance());
    QVERIFY(qobject_cast<RkFullScreenAction*>(plain.get()));
    QVERIFY(plain.get() != fromScript.get());

    // The named factories answer the one-argument creation with a new object of their class.
    RkClassFactory* paneFactory = RkApp::findClassFactory(QStringLiteral("RkToolPane"));
    std::unique_ptr<QObject> pane(paneFactory->createInstanceFor(nullptr));
    QVERIFY(qobject_cast<RkToolPane*>(pane.get()));
}

void TestRkScriptRegistration::factoriesAreFoundByNameAndGuid()
{
    // Found by the GUID whatever the letter case of the text that names it.
    RkClassFactory* byGuid = RkApp::findClassFactory(
        RkGUID::fromString(QStringLiteral("255648f4-b646-4DEC-b18c-a5fdb71b8c61")));
    QVERIFY(byGuid);
    QCOMPARE(byGuid->className(), QStringLiteral("RkToolPaneAction"));
    QCOMPARE(byGuid->getGUID().toString(), QStringLiteral("255648F4-B646-4dec-B18C-A5FDB71B8C61"));
}

RK_TEST_MAIN(TestRkScriptRegistration)
#include "tst_rkscriptregistration.moc"
