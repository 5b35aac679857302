#pragma once

#include <QTreeWidget>

// A host list built from the scene: rebuilt once after nodes come or go (and once at the end of a
// load or clear), with its items marked as selected in the palette's highlight colours.
class RkSceneTreeList : public QTreeWidget
{
    Q_OBJECT
public:
    RkSceneTreeList(QWidget* parent, const QString& name);
    ~RkSceneTreeList() override;

protected:
    // Fills the list from the scene; the subclass also calls it at the end of its constructor.
    virtual void rebuild() = 0;
    void scheduleRebuild();
    static void markSelected(QTreeWidgetItem* item, bool on, const QPalette& palette);

private:
    bool m_rebuildPending = false;
    bool m_blocked = false;
};
