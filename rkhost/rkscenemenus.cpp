#include "rkscenemenus.h"

#include "app/rkapp.h"
#include "app/rkmainwindow.h"
#include "import/rkimporter.h"
#include "rkimportrunner.h"
#include "scene/rkscene.h"
#include "undo/rkundostack.h"

#include <QAction>
#include <QFileDialog>
#include <QFileInfo>
#include <QMenu>
#include <QMessageBox>

namespace
{
const char* const FileFilter = QT_TRANSLATE_NOOP("RkSceneMenus", "Scenes (*.rks);;All files (*)");
}

struct RkSceneMenus::Private {
    RkMainWindow* window = nullptr;
    QAction* newAction = nullptr;
    QAction* openAction = nullptr;
    QAction* saveAction = nullptr;
    QAction* saveAsAction = nullptr;
    QAction* importAction = nullptr;
    QAction* undoAction = nullptr;
    QAction* redoAction = nullptr;
};

RkSceneMenus::RkSceneMenus(RkMainWindow* window) : QObject(window), d(std::make_unique<Private>())
{
    d->window = window;
    QMenu* file = window->addMenu(QStringLiteral("&File"));
    d->newAction = file->addAction(tr("&New"), this, &RkSceneMenus::newScene, QKeySequence::New);
    d->openAction = file->addAction(tr("&Open..."), this, &RkSceneMenus::open, QKeySequence::Open);
    d->saveAction = file->addAction(tr("&Save"), this, &RkSceneMenus::save, QKeySequence::Save);
    d->saveAsAction =
        file->addAction(tr("Save &As..."), this, &RkSceneMenus::saveAs, QKeySequence::SaveAs);
    file->addSeparator();
    d->importAction = file->addAction(tr("&Import..."), this, &RkSceneMenus::importModel);
    d->importAction->setObjectName(QStringLiteral("ImportAction"));
    file->addSeparator();

    QMenu* edit = window->addMenu(QStringLiteral("&Edit"));
    d->undoAction =
        edit->addAction(tr("&Undo"), rkUndoStack, &RkUndoStack::undo, QKeySequence::Undo);
    d->redoAction =
        edit->addAction(tr("&Redo"), rkUndoStack, &RkUndoStack::redo, QKeySequence::Redo);
    d->undoAction->setObjectName(QStringLiteral("UndoAction"));
    d->redoAction->setObjectName(QStringLiteral("RedoAction"));

    connect(rkUndoStack, &RkUndoStack::undoCaptionChanged, this, &RkSceneMenus::updateUndoRedo);
    connect(rkUndoStack, &RkUndoStack::redoCaptionChanged, this, &RkSceneMenus::updateUndoRedo);
    // While a gesture holds the stack, undo is refused; the menu shows that when it opens.
    connect(edit, &QMenu::aboutToShow, this, &RkSceneMenus::updateUndoRedo);
    connect(rkScene, &RkScene::fileNameChanged, this, &RkSceneMenus::updateTitle);
    updateUndoRedo();
    updateTitle();
}

RkSceneMenus::~RkSceneMenus() = default;

QAction* RkSceneMenus::newAction() const
{
    return d->newAction;
}
QAction* RkSceneMenus::openAction() const
{
    return d->openAction;
}
QAction* RkSceneMenus::saveAction() const
{
    return d->saveAction;
}
QAction* RkSceneMenus::saveAsAction() const
{
    return d->saveAsAction;
}
QAction* RkSceneMenus::importAction() const
{
    return d->importAction;
}
QAction* RkSceneMenus::undoAction() const
{
    return d->undoAction;
}
QAction* RkSceneMenus::redoAction() const
{
    return d->redoAction;
}

void RkSceneMenus::newScene()
{
    rkScene->clear();
    rkScene->setFileName(QString());
}

void RkSceneMenus::open()
{
    const QString path = QFileDialog::getOpenFileName(
        d->window, tr("Open Scene"), QFileInfo(rkScene->getFileName()).path(), tr(FileFilter));
    if (!path.isEmpty())
        openScene(path);
}

void RkSceneMenus::save()
{
    if (rkScene->getFileName().isEmpty())
        saveAs();
    else
        saveScene(rkScene->getFileName());
}

void RkSceneMenus::saveAs()
{
    QString path = QFileDialog::getSaveFileName(d->window, tr("Save Scene As"),
                                                rkScene->getFileName(), tr(FileFilter));
    if (path.isEmpty())
        return;
    if (QFileInfo(path).suffix().isEmpty())
        path += QStringLiteral(".rks");
    saveScene(path);
}

bool RkSceneMenus::openScene(const QString& path)
{
    QString error;
    RkImporter::takeSourceProblems();
    if (rkScene->load(path, &error)) {
        const QStringList problems = RkImporter::takeSourceProblems();
        if (!problems.isEmpty())
            tellUser(tr("Open Scene"), problems.join(QLatin1Char('\n')));
        return true;
    }
    tellUser(tr("Open Scene"),
             tr("The scene \"%1\" could not be opened: %2.\nThe scene you had is unchanged.")
                 .arg(QFileInfo(path).fileName(), error));
    return false;
}

bool RkSceneMenus::saveScene(const QString& path)
{
    QString error;
    if (rkScene->save(path, &error))
        return true;
    tellUser(
        tr("Save Scene"),
        tr("The scene could not be saved as \"%1\": %2.").arg(QFileInfo(path).fileName(), error));
    return false;
}

void RkSceneMenus::importModel()
{
    const QString filter = tr("Models (%1);;Scenes (*.rks);;All files (*)")
                               .arg(RkImporter::filePatterns().join(QLatin1Char(' ')));
    const QString path = QFileDialog::getOpenFileName(
        d->window, tr("Import"), QFileInfo(rkScene->getFileName()).path(), filter);
    if (!path.isEmpty())
        importFile(path);
}

bool RkSceneMenus::importFile(const QString& path)
{
    // Our own scenes are opened, not imported.
    if (QFileInfo(path).suffix().compare(QLatin1String("rks"), Qt::CaseInsensitive) == 0)
        return openScene(path);
    QString error;
    QStringList warnings;
    if (RkImportRunner::importIntoScene(path, d->window, &error, &warnings)) {
        if (!warnings.isEmpty())
            tellUser(tr("Import"), tr("\"%1\" was imported with repairs:\n%2")
                                       .arg(QFileInfo(path).fileName(), warnings.join('\n')));
        return true;
    }
    // A cancelled import needs no message: the user asked for it.
    if (!error.isEmpty())
        tellUser(tr("Import"), tr("%1.\nThe scene is unchanged.").arg(error));
    return false;
}

void RkSceneMenus::updateUndoRedo()
{
    const bool held = rkUndoStack->canPushItems();
    const QString undo = rkUndoStack->getUndoCaption();
    const QString redo = rkUndoStack->getRedoCaption();
    d->undoAction->setText(rkUndoStack->canUndo() && !undo.isEmpty() ? tr("&Undo %1").arg(undo)
                                                                     : tr("&Undo"));
    d->redoAction->setText(rkUndoStack->canRedo() && !redo.isEmpty() ? tr("&Redo %1").arg(redo)
                                                                     : tr("&Redo"));
    d->undoAction->setEnabled(rkUndoStack->canUndo() && !held);
    d->redoAction->setEnabled(rkUndoStack->canRedo() && !held);
}

void RkSceneMenus::updateTitle()
{
    const QString file = rkScene->getFileName();
    d->window->setWindowTitle(file.isEmpty()
                                  ? QStringLiteral("rkhost")
                                  : QStringLiteral("%1 - rkhost").arg(QFileInfo(file).fileName()));
}

void RkSceneMenus::tellUser(const QString& title, const QString& message)
{
    if (rkApp)
        rkApp->log(message);
    // Not modal-blocking: the message stays up while the application goes on.
    auto* box = new QMessageBox(QMessageBox::Warning, title, message, QMessageBox::Ok, d->window);
    box->setObjectName(QStringLiteral("SceneMessage"));
    box->setAttribute(Qt::WA_DeleteOnClose);
    box->open();
}
