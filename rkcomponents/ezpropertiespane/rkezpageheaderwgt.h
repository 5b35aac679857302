#pragma once

#include <QString>
#include <QWidget>

class QLabel;
class QPushButton;
class QSpinBox;
class RkEzPropertiesPage;

// The header of a Shape tab page: pager, paging text (image view) or total text (list view), a
// refresh button for the thumbnails and the two view mode buttons. The mode itself belongs to the
// pane; a click on a mode button is reported with modeButtonClicked().
class RkEzPageHeaderWgt : public QWidget
{
    Q_OBJECT
public:
    explicit RkEzPageHeaderWgt(RkEzPropertiesPage* page);
    ~RkEzPageHeaderWgt() override;

    QSpinBox* getPageSpin() const;
    QLabel* getPagingLabel() const;
    QLabel* getTotalLabel() const;
    QWidget* getPager() const;
    QPushButton* getPrevButton() const;
    QPushButton* getNextButton() const;
    QPushButton* getRefreshButton() const;
    QPushButton* getImageViewButton() const;
    QPushButton* getListViewButton() const;

Q_SIGNALS:
    void modeButtonClicked(int mode);

public Q_SLOTS:
    void setNumPages(int numPages);
    void setCurrentPage(int page);
    void setPagingText(QString text);
    void setTotalText(QString text);
    void setMode(int mode);
    void showPager(bool onOff);

private Q_SLOTS:
    void setModeFromClick(int mode);

protected:
    void changeEvent(QEvent* event) override;

private:
    void setIcons();

    RkEzPropertiesPage* m_page = nullptr;
    QWidget* m_pager = nullptr;
    QSpinBox* m_pageSpin = nullptr;
    QLabel* m_pagingLabel = nullptr;
    QLabel* m_totalLabel = nullptr;
    QPushButton* m_prevButton = nullptr;
    QPushButton* m_nextButton = nullptr;
    QPushButton* m_refreshButton = nullptr;
    QPushButton* m_imageViewButton = nullptr;
    QPushButton* m_listViewButton = nullptr;
};
