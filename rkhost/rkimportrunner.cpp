#include "rkimportrunner.h"

#include "app/rkapp.h"
#include "app/rkmainwindow.h"
#include "import/rkimporter.h"
#include "render/rk3dviewport.h"
#include "scene/rkscene.h"
#include "viewport/rkviewport.h"

#include <QCoreApplication>
#include <QElapsedTimer>
#include <QEventLoop>
#include <QFileInfo>
#include <QProgressDialog>
#include <QThread>
#include <QTimer>

#include <algorithm>
#include <functional>
#include <memory>

RkImportRunner::RkImportRunner(QWidget* dialogParent) : m_parent(dialogParent) {}

RkImportRunner::~RkImportRunner()
{
    delete m_dialog;
}

void RkImportRunner::setDialogDelay(int ms)
{
    m_delay = std::max(0, ms);
}

bool RkImportRunner::wasCancelled() const
{
    return m_cancel;
}

QProgressDialog* RkImportRunner::getDialog() const
{
    return m_dialog;
}

void RkImportRunner::cancel()
{
    m_cancel = true;
}

bool RkImportRunner::read(RkImporter* importer, const QString& path)
{
    m_cancel = false;
    m_progress = 0;
    bool ok = false;
    importer->setProgressCallback([this](float f) {
        m_progress = int(f * 1000.0f);
        return !m_cancel;
    });
    std::unique_ptr<QThread> worker(QThread::create([&] { ok = importer->read(path); }));
    QEventLoop loop;
    connect(worker.get(), &QThread::finished, &loop, &QEventLoop::quit);

    QTimer poll;
    QElapsedTimer clock;
    clock.start();
    const auto update = [&] {
        if (!m_dialog && m_parent && clock.elapsed() >= m_delay) {
            m_dialog = new QProgressDialog(tr("Importing %1...").arg(QFileInfo(path).fileName()),
                                           tr("Cancel"), 0, 1000, m_parent);
            m_dialog->setObjectName(QStringLiteral("ImportProgress"));
            m_dialog->setWindowTitle(tr("Import"));
            m_dialog->setWindowModality(Qt::WindowModal);
            m_dialog->setMinimumDuration(0);
            m_dialog->setAutoReset(false);
            m_dialog->setAutoClose(false);
            connect(m_dialog, &QProgressDialog::canceled, this, &RkImportRunner::cancel);
            m_dialog->show();
            Q_EMIT dialogShown();
        }
        if (m_dialog)
            m_dialog->setValue(m_progress);
    };
    connect(&poll, &QTimer::timeout, this, update);
    poll.start(std::clamp(m_delay, 10, 50));
    update();
    worker->start();
    if (!worker->isFinished())
        loop.exec();
    worker->wait();
    poll.stop();
    if (m_dialog)
        m_dialog->hide();
    importer->setProgressCallback(nullptr);
    // A cancel that came after the last step still counts: the user asked for no import.
    return ok && !m_cancel;
}

RkNode* RkImportRunner::importIntoScene(const QString& path, QWidget* dialogParent, QString* error,
                                        QStringList* warnings)
{
    RkImporter importer;
    RkImportRunner runner(dialogParent);
    if (!runner.read(&importer, path)) {
        if (error)
            *error = runner.wasCancelled() ? QString() : importer.errorString();
        return nullptr;
    }
    RkNode* node = rkScene ? importer.addToScene(rkScene) : nullptr;
    if (!node)
        return nullptr;
    if (warnings)
        *warnings += importer.warnings();
    rkScene->selectNode(node);
    RkMainWindow* window = rkApp ? rkApp->getInterface() : nullptr;
    if (window && window->getMainViewport() && window->getMainViewport()->get3DViewport())
        window->getMainViewport()->get3DViewport()->frameCamera();
    return node;
}
