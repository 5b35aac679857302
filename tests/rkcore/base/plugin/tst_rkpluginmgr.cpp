#include "plugin/rkclassfactory.h"
#include "plugin/rkguid.h"
#include "plugin/rkplugin.h"
#include "plugin/rkpluginmgr.h"
#include "rktestmain.h"

#include <QDir>
#include <QFile>
#include <QTemporaryDir>

namespace
{
class Dummy : public QObject
{
    Q_OBJECT
};

class DummyFactory : public RkClassFactory
{
public:
    DummyFactory(const QString& guid)
        : RkClassFactory(&Dummy::staticMetaObject, RkGUID::fromString(guid))
    {
    }
    QObject* createInstance() override { return new Dummy; }
    void registerClass(QScriptEngine*) override { ++registered; }
    int registered = 0;
};
} // namespace

class TestRkPluginMgr : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void guidKeepsTextAndComparesByValue_data();
    void guidKeepsTextAndComparesByValue();
    void registration();
    void refusedModules_data();
    void refusedModules();
    void loadsTheBuiltModuleFromAFolder();
};

void TestRkPluginMgr::guidKeepsTextAndComparesByValue_data()
{
    QTest::addColumn<QString>("text");
    QTest::addColumn<QString>("other");
    QTest::addColumn<bool>("valid");
    QTest::addColumn<bool>("same");
    QTest::newRow("mixed case") << "255648F4-B646-4dec-B18C-A5FDB71B8C61"
                                << "255648f4-b646-4DEC-b18c-a5fdb71b8c61" << true << true;
    QTest::newRow("braces") << "{01eaf994-480e-49db-92cb-12676a2bc3c7}"
                            << "01EAF994-480E-49DB-92CB-12676A2BC3C7" << true << true;
    QTest::newRow("different") << "40e0b500-9711-11de-aed8-0002a5d5c51b"
                               << "55b5a760-9711-11de-b0b1-0002a5d5c51b" << true << false;
    QTest::newRow("not a guid") << "Interface Components"
                                << "" << false << true;
    QTest::newRow("one digit short") << "40e0b500-9711-11de-aed8-0002a5d5c51"
                                     << "" << false << true;
}

void TestRkPluginMgr::guidKeepsTextAndComparesByValue()
{
    QFETCH(QString, text);
    QFETCH(QString, other);
    QFETCH(bool, valid);
    QFETCH(bool, same);
    const RkGUID guid = RkGUID::fromString(text);
    QCOMPARE(!guid.isNull(), valid);
    QCOMPARE(guid.toString(), valid ? text : QString());
    const RkGUID second = RkGUID::fromString(other);
    QCOMPARE(guid == second, same);
    QCOMPARE(guid != second, !same);
    if (same)
        QCOMPARE(qHash(guid), qHash(second));
}

void TestRkPluginMgr::registration()
{
    QScriptEngine engine;
    RkPluginMgr mgr(&engine);
    DummyFactory first(QStringLiteral("11111111-2222-3333-4444-555555555555"));
    RkPlugin plugin(QStringLiteral("Test"), QString(), QString(), 0);
    plugin.addClassFactory(&first);
    plugin.addClassFactory(&first);
    QCOMPARE(plugin.getNumClassFactories(), 1);

    QVERIFY(mgr.addPlugin(&plugin));
    QCOMPARE(first.registered, 1);
    QCOMPARE(mgr.findClassFactory(QStringLiteral("Dummy")), &first);
    QCOMPARE(mgr.findClassFactory(
                 RkGUID::fromString(QStringLiteral("11111111-2222-3333-4444-555555555555"))),
             &first);
    QCOMPARE(mgr.findClassFactory(RkGUID()), static_cast<RkClassFactory*>(nullptr));
    QVERIFY(!mgr.addPlugin(&plugin));
    QCOMPARE(first.registered, 1);

    // A second plug-in claiming the same class is skipped with a log line; the first one stays.
    DummyFactory clash(QStringLiteral("99999999-2222-3333-4444-555555555555"));
    RkPlugin other(QStringLiteral("Other"), QString(), QString(), 0);
    other.addClassFactory(&clash);
    const int logLines = rkApp->getLog().size();
    QVERIFY(mgr.addPlugin(&other));
    QCOMPARE(rkApp->getLog().size(), logLines + 1);
    QCOMPARE(mgr.findClassFactory(QStringLiteral("Dummy")), &first);
    QCOMPARE(clash.registered, 0);
    QCOMPARE(mgr.getPlugins().size(), 2);
}

void TestRkPluginMgr::refusedModules_data()
{
    QTest::addColumn<QString>("file");
    QTest::addColumn<QString>("logged");
    QTest::newRow("other SDK") << QStringLiteral(RK_FIXTURE_DIR "/rk_fixture_badsdk.so")
                               << QStringLiteral("built for SDK 4.0.0.0");
    QTest::newRow("no entry point") << QStringLiteral(RK_FIXTURE_DIR "/rk_fixture_noentry.so")
                                    << QStringLiteral("lacks the entry point getPluginDefinition");
    QTest::newRow("missing file") << QStringLiteral(RK_FIXTURE_DIR "/nothing.so")
                                  << QStringLiteral("not loaded");
}

void TestRkPluginMgr::refusedModules()
{
    QFETCH(QString, file);
    QFETCH(QString, logged);
    RkPluginMgr mgr(nullptr);
    const int logLines = rkApp->getLog().size();
    QVERIFY(!mgr.loadModule(file));
    QCOMPARE(rkApp->getLog().size(), logLines + 1);
    QVERIFY2(rkApp->getLog().constLast().contains(logged), qPrintable(rkApp->getLog().constLast()));
    QVERIFY(mgr.getPlugins().isEmpty());
}

void TestRkPluginMgr::loadsTheBuiltModuleFromAFolder()
{
    // A folder with the real module and both refused ones: one loads, two are refused.
    QTemporaryDir dir;
    QVERIFY(QFile::copy(QStringLiteral(RK_MODULE_FILE), dir.filePath("rkcomponents.so")));
    QVERIFY(QFile::copy(QStringLiteral(RK_FIXTURE_DIR "/rk_fixture_badsdk.so"),
                        dir.filePath("a_badsdk.so")));
    QVERIFY(QFile::copy(QStringLiteral(RK_FIXTURE_DIR "/rk_fixture_noentry.so"),
                        dir.filePath("b_noentry.so")));
    QFile notALibrary(dir.filePath("readme.txt"));
    QVERIFY(notALibrary.open(QIODevice::WriteOnly));
    notALibrary.close();

    RkPluginMgr& mgr = *rkApp->getPluginMgr();
    QCOMPARE(mgr.loadModules(dir.path()), 1);
    QCOMPARE(mgr.getPlugins().size(), 1);
    RkPlugin* plugin = mgr.getPlugins().constFirst();
    QCOMPARE(plugin->getName(), QStringLiteral("Interface Components"));
    QCOMPARE(mgr.getPluginFilePath(plugin), QDir(dir.path()).absoluteFilePath("rkcomponents.so"));
    QVERIFY(mgr.findClassFactory(QStringLiteral("RkToolPane")));
    // Script constructors come with loading.
    QVERIFY(rkApp->getScriptEngine()->globalObject().property("RkToolPane").isFunction());
}

RK_TEST_MAIN(TestRkPluginMgr)
#include "tst_rkpluginmgr.moc"
