#pragma once

#include <QList>
#include <QVector>
#include <QWidget>

#include <memory>

class QHeaderView;
class RkEzPropertiesSlider;
class RkProperty;

// The shape pane's list view: one row per float property, a "Name" and a "Value" column under a
// header. The name column's width is shared by every list of the program: dragging it on one list
// changes the others when they are next shown; a double-click on its handle fits the longest name.
class RkEzPropertyListWgt : public QWidget
{
    Q_OBJECT
public:
    RkEzPropertyListWgt(QWidget* parent, QWidget* owner);
    ~RkEzPropertyListWgt() override;

    QWidget* getOwner() const;
    QHeaderView* getHeader() const;
    QList<RkEzPropertiesSlider*> getRows() const;

public Q_SLOTS:
    // Rows go later: one of them may be handling the event that led here.
    void clear();
    // Adds a row for each float property; others are skipped.
    void addProperties(QVector<RkProperty*> properties);
    void listHeadersResized(int logicalIndex, int oldSize, int newSize);
    void resizeListLabels(int width);
    void syncHeaderAndLabelSize();
    void headerHandleDoubleClicked(int logicalIndex);
    void autoResizeLabels();

protected:
    void showEvent(QShowEvent* event) override;

private:
    struct Private;
    std::unique_ptr<Private> d;
};
