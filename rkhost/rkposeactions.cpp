#include "rkposeactions.h"

#include "actions/rkaction.h"
#include "actions/rkactionmgr.h"
#include "app/rkapp.h"
#include "app/rkmainwindow.h"
#include "rkposeedit.h"
#include "rksymmetry.h"
#include "rksymmetrydialog.h"
#include "scene/rknode.h"
#include "scene/rkscene.h"

namespace
{

using Scope = RkPoseEdit::Scope;

// The undo caption of an action: its text without mnemonics or the dots of a dialog.
QString captionOf(const QAction* action)
{
    QString caption = action->text();
    caption.remove(QLatin1Char('&'));
    if (caption.endsWith(QLatin1String("...")))
        caption.chop(3);
    return caption;
}

// Base of the figure commands: menu path, group and an enabled state that follows the selection.
class RkPoseAction : public RkAction
{
    Q_OBJECT
public:
    RkPoseAction(const QString& text, const QString& description, const QString& menuPath)
        : RkAction(text, description), m_menuPath(menuPath)
    {
        setStatusTip(description);
        setToolTip(description);
    }
    QString getActionGroup() const override { return tr("Figure"); }
    QString getDefaultMenuPath() const override { return m_menuPath; }
    void init() override
    {
        connect(rkScene, &RkScene::nodeSelectionListChanged, this, &RkPoseAction::updateEnabled);
        connect(rkScene, &RkScene::primarySelectionChanged, this, &RkPoseAction::updateEnabled);
        updateEnabled();
    }

protected:
    virtual bool hasTarget() const { return rkScene->getPrimarySelection() != nullptr; }
    QString caption() const { return captionOf(this); }

private:
    void updateEnabled() { setEnabled(hasTarget()); }

    QString m_menuPath;
};

enum class Operation { Memorize, Restore, Zero, ClearKeys };

QString scopeText(Scope scope)
{
    switch (scope) {
    case Scope::Figure:
        return RkAction::tr("&Figure");
    case Scope::FigurePose:
        return RkAction::tr("Figure &Pose");
    case Scope::FigureMorphs:
        return RkAction::tr("Figure &Morphs");
    case Scope::SelectedItems:
        return RkAction::tr("&Selected Items");
    case Scope::Transforms:
        return RkAction::tr("&Transforms");
    }
    return QString();
}

QString scopeObject(Scope scope)
{
    switch (scope) {
    case Scope::Figure:
        return RkAction::tr("the selected figure and its bones");
    case Scope::FigurePose:
        return RkAction::tr("the pose of the selected figure");
    case Scope::FigureMorphs:
        return RkAction::tr("the morphs of the selected figure");
    case Scope::SelectedItems:
        return RkAction::tr("the selected items");
    case Scope::Transforms:
        return RkAction::tr("the transforms of the selected items");
    }
    return QString();
}

QString operationText(Operation operation, Scope scope)
{
    switch (operation) {
    case Operation::Memorize:
        return RkAction::tr("Memorize %1").arg(scopeText(scope));
    case Operation::Restore:
        return RkAction::tr("Restore %1").arg(scopeText(scope));
    case Operation::Zero:
        return RkAction::tr("Zero %1").arg(scopeText(scope));
    case Operation::ClearKeys:
        return RkAction::tr("Clear Animation of %1").arg(scopeText(scope));
    }
    return QString();
}

QString operationDescription(Operation operation, Scope scope)
{
    switch (operation) {
    case Operation::Memorize:
        return RkAction::tr("Keep the current values of %1 for Restore").arg(scopeObject(scope));
    case Operation::Restore:
        return RkAction::tr("Set %1 back to the values last memorized").arg(scopeObject(scope));
    case Operation::Zero:
        return RkAction::tr("Set %1 to zero (scales to 100%)").arg(scopeObject(scope));
    case Operation::ClearKeys:
        return RkAction::tr("Not available: this host keeps no animation keys");
    }
    return QString();
}

QString operationMenu(Operation operation)
{
    switch (operation) {
    case Operation::Memorize:
        return QStringLiteral("&Figure/&Memorize");
    case Operation::Restore:
        return QStringLiteral("&Figure/&Restore");
    case Operation::Zero:
        return QStringLiteral("&Figure/&Zero");
    case Operation::ClearKeys:
        return QStringLiteral("&Figure/Clear &Animation");
    }
    return QString();
}

// Memorize, Restore, Zero and Clear Animation, each over one scope.
class RkScopeAction : public RkPoseAction
{
    Q_OBJECT
public:
    RkScopeAction(Operation operation, Scope scope)
        : RkPoseAction(operationText(operation, scope), operationDescription(operation, scope),
                       operationMenu(operation)),
          m_operation(operation), m_scope(scope)
    {
        setEnabled(false);
    }
    // There are no animation keys to clear, so those actions stay disabled.
    void setEnabled(bool enabled) override
    {
        RkPoseAction::setEnabled(enabled && m_operation != Operation::ClearKeys);
    }
    void executeAction() override
    {
        const QList<RkProperty*> properties = RkPoseEdit::numericProperties(rkScene, m_scope);
        switch (m_operation) {
        case Operation::Memorize:
            RkPoseEdit::memorize(properties, caption());
            break;
        case Operation::Restore:
            RkPoseEdit::restore(properties, caption());
            break;
        case Operation::Zero:
            RkPoseEdit::zero(properties, caption());
            break;
        case Operation::ClearKeys:
            break;
        }
    }

protected:
    bool hasTarget() const override { return !RkPoseEdit::nodes(rkScene, m_scope).isEmpty(); }

private:
    Operation m_operation;
    Scope m_scope;
};

class RkMemorizeFigureAction : public RkScopeAction
{
    Q_OBJECT
public:
    RkMemorizeFigureAction() : RkScopeAction(Operation::Memorize, Scope::Figure) {}
};

class RkMemorizeFigurePoseAction : public RkScopeAction
{
    Q_OBJECT
public:
    RkMemorizeFigurePoseAction() : RkScopeAction(Operation::Memorize, Scope::FigurePose) {}
};

class RkMemorizeFigureMorphsAction : public RkScopeAction
{
    Q_OBJECT
public:
    RkMemorizeFigureMorphsAction() : RkScopeAction(Operation::Memorize, Scope::FigureMorphs) {}
};

class RkMemorizeSelectedItemsAction : public RkScopeAction
{
    Q_OBJECT
public:
    RkMemorizeSelectedItemsAction() : RkScopeAction(Operation::Memorize, Scope::SelectedItems) {}
};

class RkMemorizeTransformsAction : public RkScopeAction
{
    Q_OBJECT
public:
    RkMemorizeTransformsAction() : RkScopeAction(Operation::Memorize, Scope::Transforms) {}
};

class RkRestoreFigureAction : public RkScopeAction
{
    Q_OBJECT
public:
    RkRestoreFigureAction() : RkScopeAction(Operation::Restore, Scope::Figure) {}
};

class RkRestoreFigurePoseAction : public RkScopeAction
{
    Q_OBJECT
public:
    RkRestoreFigurePoseAction() : RkScopeAction(Operation::Restore, Scope::FigurePose) {}
};

class RkRestoreFigureMorphsAction : public RkScopeAction
{
    Q_OBJECT
public:
    RkRestoreFigureMorphsAction() : RkScopeAction(Operation::Restore, Scope::FigureMorphs) {}
};

class RkRestoreSelectedItemsAction : public RkScopeAction
{
    Q_OBJECT
public:
    RkRestoreSelectedItemsAction() : RkScopeAction(Operation::Restore, Scope::SelectedItems) {}
};

class RkRestoreTransformsAction : public RkScopeAction
{
    Q_OBJECT
public:
    RkRestoreTransformsAction() : RkScopeAction(Operation::Restore, Scope::Transforms) {}
};

class RkZeroFigureAction : public RkScopeAction
{
    Q_OBJECT
public:
    RkZeroFigureAction() : RkScopeAction(Operation::Zero, Scope::Figure) {}
};

class RkZeroFigurePoseAction : public RkScopeAction
{
    Q_OBJECT
public:
    RkZeroFigurePoseAction() : RkScopeAction(Operation::Zero, Scope::FigurePose) {}
};

class RkZeroFigureMorphsAction : public RkScopeAction
{
    Q_OBJECT
public:
    RkZeroFigureMorphsAction() : RkScopeAction(Operation::Zero, Scope::FigureMorphs) {}
};

class RkZeroSelectedItemsAction : public RkScopeAction
{
    Q_OBJECT
public:
    RkZeroSelectedItemsAction() : RkScopeAction(Operation::Zero, Scope::SelectedItems) {}
};

class RkZeroTransformsAction : public RkScopeAction
{
    Q_OBJECT
public:
    RkZeroTransformsAction() : RkScopeAction(Operation::Zero, Scope::Transforms) {}
};

class RkClearKeysFigureAction : public RkScopeAction
{
    Q_OBJECT
public:
    RkClearKeysFigureAction() : RkScopeAction(Operation::ClearKeys, Scope::Figure) {}
};

class RkClearKeysFigurePoseAction : public RkScopeAction
{
    Q_OBJECT
public:
    RkClearKeysFigurePoseAction() : RkScopeAction(Operation::ClearKeys, Scope::FigurePose) {}
};

class RkClearKeysFigureMorphsAction : public RkScopeAction
{
    Q_OBJECT
public:
    RkClearKeysFigureMorphsAction() : RkScopeAction(Operation::ClearKeys, Scope::FigureMorphs) {}
};

class RkClearKeysSelectedItemsAction : public RkScopeAction
{
    Q_OBJECT
public:
    RkClearKeysSelectedItemsAction() : RkScopeAction(Operation::ClearKeys, Scope::SelectedItems) {}
};

class RkClearKeysTransformsAction : public RkScopeAction
{
    Q_OBJECT
public:
    RkClearKeysTransformsAction() : RkScopeAction(Operation::ClearKeys, Scope::Transforms) {}
};

class RkLimitsAction : public RkPoseAction
{
    Q_OBJECT
public:
    explicit RkLimitsAction(bool on)
        : RkPoseAction(on ? tr("Limits &On") : tr("Limits O&ff"),
                       on ? tr("Keep the values of the selected items within their limits")
                          : tr("Let the values of the selected items go beyond their limits"),
                       QStringLiteral("&Figure/&Limits")),
          m_on(on)
    {
    }
    void executeAction() override
    {
        RkPoseEdit::setLimits(RkPoseEdit::numericProperties(rkScene, Scope::SelectedItems), m_on,
                              caption());
    }

private:
    bool m_on;
};

class RkLimitsOnAction : public RkLimitsAction
{
    Q_OBJECT
public:
    RkLimitsOnAction() : RkLimitsAction(true) {}
};

class RkLimitsOffAction : public RkLimitsAction
{
    Q_OBJECT
public:
    RkLimitsOffAction() : RkLimitsAction(false) {}
};

QString lockText(Scope scope, bool on)
{
    switch (scope) {
    case Scope::FigureMorphs:
        return on ? RkAction::tr("Lock &Morphs") : RkAction::tr("Unlock M&orphs");
    case Scope::Transforms:
        return on ? RkAction::tr("Lock &Transforms") : RkAction::tr("Unlock T&ransforms");
    default:
        return on ? RkAction::tr("&Lock Node") : RkAction::tr("&Unlock Node");
    }
}

QString lockDescription(Scope scope, bool on)
{
    QString what;
    switch (scope) {
    case Scope::FigureMorphs:
        what = RkAction::tr("the selected figure's morphs");
        break;
    case Scope::Transforms:
        what = scopeObject(scope);
        break;
    default:
        what = RkAction::tr("every property of the selected items");
        break;
    }
    return on ? RkAction::tr("Lock %1 against changes").arg(what)
              : RkAction::tr("Let %1 be changed again").arg(what);
}

class RkLockAction : public RkPoseAction
{
    Q_OBJECT
public:
    RkLockAction(Scope scope, bool on)
        : RkPoseAction(lockText(scope, on), lockDescription(scope, on),
                       QStringLiteral("&Figure/Loc&k")),
          m_scope(scope), m_on(on)
    {
    }
    void executeAction() override
    {
        RkPoseEdit::setLocked(RkPoseEdit::lockTargets(rkScene, m_scope), m_on, caption());
    }

protected:
    bool hasTarget() const override { return !RkPoseEdit::nodes(rkScene, m_scope).isEmpty(); }

private:
    Scope m_scope;
    bool m_on;
};

class RkLockNodeAction : public RkLockAction
{
    Q_OBJECT
public:
    RkLockNodeAction() : RkLockAction(Scope::SelectedItems, true) {}
};

class RkUnlockNodeAction : public RkLockAction
{
    Q_OBJECT
public:
    RkUnlockNodeAction() : RkLockAction(Scope::SelectedItems, false) {}
};

class RkLockMorphsAction : public RkLockAction
{
    Q_OBJECT
public:
    RkLockMorphsAction() : RkLockAction(Scope::FigureMorphs, true) {}
};

class RkUnlockMorphsAction : public RkLockAction
{
    Q_OBJECT
public:
    RkUnlockMorphsAction() : RkLockAction(Scope::FigureMorphs, false) {}
};

class RkLockTransformsAction : public RkLockAction
{
    Q_OBJECT
public:
    RkLockTransformsAction() : RkLockAction(Scope::Transforms, true) {}
};

class RkUnlockTransformsAction : public RkLockAction
{
    Q_OBJECT
public:
    RkUnlockTransformsAction() : RkLockAction(Scope::Transforms, false) {}
};

class RkSymmetryAction : public RkPoseAction
{
    Q_OBJECT
public:
    RkSymmetryAction()
        : RkPoseAction(tr("Sym&metry..."),
                       tr("Mirror the pose of the selected figure from one side to the other"),
                       QStringLiteral("&Figure"))
    {
    }
    void executeAction() override
    {
        RkSkeleton* figure = RkPoseEdit::selectedFigure(rkScene);
        if (!figure)
            return;
        RkSymmetryDialog dialog(rkApp ? rkApp->getInterface() : nullptr);
        if (dialog.exec() == QDialog::Accepted)
            RkSymmetry::mirror(figure, dialog.direction(), caption());
    }

protected:
    bool hasTarget() const override { return RkPoseEdit::selectedFigure(rkScene) != nullptr; }
};

class RkMoveToFloorAction : public RkPoseAction
{
    Q_OBJECT
public:
    RkMoveToFloorAction()
        : RkPoseAction(tr("Move to &Floor"),
                       tr("Move the selected item up or down until its lowest point touches the "
                          "floor"),
                       QStringLiteral("&Figure"))
    {
    }
    void executeAction() override
    {
        RkPoseEdit::moveToFloor(rkScene->getPrimarySelection(), caption());
    }
};

} // namespace

void rkAddPoseActions(RkMainWindow* mainWindow)
{
    RkActionMgr* actions = mainWindow->getActionMgr();
    const QList<RkAction*> all = {
        new RkMemorizeFigureAction,
        new RkMemorizeFigurePoseAction,
        new RkMemorizeFigureMorphsAction,
        new RkMemorizeSelectedItemsAction,
        new RkMemorizeTransformsAction,
        new RkRestoreFigureAction,
        new RkRestoreFigurePoseAction,
        new RkRestoreFigureMorphsAction,
        new RkRestoreSelectedItemsAction,
        new RkRestoreTransformsAction,
        new RkZeroFigureAction,
        new RkZeroFigurePoseAction,
        new RkZeroFigureMorphsAction,
        new RkZeroSelectedItemsAction,
        new RkZeroTransformsAction,
        new RkClearKeysFigureAction,
        new RkClearKeysFigurePoseAction,
        new RkClearKeysFigureMorphsAction,
        new RkClearKeysSelectedItemsAction,
        new RkClearKeysTransformsAction,
        new RkLimitsOnAction,
        new RkLimitsOffAction,
        new RkLockNodeAction,
        new RkUnlockNodeAction,
        new RkLockMorphsAction,
        new RkUnlockMorphsAction,
        new RkLockTransformsAction,
        new RkUnlockTransformsAction,
        new RkSymmetryAction,
        new RkMoveToFloorAction,
    };
    for (RkAction* action : all)
        actions->addAction(action);
}

#include "rkposeactions.moc"
