#include "rktestmain.h"
#include "scene/rkscene.h"

#include <QImage>
#include <QProcess>
#include <QTemporaryDir>

namespace
{
struct Run {
    int exitCode = -1;
    QString out;
    QString err;
};

Run runHost(const QStringList& arguments,
            const QProcessEnvironment& env = QProcessEnvironment::systemEnvironment())
{
    QProcess host;
    host.setProcessEnvironment(env);
    host.start(QStringLiteral(RK_HOST_BINARY), arguments);
    Run run;
    if (!host.waitForFinished(60000)) {
        host.kill();
        host.waitForFinished();
        run.err = QStringLiteral("<timed out>");
        return run;
    }
    run.exitCode = host.exitStatus() == QProcess::NormalExit ? host.exitCode() : -2;
    run.out = QString::fromLocal8Bit(host.readAllStandardOutput());
    run.err = QString::fromLocal8Bit(host.readAllStandardError());
    return run;
}

QString writeScript(const QTemporaryDir& dir, const QString& name, const QString& text)
{
    const QString path = dir.filePath(name);
    QFile file(path);
    if (file.open(QIODevice::WriteOnly))
        file.write(text.toUtf8());
    return path;
}
} // namespace

class TestRkHost : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void screenshotShowsTheDockedToolTab();
    void scriptConstructsModuleClasses();
    void scriptErrorExitsNonZero();
    void sceneFileOnTheCommandLine();
    void modelOnTheCommandLineIsImportedTextured();
    void refusedModulesLeaveTheHostRunning();
    void noDisplaySaysWhatToDoButListsPlugins();

private:
    QTemporaryDir m_dir;
};

void TestRkHost::screenshotShowsTheDockedToolTab()
{
    const QString png = m_dir.filePath(QStringLiteral("host.png"));
    const Run run = runHost({QStringLiteral("--screenshot"), png});
    QVERIFY2(run.exitCode == 0, qPrintable(run.err));
    QImage image(png);
    QVERIFY(!image.isNull());
    QVERIFY(image.width() >= 800 && image.height() >= 500);
    // The viewport fills the left part with its picture: its background beside the figure and
    // the shaded figure across the middle. The Tool tab is docked on the right in the light
    // window colour.
    const int y = image.height() / 2;
    const QRgb background = qRgb(92, 98, 112);
    QCOMPARE(image.pixel(image.width() / 3, y), background);
    int figure = 0;
    for (int x = image.width() / 3; x < image.width() * 2 / 3; ++x)
        figure += image.pixel(x, y) != background;
    QVERIFY2(figure > 20, qPrintable(QString::number(figure)));
    QVERIFY(qGray(image.pixel(image.width() - 40, y)) > 200);
}

void TestRkHost::scriptConstructsModuleClasses()
{
    const QString script = writeScript(m_dir, QStringLiteral("make.js"), QStringLiteral(R"(
        var pane = new RkToolPane();
        print("made", pane.windowTitle);
        var dock = mainWindow.findChild("RkToolPaneDock");
        print("dock", dock.visible, dock.windowTitle);
        print("tool", dock.findChild("Tool Pane Name").text);
        mainWindow.findChild("RkAboutPluginsAction").trigger();
        var about = mainWindow.findChild("AboutPluginsDialog");
        print("about", about.visible, about.windowTitle);
    )"));
    const Run run = runHost({QStringLiteral("--script"), script});
    QVERIFY2(run.exitCode == 0, qPrintable(run.err));
    QCOMPARE(run.out.split(QLatin1Char('\n'), Qt::SkipEmptyParts),
             QStringList(
                 {"made Tool", "dock true Tool", "tool Universal", "about true About Plug-ins"}));
}

void TestRkHost::scriptErrorExitsNonZero()
{
    const QString script = writeScript(m_dir, QStringLiteral("broken.js"),
                                       QStringLiteral("print('before');\nnoSuchFunction();\n"));
    const Run run = runHost({QStringLiteral("--script"), script});
    QCOMPARE(run.exitCode, 1);
    QCOMPARE(run.out, QStringLiteral("before\n"));
    QVERIFY2(run.err.contains(QStringLiteral("broken.js:2: ReferenceError")), qPrintable(run.err));
}

void TestRkHost::sceneFileOnTheCommandLine()
{
    rkScene->clear();
    auto* node = new RkNode;
    node->setName(QStringLiteral("Lonely"));
    rkScene->addNode(node);
    const QString good = m_dir.filePath(QStringLiteral("good.rks"));
    QVERIFY(rkScene->save(good));
    const QString script = writeScript(m_dir, QStringLiteral("count.js"),
                                       QStringLiteral("print(scene.getNumNodes(), "
                                                      "scene.getNode(0).name);\n"));
    const Run run = runHost({good, QStringLiteral("--script"), script});
    QVERIFY2(run.exitCode == 0, qPrintable(run.err));
    QCOMPARE(run.out, QStringLiteral("1 Lonely\n"));

    // Unattended, a file that cannot be opened stops the host with one line and runs nothing.
    const QString bad = writeScript(m_dir, QStringLiteral("bad.rks"), QStringLiteral("no scene"));
    const Run failed = runHost({bad, QStringLiteral("--script"), script});
    QCOMPARE(failed.exitCode, 1);
    QCOMPARE(failed.out, QString());
    QCOMPARE(failed.err.count(QLatin1Char('\n')), 1);
    QVERIFY2(failed.err.startsWith(QStringLiteral("rkhost: cannot open scene ")) &&
                 failed.err.contains(QStringLiteral("bad.rks: ")),
             qPrintable(failed.err));
}

void TestRkHost::modelOnTheCommandLineIsImportedTextured()
{
    const QString model =
        QStringLiteral("/usr/share/assimp/models/glTF2/BoxTextured-glTF-Binary/BoxTextured.glb");
    if (!QFile::exists(model))
        QSKIP("Debian's assimp-testmodels is not installed (scripts/setup.sh installs it)");
    const QString script =
        writeScript(m_dir, QStringLiteral("model.js"),
                    QStringLiteral("scene.clearSelection();\n"
                                   "print(scene.getNumNodes(), scene.getNode(0).name);\n"));
    const QString png = m_dir.filePath(QStringLiteral("model.png"));
    const Run run =
        runHost({model, QStringLiteral("--script"), script, QStringLiteral("--screenshot"), png});
    QVERIFY2(run.exitCode == 0, qPrintable(run.err));
    QCOMPARE(run.out, QStringLiteral("1 BoxTextured\n"));
    // The box is framed and its texture, a blue sky over a green hill, fills the middle.
    QImage image(png);
    QVERIFY(!image.isNull());
    int sky = 0, hill = 0;
    for (int y = image.height() / 4; y < image.height() * 3 / 4; y += 2) {
        for (int x = image.width() / 4; x < image.width() / 2; x += 2) {
            const QColor c = image.pixelColor(x, y);
            sky += c.blue() > c.red() + 60 && c.blue() > c.green() + 20;
            hill += c.green() > c.red() + 30 && c.green() > c.blue() + 30;
        }
    }
    QVERIFY2(sky > 500 && hill > 500, qPrintable(QStringLiteral("%1 %2").arg(sky).arg(hill)));

    const QString bad = writeScript(m_dir, QStringLiteral("bad.gltf"), QStringLiteral("{ nope"));
    const Run failed = runHost({bad, QStringLiteral("--script"), script});
    QCOMPARE(failed.exitCode, 1);
    QVERIFY2(failed.err.contains(QStringLiteral("rkhost: cannot import ")) &&
                 failed.err.contains(QStringLiteral("bad.gltf")),
             qPrintable(failed.err));
}

void TestRkHost::refusedModulesLeaveTheHostRunning()
{
    // The option wins over the environment's plug-in folder.
    const QString png = m_dir.filePath(QStringLiteral("refused.png"));
    const Run run = runHost({QStringLiteral("--plugins"), QStringLiteral(RK_FIXTURE_DIR),
                             QStringLiteral("--screenshot"), png});
    QCOMPARE(run.exitCode, 0);
    QVERIFY(QImage(png).width() > 0);
    const QStringList lines = run.err.split(QLatin1Char('\n'));
    QCOMPARE(lines.filter(QStringLiteral("rk_fixture_badsdk.so refused")).size(), 1);
    QCOMPARE(lines.filter(QStringLiteral("rk_fixture_noentry.so refused")).size(), 1);
}

void TestRkHost::noDisplaySaysWhatToDoButListsPlugins()
{
    QProcessEnvironment env = QProcessEnvironment::systemEnvironment();
    env.remove(QStringLiteral("DISPLAY"));
    env.remove(QStringLiteral("WAYLAND_DISPLAY"));
    env.remove(QStringLiteral("QT_QPA_PLATFORM"));
    const Run run = runHost({}, env);
    QCOMPARE(run.exitCode, 2);
    QVERIFY2(run.err.contains(QStringLiteral("xvfb-run")), qPrintable(run.err));
    QVERIFY(run.err.contains(QStringLiteral("--screenshot")));
    // Listing needs no display.
    const Run list = runHost({QStringLiteral("--list-plugins")}, env);
    QCOMPARE(list.exitCode, 0);
    QVERIFY(list.out.contains(QStringLiteral("Interface Components\n")));
    QVERIFY(list.out.contains(QStringLiteral("author: Morvane 3D, Inc")));
    QVERIFY(list.out.contains(QStringLiteral("version: 2.0.8.32")));
    QVERIFY(list.out.contains(QStringLiteral("RkToolPane 56C51F21-B8D3-4895-9E00-6C8975018A22")));
    QVERIFY(list.out.contains(
        QStringLiteral("RkFullScreenAction 8A77FD58-BE3E-4434-93EF-BB41DA6DBDB4")));
}

RK_TEST_MAIN(TestRkHost)
#include "tst_rkhost.moc"
