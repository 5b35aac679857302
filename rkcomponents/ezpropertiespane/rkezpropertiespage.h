#pragma once

#include <QFrame>
#include <QPointer>
#include <QVector>

class QStackedLayout;
class RkEzIconGridWgt;
class RkEzPageHeaderWgt;
class RkEzPropertiesWgt;
class RkEzPropertyListWgt;
class RkProperty;

// One set of morphs of the Shape tab, shown as pages of at most eight thumbnail tiles (image
// view) or as one list of sliders (list view), under a header with pager and mode buttons.
// The properties are watched, not owned: one deleted meanwhile is left out.
class RkEzPropertiesPage : public QFrame
{
    Q_OBJECT
public:
    explicit RkEzPropertiesPage(RkEzPropertiesWgt* owner);
    ~RkEzPropertiesPage() override;

    RkEzPropertiesWgt* getOwner() const;
    RkEzPageHeaderWgt* getHeader() const;
    RkEzIconGridWgt* getIconGrid() const;
    RkEzPropertyListWgt* getList() const;
    // The set shown, less the properties deleted since it was given.
    QVector<RkProperty*> getProperties() const;
    // Index in the set of the first tile of the current page.
    int getFirst() const;

    void setProperties(const QVector<RkProperty*>& properties);
    void setMode(int mode);

public Q_SLOTS:
    // Shows page number index, from 1.
    void gotoProperties(int index);
    void updateIconImages();

protected:
    void paintEvent(QPaintEvent* event) override;

private:
    RkEzPropertiesWgt* m_owner = nullptr;
    RkEzPageHeaderWgt* m_header = nullptr;
    RkEzIconGridWgt* m_iconGrid = nullptr;
    RkEzPropertyListWgt* m_list = nullptr;
    QStackedLayout* m_stack = nullptr;
    QVector<QPointer<RkProperty>> m_properties;
    int m_first = 0;
};
