#include "rkdemotools.h"

#include "actions/rkaction.h"
#include "actions/rkactionmenu.h"
#include "actions/rkactionmgr.h"
#include "app/rkapp.h"
#include "viewport/rkviewportmgr.h"
#include "viewport/rkviewtool.h"

#include <QCheckBox>
#include <QDoubleSpinBox>
#include <QFormLayout>
#include <QPointer>
#include <QStyle>

namespace
{

class RkToolResetAction : public RkAction
{
    Q_OBJECT
public:
    RkToolResetAction() : RkAction(tr("Reset Tool Options"), tr("Reset the tool's options")) {}
    void executeAction() override
    {
        if (rkApp)
            rkApp->log(tr("Tool options reset"));
    }
};

class RkToolSnapAction : public RkAction
{
    Q_OBJECT
public:
    RkToolSnapAction() : RkAction(tr("Snap to Grid"), tr("Snap moves to the grid"))
    {
        setCheckable(true);
    }
};

// Tools keep their options widget only while its owner (the pane's widget stack) keeps it.
class RkUniversalTool : public RkViewTool
{
    Q_OBJECT
public:
    RkUniversalTool() : RkViewTool(QStringLiteral("Universal")) { setMenu(false); }

    QWidget* getOptionsWidget(QWidget* parent) override
    {
        if (!m_widget) {
            m_widget = new QWidget(parent);
            m_widget->setObjectName(QStringLiteral("UniversalOptions"));
            auto* layout = new QFormLayout(m_widget);
            auto* advanced = new QCheckBox(tr("Advanced Options"), m_widget);
            advanced->setObjectName(QStringLiteral("UniversalAdvanced"));
            advanced->setChecked(m_advanced);
            connect(advanced, &QCheckBox::toggled, this, &RkUniversalTool::setMenu);
            layout->addRow(advanced);
        }
        return m_widget;
    }

private:
    // The options menu grows by "Snap to Grid" while the advanced options are on.
    void setMenu(bool advanced)
    {
        m_advanced = advanced;
        auto* menu = new RkActionMenu;
        menu->insertAction(QStringLiteral("RkToolResetAction"));
        if (advanced) {
            menu->insertSeparator();
            menu->insertAction(QStringLiteral("RkToolSnapAction"));
        }
        setOptionsMenu(menu);
    }

    QPointer<QWidget> m_widget;
    bool m_advanced = false;
};

class RkTranslateTool : public RkViewTool
{
    Q_OBJECT
public:
    RkTranslateTool() : RkViewTool(QStringLiteral("Translate")) {}

    QWidget* getOptionsWidget(QWidget* parent) override
    {
        if (!m_widget) {
            m_widget = new QWidget(parent);
            m_widget->setObjectName(QStringLiteral("TranslateOptions"));
            auto* layout = new QFormLayout(m_widget);
            auto* step = new QDoubleSpinBox(m_widget);
            step->setObjectName(QStringLiteral("TranslateStep"));
            step->setRange(0.01, 100.0);
            step->setValue(1.0);
            layout->addRow(tr("Step"), step);
        }
        return m_widget;
    }

private:
    QPointer<QWidget> m_widget;
};

} // namespace

void rkAddDemoTools(RkViewportMgr* viewportMgr, RkActionMgr* actionMgr)
{
    actionMgr->addAction(new RkToolResetAction);
    actionMgr->addAction(new RkToolSnapAction);

    auto* universal = new RkUniversalTool;
    viewportMgr->addTool(universal);
    viewportMgr->addTool(new RkTranslateTool);
    viewportMgr->addTool(new RkViewTool(QStringLiteral("Orbit Camera")));
}

#include "rkdemotools.moc"
