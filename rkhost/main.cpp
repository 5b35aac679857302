#include "actions/rkactionmgr.h"
#include "app/rkapp.h"
#include "app/rkmainwindow.h"
#include "app/rkstyle.h"
#include "demo/rkdemoscene.h"
#include "import/rkimporter.h"
#include "panes/rkpanemgr.h"
#include "plugin/rkpluginmgr.h"
#include "render/rk3dviewport.h"
#include "rkaboutplugins.h"
#include "rkdemotools.h"
#include "rkhostactions.h"
#include "rkimportrunner.h"
#include "rkposeactions.h"
#include "rkpropertiesdock.h"
#include "rkscenelist.h"
#include "rkscenemenus.h"
#include "rkscriptsurface.h"
#include "rksurfacelist.h"
#include "scene/rkscene.h"
#include "support/rkgldriver.h"
#include "viewport/rkviewportmgr.h"

#include <QApplication>
#include <QCommandLineParser>
#include <QDir>
#include <QDockWidget>
#include <QFile>
#include <QFileInfo>
#include <QGLWidget>
#include <QMenu>
#include <QPainter>
#include <QScreen>
#include <QScriptEngine>
#include <QTimer>
#include <QWindow>

#include <cstdio>

namespace
{

// --plugins, then $RK_PLUGIN_PATH, then the installed plug-in folder next to the binary, then the
// build tree's.
QString pluginFolder(const QCommandLineParser& parser)
{
    if (parser.isSet(QStringLiteral("plugins")))
        return parser.value(QStringLiteral("plugins"));
    const QString fromEnv = qEnvironmentVariable("RK_PLUGIN_PATH");
    if (!fromEnv.isEmpty())
        return fromEnv;
    const QString installed = QDir(QCoreApplication::applicationDirPath())
                                  .absoluteFilePath(QStringLiteral("../" RK_PLUGIN_INSTALL_DIR));
    if (QDir(installed).exists())
        return QDir::cleanPath(installed);
    return QStringLiteral(RK_PLUGIN_BUILD_DIR);
}

bool hasDisplay()
{
    return !qEnvironmentVariableIsEmpty("DISPLAY") ||
           !qEnvironmentVariableIsEmpty("WAYLAND_DISPLAY") ||
           !qEnvironmentVariableIsEmpty("QT_QPA_PLATFORM");
}

bool wantsListOnly(int argc, char** argv)
{
    for (int i = 1; i < argc; ++i) {
        const QByteArray arg(argv[i]);
        if (arg == "--list-plugins" || arg == "--help" || arg == "-h" || arg == "--version" ||
            arg == "-v")
            return true;
    }
    return false;
}

int runScript(const QString& fileName)
{
    QFile file(fileName);
    if (!file.open(QIODevice::ReadOnly)) {
        std::fprintf(stderr, "rkhost: cannot read script %s: %s\n", qPrintable(fileName),
                     qPrintable(file.errorString()));
        return 1;
    }
    QScriptEngine* engine = rkApp->getScriptEngine();
    engine->evaluate(QString::fromUtf8(file.readAll()), fileName);
    if (engine->hasUncaughtException()) {
        std::fprintf(stderr, "rkhost: %s:%d: %s\n", qPrintable(fileName),
                     engine->uncaughtExceptionLineNumber(),
                     qPrintable(engine->uncaughtException().toString()));
        engine->clearExceptions();
        return 1;
    }
    return 0;
}

// A scene named on the command line replaces the demo scene; one that cannot be opened leaves the
// demo scene. The user is told why in a message box, or on stderr when the host runs unattended,
// which then stops.
// Any other file is imported as a model into a new scene.
bool openStartScene(const QString& path, RkSceneMenus* menus, bool unattended)
{
    const bool scene =
        QFileInfo(path).suffix().compare(QLatin1String("rks"), Qt::CaseInsensitive) == 0;
    if (!scene) {
        rkScene->clear();
        if (!unattended) {
            menus->importFile(path);
            return true;
        }
        QString error;
        if (RkImportRunner::importIntoScene(path, nullptr, &error))
            return true;
        std::fprintf(stderr, "rkhost: cannot import %s: %s\n", qPrintable(path),
                     qPrintable(error.simplified()));
        return false;
    }
    if (!unattended) {
        menus->openScene(path);
        return true;
    }
    QString error;
    RkImporter::takeSourceProblems();
    if (rkScene->load(path, &error)) {
        for (const QString& problem : RkImporter::takeSourceProblems())
            std::fprintf(stderr, "rkhost: %s\n", qPrintable(problem));
        return true;
    }
    std::fprintf(stderr, "rkhost: cannot open scene %s: %s\n", qPrintable(path),
                 qPrintable(error.simplified()));
    return false;
}

// The scene viewport of the main window; it can also draw its picture for a screenshot.
class SceneView : public Rk3DViewport
{
public:
    // Draws the picture into the back buffer without handing it to the display and reads it
    // back: a widget grab leaves the OpenGL surface out, and the display may show another
    // window there.
    QImage drawForGrab()
    {
        setAutoBufferSwap(false);
        updateGL();
        QImage picture = grabFrameBuffer();
        setAutoBufferSwap(true);
        return picture;
    }
};

// Saves the main window as PNG once the scene viewport shows the scene: after the window is
// exposed and the events posted until then (layouts, refreshes) have run, the viewport has to
// present a frame within the time limit. The picture is put together from the widgets' own
// painting and the viewport's frame rather than read from the display, where another program's
// window may lie over this one.
class Screenshot : public QObject
{
public:
    static constexpr int kFrameTimeoutMs = 10000;

    Screenshot(QWidget* window, SceneView* view, const QString& fileName)
        : QObject(window), m_window(window), m_view(view), m_fileName(fileName)
    {
        m_deadline.setSingleShot(true);
        m_deadline.setTimerType(Qt::PreciseTimer);
        connect(&m_deadline, &QTimer::timeout, this, [this] {
            std::fprintf(stderr,
                         "rkhost: the 3D viewport presented no frame within %d s; %s not written\n",
                         kFrameTimeoutMs / 1000, qPrintable(m_fileName));
            QCoreApplication::exit(1);
        });
    }

    void start()
    {
        m_deadline.start(kFrameTimeoutMs);
        QWindow* handle = m_window->windowHandle();
        if (handle->isExposed())
            QTimer::singleShot(0, this, &Screenshot::requestFrame);
        else
            handle->installEventFilter(this);
    }

protected:
    bool eventFilter(QObject* watched, QEvent* event) override
    {
        if (event->type() == QEvent::Expose && static_cast<QWindow*>(watched)->isExposed()) {
            watched->removeEventFilter(this);
            QTimer::singleShot(0, this, &Screenshot::requestFrame);
        }
        return false;
    }

private:
    void requestFrame()
    {
        QCoreApplication::sendPostedEvents();
        // A view that took the 3D picture's place (the UV view) hides the scene viewport: then
        // there is no frame to wait for.
        if (!m_view->isVisible()) {
            QTimer::singleShot(0, this, &Screenshot::save);
            return;
        }
        // Queued: the picture is taken outside the paint that presented the frame.
        connect(m_view, &Rk3DViewport::framePresented, this, &Screenshot::save,
                Qt::QueuedConnection);
        m_view->update();
    }

    void save()
    {
        if (m_done)
            return;
        m_done = true;
        m_deadline.stop();
        QImage shot = m_window->grab().toImage();
        QPainter painter(&shot);
        // A widget grab leaves OpenGL surfaces out: each visible one is drawn and read back.
        for (QGLWidget* gl : m_window->findChildren<QGLWidget*>()) {
            if (!gl->isVisible())
                continue;
            QImage picture;
            if (gl == m_view) {
                picture = m_view->drawForGrab();
            } else {
                gl->updateGL();
                picture = gl->grabFrameBuffer();
            }
            if (picture.isNull()) {
                std::fprintf(stderr, "rkhost: cannot read the picture of %s back\n",
                             qPrintable(gl->objectName()));
                QCoreApplication::exit(1);
                return;
            }
            painter.drawImage(gl->mapTo(m_window, QPoint()), picture);
        }
        painter.end();
        const bool saved = shot.save(m_fileName, "PNG");
        if (!saved)
            std::fprintf(stderr, "rkhost: cannot write %s\n", qPrintable(m_fileName));
        QCoreApplication::exit(saved ? 0 : 1);
    }

    QWidget* m_window;
    SceneView* m_view;
    QString m_fileName;
    QTimer m_deadline;
    bool m_done = false;
};

} // namespace

int main(int argc, char** argv)
{
    if (!hasDisplay()) {
        if (wantsListOnly(argc, argv)) {
            qputenv("QT_QPA_PLATFORM", "offscreen");
        } else {
            std::fprintf(
                stderr,
                "rkhost: no display. Run it under a virtual X server, for example:\n"
                "  xvfb-run -a -s '-screen 0 1600x1200x24 -noreset' %s --screenshot host.png\n",
                argv[0]);
            return 2;
        }
    }

    QApplication app(argc, argv);
    rkKeepGLDriverLoaded();
    QApplication::setApplicationName(QStringLiteral("rkhost"));
    QApplication::setOrganizationName(QStringLiteral("rkhost"));
    QApplication::setApplicationVersion(QStringLiteral("3.0.1"));

    QCommandLineParser parser;
    parser.setApplicationDescription(
        QStringLiteral("Host program: loads the modules of its plug-in folder and shows them."));
    parser.addHelpOption();
    parser.addVersionOption();
    parser.addOptions({
        {QStringLiteral("plugins"), QStringLiteral("Load modules from <dir>."),
         QStringLiteral("dir")},
        {QStringLiteral("list-plugins"), QStringLiteral("Print the loaded modules and exit.")},
        {QStringLiteral("script"),
         QStringLiteral("Run <file> with the host's script engine after start-up, then exit "
                        "(non-zero on a script error)."),
         QStringLiteral("file")},
        {QStringLiteral("screenshot"),
         QStringLiteral("Start, let the window settle, save it as PNG <file> and exit."),
         QStringLiteral("file")},
    });
    parser.addPositionalArgument(
        QStringLiteral("file"),
        QStringLiteral("Open the scene file <file> (.rks) at start, or import the model <file>."),
        QStringLiteral("[file]"));
    parser.process(app);

    RkApp core;
    RkStyle::install();

    const QString folder = pluginFolder(parser);
    if (parser.isSet(QStringLiteral("list-plugins"))) {
        core.getPluginMgr()->loadModules(folder);
        std::fprintf(stdout, "plug-in folder: %s\n%s", qPrintable(folder),
                     qPrintable(rkPluginListing(core.getPluginMgr())));
        return 0;
    }

    RkMainWindow window;
    window.setWindowTitle(QStringLiteral("rkhost"));
    // The scene is shown in the 3D viewport, framed on the whole scene at start.
    auto* sceneView = new SceneView;
    sceneView->setObjectName(QStringLiteral("SceneView"));
    window.setSceneWidget(sceneView);
    window.addMenu(QStringLiteral("&File"));
    window.addMenu(QStringLiteral("&Edit"));
    window.addMenu(QStringLiteral("&View"));
    window.addMenu(QStringLiteral("&Figure"));
    window.addMenu(QStringLiteral("&Window"));
    auto* sceneMenus = new RkSceneMenus(&window);
    rkAddSceneList(&window);
    rkAddSurfaceList(&window);
    rkAddPropertiesDock(&window);
    rkAddHostActions(&window);
    rkAddPoseActions(&window);
    rkAddDemoTools(window.getViewportMgr(), window.getActionMgr());

    core.getPluginMgr()->loadModules(folder);
    window.getPaneMgr()->createPanes();
    // The demo scene comes as a new scene does: the panes, made by now, see the scene cleared and
    // then its content added, as after File > New.
    rkScene->clear();
    rkBuildDemoScene(rkScene);
    // Scripts reach the window's widgets by object name: mainWindow.findChild("RkToolPaneDock").
    QScriptEngine* engine = core.getScriptEngine();
    engine->globalObject().setProperty(QStringLiteral("mainWindow"), engine->newQObject(&window));
    rkInstallScriptSurface(engine);
    window.getActionMgr()->buildMenus();
    // Views have no menu place of their own; the host lists the UV view with the 3D picture.
    window.getActionMgr()->addActionToMenu(QStringLiteral("RkUVViewAction"),
                                           window.addMenu(QStringLiteral("&View")));
    // Help stays the last menu.
    window.addMenu(QStringLiteral("&Help"));
    window.resize(1280, 800);
    // The docks on the left keep room for names, whatever the view in the middle asks for.
    if (auto* sceneDock = window.findChild<QDockWidget*>(QStringLiteral("SceneDock")))
        window.resizeDocks({sceneDock}, {250}, Qt::Horizontal);
    const auto docks = window.findChildren<QDockWidget*>();
    for (QDockWidget* dock : docks) {
        if (window.dockWidgetArea(dock) == Qt::RightDockWidgetArea) {
            window.resizeDocks({dock}, {300}, Qt::Horizontal);
            break;
        }
    }
    window.show();
    if (!parser.positionalArguments().isEmpty() &&
        !openStartScene(parser.positionalArguments().constFirst(), sceneMenus,
                        parser.isSet(QStringLiteral("script")) ||
                            parser.isSet(QStringLiteral("screenshot"))))
        return 1;
    sceneView->frameCamera();

    const QString script = parser.value(QStringLiteral("script"));
    const QString screenshot = parser.value(QStringLiteral("screenshot"));
    QTimer::singleShot(0, &app, [&] {
        core.setRunning(true);
        if (!script.isEmpty()) {
            const int rc = runScript(script);
            if (rc != 0 || screenshot.isEmpty()) {
                QCoreApplication::exit(rc);
                return;
            }
        }
        if (!screenshot.isEmpty()) {
            auto* taker = new Screenshot(&window, sceneView, screenshot);
            taker->start();
        }
    });
    return app.exec();
}
