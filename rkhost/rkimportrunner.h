#pragma once

#include <QObject>
#include <QPointer>

#include <atomic>

class QProgressDialog;
class QWidget;
class RkImporter;
class RkNode;

// Runs a model import for the host: the file is read on a worker thread while the event loop
// goes on, and a read that takes longer than the dialog delay shows a progress dialog whose
// Cancel stops it. Only then, on this thread, is the scene touched, so a refused or cancelled
// import leaves the scene as it was.
class RkImportRunner : public QObject
{
    Q_OBJECT
public:
    // dialogParent null: no dialog (scripts, unattended runs).
    explicit RkImportRunner(QWidget* dialogParent = nullptr);
    ~RkImportRunner() override;

    static constexpr int DefaultDialogDelayMs = 500;
    void setDialogDelay(int ms);

    // Reads path with importer, waiting in a local event loop. False when refused or cancelled.
    bool read(RkImporter* importer, const QString& path);
    bool wasCancelled() const;
    QProgressDialog* getDialog() const;

    // The whole import as a user asks for it: read, add the node, select it and frame the main
    // viewport on it. Null on refusal, with the reason in error (empty when the user cancelled).
    // Repairs the importer made are appended to warnings.
    static RkNode* importIntoScene(const QString& path, QWidget* dialogParent, QString* error,
                                   QStringList* warnings = nullptr);

public Q_SLOTS:
    void cancel();

Q_SIGNALS:
    void dialogShown();

private:
    QWidget* m_parent = nullptr;
    int m_delay = DefaultDialogDelayMs;
    QPointer<QProgressDialog> m_dialog;
    std::atomic<int> m_progress{0}; // per mille
    std::atomic<bool> m_cancel{false};
};
