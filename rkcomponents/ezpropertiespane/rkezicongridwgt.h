#pragma once

#include <QRect>
#include <QVector>
#include <QWidget>

#include <memory>

class QGridLayout;
class QTimer;
class RkEzPropertiesControl;
class RkEzPropertiesDragger;
class RkEzPropertiesPage;
class RkProperty;

// The image view of a property page: up to eight morph tiles in a 3 by 3 grid around the mixing
// handle in the centre cell. After the tiles are made it renders their thumbnails in the active
// 3D viewport, one per timer tick so the interface stays responsive in between; every change a
// render makes (the morph at full strength, the camera framing) is taken back through cancelled
// undo holds.
class RkEzIconGridWgt : public QWidget
{
    Q_OBJECT
public:
    // The page may be null (a grid on its own shows its set from the first property on).
    RkEzIconGridWgt(QWidget* parent, RkEzPropertiesPage* page);
    ~RkEzIconGridWgt() override;

    RkEzPropertiesPage* getPage() const;
    // The tiles in grid order; tiles deleted behind the grid's back are left out.
    QVector<RkEzPropertiesControl*> getTiles() const;
    RkEzPropertiesDragger* getDragger() const;
    // The thumbnail timer, for tests and benchmarks that watch or drive the making.
    QTimer* getTimer() const;

    // The index in the set of the first tile; addProperties() starts there. A grid on a page
    // follows the page's index; setFirst() serves a grid on its own.
    void setFirst(int first);
    int getFirst() const;

    // Operations of the mixing handle over the tiles, in grid order.
    void snapshotTileValues();
    void mixTilesAt(int x, int y);
    bool tileValuesChanged() const;
    // Where the handle's top-left corner may go: the grid's contents less the handle's size,
    // widened to every tile's top-left corner.
    QRect draggerBounds() const;

    QSize sizeHint() const override;
    QSize minimumSizeHint() const override;

public Q_SLOTS:
    void clear();
    void addProperties(QVector<RkProperty*> properties);
    void scheduleMakeImages();
    void cancelMakeImages();

protected Q_SLOTS:
    void makeImageTimeout();

protected:
    void showEvent(QShowEvent* event) override;
    void hideEvent(QHideEvent* event) override;
    void resizeEvent(QResizeEvent* event) override;

private:
    void placeDragger();

    struct Private;
    std::unique_ptr<Private> d;
};
