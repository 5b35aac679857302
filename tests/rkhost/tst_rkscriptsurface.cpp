#include "demo/rkdemoscene.h"
#include "properties/rkfloatproperty.h"
#include "rkscriptsurface.h"
#include "rktestmain.h"
#include "scene/rkscene.h"

#include <QElapsedTimer>
#include <QScriptEngine>
#include <QTemporaryDir>
#include <QTimer>

class TestRkScriptSurface : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void initTestCase();
    void init();
    void assignmentIsOneUndoEntry();
    void assignmentGoesThroughTheSetter();
    void findsByNameThenLabelAndSelects();
    void deletedNodeReadsUndefined();
    void waitRunsPostedEventsAndTimers();
    void loadAndSave();
    void importFile();

private:
    // The script's result as text, or the uncaught error.
    QString run(const QString& script);
    float smile() const;

    QTemporaryDir dir;
};

QString TestRkScriptSurface::run(const QString& script)
{
    QScriptEngine* engine = rkApp->getScriptEngine();
    const QScriptValue result = engine->evaluate(script);
    if (engine->hasUncaughtException()) {
        engine->clearExceptions();
        return QStringLiteral("error: ") + result.toString();
    }
    return result.toString();
}

float TestRkScriptSurface::smile() const
{
    return qobject_cast<RkFloatProperty*>(
               rkScene->findNode(RkDemoFigureName)->findProperty("Smile"))
        ->getValue();
}

void TestRkScriptSurface::initTestCase()
{
    rkInstallScriptSurface(rkApp->getScriptEngine());
}

void TestRkScriptSurface::init()
{
    // Also forgets the undo history.
    rkScene->clear();
    rkBuildDemoScene(rkScene);
}

void TestRkScriptSurface::assignmentIsOneUndoEntry()
{
    // Node by label, property by name; the caption is the property's label.
    QCOMPARE(run("var cheeks = scene.findNode('Demo Figure').findProperty('CheeksPuff');"
                 "cheeks.value = 0.5; cheeks.value = 0.75;"
                 "[undoStack.count(), undoStack.getUndoCaption(), cheeks.value]"),
             QStringLiteral("2,Cheeks Puff,0.75"));
    QCOMPARE(run("undoStack.undo(); cheeks.value"), QStringLiteral("0.5"));
    QCOMPARE(run("undoStack.undo(); [cheeks.value, undoStack.getUndoCaption()]"),
             QStringLiteral("0,"));
}

void TestRkScriptSurface::assignmentGoesThroughTheSetter()
{
    QCOMPARE(run("var figure = scene.findNode('Figure');"
                 "var smile = figure.findProperty('Smile'); smile.value = 5;"
                 "[smile.value, smile.min, smile.max, smile.hidden]"),
             QStringLiteral("1,0,1,false"));
    QCOMPARE(smile(), 1.0f);
    // A refused value changes nothing and leaves no entry.
    QCOMPARE(run("smile.value = NaN; [smile.value, undoStack.count()]"), QStringLiteral("1,1"));
    QCOMPARE(run("var level = figure.findProperty('Subdivision Level');"
                 "level.value = 7; var high = level.value; level.value = 1.6;"
                 "[high, level.value, level.max]"),
             QStringLiteral("3,2,3"));
    QCOMPARE(run("var shadows = figure.findProperty('CastShadows'); shadows.value = false;"
                 "[shadows.value, typeof shadows.min, undoStack.getUndoCaption(),"
                 " figure.findProperty('BodyCorrection').hidden]"),
             QStringLiteral("false,undefined,Cast Shadows,true"));
    QCOMPARE(run("figure.findProperty('No Such')"), QStringLiteral("null"));
}

void TestRkScriptSurface::findsByNameThenLabelAndSelects()
{
    // The first node's label is the second node's name: the name wins.
    auto* twin = new RkNode;
    twin->setName("Twin");
    twin->setLabel("Other");
    rkScene->addNode(twin);
    auto* other = new RkNode;
    other->setName("Other");
    other->setLabel("Third");
    rkScene->addNode(other);
    QCOMPARE(run("[scene.findNode('Other').name, scene.findNode('Third').name,"
                 " scene.findNode('Twin').label, scene.findNode('Nobody')]"),
             QStringLiteral("Other,Other,Other,"));
    QCOMPARE(run("scene.getNode(scene.getNumNodes() - 1).name"), QStringLiteral("Other"));

    QCOMPARE(run("[scene.selectNode('Prop'), scene.selectNode(scene.findNode('Demo Figure'), true),"
                 " scene.selectNode('Nobody'), scene.getPrimarySelection().name]"),
             QStringLiteral("true,true,false,Figure"));
    QCOMPARE(rkScene->getSelectedNodes(),
             RkNodeList({rkScene->findNode(RkDemoPropName), rkScene->findNode(RkDemoFigureName)}));
    QCOMPARE(run("scene.clearSelection(); scene.getPrimarySelection()"), QStringLiteral("null"));
    QCOMPARE(rkScene->getNumSelectedNodes(), 0);
}

void TestRkScriptSurface::deletedNodeReadsUndefined()
{
    QCOMPARE(run("var prop = scene.findNode('Prop'); var visible = prop.findProperty('Visible');"
                 "visible.label"),
             QStringLiteral("Visible"));
    rkScene->removeNode(rkScene->findNode(RkDemoPropName));
    QCOMPARE(run("visible.value = false;"
                 "[typeof prop.name, typeof prop.label, typeof prop.findProperty('Visible'),"
                 " typeof visible.value, typeof visible.label, typeof visible.hidden,"
                 " scene.selectNode(prop), undoStack.count()].join(' ')"),
             QStringLiteral("undefined undefined undefined undefined undefined undefined false 0"));
}

void TestRkScriptSurface::waitRunsPostedEventsAndTimers()
{
    bool posted = false;
    bool timed = false;
    QMetaObject::invokeMethod(
        this, [&] { posted = true; }, Qt::QueuedConnection);
    QTimer timer;
    timer.setSingleShot(true);
    connect(&timer, &QTimer::timeout, this, [&] { timed = true; });
    timer.start(0);
    QCOMPARE(run("wait(0); 'waited'"), QStringLiteral("waited"));
    QVERIFY(posted);
    QVERIFY(timed);

    QElapsedTimer clock;
    clock.start();
    run("wait(60)");
    QVERIFY(clock.elapsed() >= 55);
}

void TestRkScriptSurface::loadAndSave()
{
    const QString path = dir.filePath("saved.rks");
    const int nodes = rkScene->getNumNodes();
    QCOMPARE(run(QString("scene.findNode('Figure').findProperty('Smile').value = 0.25;"
                         "[scene.save('%1'), scene.lastError]")
                     .arg(path)),
             QStringLiteral("true,"));
    rkScene->clear();
    QCOMPARE(run(QString("[scene.load('%1'), scene.lastError, scene.getNumNodes()]").arg(path)),
             QString("true,,%1").arg(nodes));
    QCOMPARE(smile(), 0.25f);

    QCOMPARE(run(QString("[scene.load('%1'), scene.lastError.length > 0, scene.getNumNodes()]")
                     .arg(dir.filePath("missing.rks"))),
             QString("false,true,%1").arg(nodes));
}

void TestRkScriptSurface::importFile()
{
    const QString model = QStringLiteral("/usr/share/assimp/models/OBJ/box.obj");
    if (!QFile::exists(model))
        QSKIP("Debian's assimp-testmodels is not installed (scripts/setup.sh installs it)");
    const int nodes = rkScene->getNumNodes();
    QCOMPARE(run(QString("[scene.importFile('%1'), scene.lastError, scene.getNumNodes(),"
                         " scene.getPrimarySelection().name]")
                     .arg(model)),
             QString("true,,%1,box").arg(nodes + 1));
    const QString result =
        run(QString("[scene.importFile('%1'), scene.lastError]").arg(dir.filePath("none.obj")));
    QVERIFY2(result.startsWith("false,") && result.contains("none.obj"), qPrintable(result));
    QCOMPARE(rkScene->getNumNodes(), nodes + 1);
}

RK_TEST_MAIN(TestRkScriptSurface)
#include "tst_rkscriptsurface.moc"
