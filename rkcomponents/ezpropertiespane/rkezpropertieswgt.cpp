#include "rkezpropertieswgt.h"

#include "properties/rkfloatproperty.h"
#include "properties/rkpropertygroup.h"
#include "properties/rkpropertygrouptree.h"
#include "rkdropdownview.h"
#include "rkezicongridwgt.h"
#include "rkezmixer.h"
#include "rkezmixers.h"
#include "rkezmixersetup.h"
#include "rkezmixerwgt.h"
#include "rkezpropertiescontrol.h"
#include "rkezpropertiespage.h"
#include "rkeztabbar.h"
#include "scene/rkbone.h"
#include "scene/rkscene.h"
#include "scene/rkskeleton.h"

#include <QCursor>
#include <QHBoxLayout>
#include <QLabel>
#include <QLineEdit>
#include <QMenu>
#include <QStackedLayout>
#include <QStandardItemModel>
#include <QTimer>
#include <QVBoxLayout>

namespace
{

constexpr int kSelectionDelayMs = 20;
constexpr int kPathRole = Qt::UserRole + 1;

// The primary selection last reported, shared by every Shape tab. Guarded: a node deleted and a
// new one made at the same address must not pass for the same selection.
QPointer<RkNode> s_lastPrimarySelection;

bool isSkippedCategory(const RkPropertyGroup* group)
{
    const QString name = group->getName();
    return name == QLatin1String("General") || name == QLatin1String("Deformers");
}

bool isShownMorph(RkProperty* property)
{
    return property && !property->isHidden() && qobject_cast<RkFloatProperty*>(property);
}

QVector<RkProperty*> ownMorphs(const RkPropertyGroup* group)
{
    QVector<RkProperty*> list;
    for (int i = 0; i < group->getNumProperties(); ++i) {
        if (isShownMorph(group->getProperty(i)))
            list.append(group->getProperty(i));
    }
    return list;
}

bool hasOwnMorph(const RkPropertyGroup* group)
{
    for (int i = 0; i < group->getNumProperties(); ++i) {
        if (isShownMorph(group->getProperty(i)))
            return true;
    }
    return false;
}

// The morphs of the groups from first on and everything below them whose label contains the
// text, the categories the chooser never offers left out.
void collectMatches(const RkPropertyGroup* first, const QString& text, QVector<RkProperty*>& out)
{
    for (const RkPropertyGroup* group = first; group; group = group->getNextSibling()) {
        if (isSkippedCategory(group))
            continue;
        for (RkProperty* property : ownMorphs(group)) {
            if (property->getLabel().contains(text, Qt::CaseInsensitive))
                out.append(property);
        }
        collectMatches(group->getFirstChild(), text, out);
    }
}

} // namespace

struct RkEzPropertiesWgt::Private {
    QTimer* timer = nullptr;
    bool timerUnblocked = false;
    RkDropDownView* categoryView = nullptr;
    QStandardItemModel* categoryModel = nullptr;
    QLineEdit* filterEdit = nullptr;
    RkEzTabBar* upperTabs = nullptr;
    QStackedLayout* stack = nullptr;
    RkEzTabBar* lowerTabs = nullptr;
    // The mixer page whose tab opened the context menu; a rebuild meanwhile may take it.
    QPointer<RkEzMixerWgt> menuPage;
    // One menu for every mixer tab, made when first wanted.
    QMenu* tabMenu = nullptr;
    RkEzPropertiesPage* firstPage = nullptr;
    QVector<RkEzPropertiesPage*> pages;
    QVector<RkEzMixerWgt*> mixerPages;
    QPointer<RkEzMixers> mixers;
    bool hasOwnTab = true;
    QPointer<RkNode> figure;
    QPointer<RkNode> lastNode;
    // The node shown (or its figure) left the scene: the next run rebuilds even for the same
    // (now empty) selection.
    bool shownNodeGone = false;
    QString categoryPath;
    int mode = 0;
    int rebuildCount = 0;
};

RkEzPropertiesWgt::RkEzPropertiesWgt(QWidget* parent)
    : QWidget(parent), d(std::make_unique<Private>())
{
    setObjectName(QStringLiteral("ShapeProperties"));
    d->timer = new QTimer(this);
    d->timer->setSingleShot(true);

    auto* layout = new QVBoxLayout(this);
    d->categoryView = new RkDropDownView(this);
    d->categoryModel = new QStandardItemModel(this);
    d->categoryView->setModel(d->categoryModel);

    auto* chooser = new QHBoxLayout;
    chooser->setContentsMargins(0, 0, 0, 0);
    chooser->addWidget(new QLabel(QStringLiteral("Select Morph Set:"), this), 0,
                       Qt::AlignLeft | Qt::AlignTop);
    chooser->addWidget(d->categoryView, 0);
    d->filterEdit = new QLineEdit(this);
    d->filterEdit->setPlaceholderText(QStringLiteral("Filter morphs"));
    // No clear button: its fade animation leaks when the field goes while it runs.
    d->filterEdit->setClearButtonEnabled(false);
    chooser->addWidget(d->filterEdit, 0, Qt::AlignTop);
    layout->addLayout(chooser, 0);

    d->upperTabs = new RkEzTabBar(this);
    d->upperTabs->setUsesScrollButtons(true);
    d->stack = new QStackedLayout;
    d->firstPage = new RkEzPropertiesPage(this);
    d->stack->addWidget(d->firstPage);
    d->stack->addWidget(new QWidget(this));
    d->pages.append(d->firstPage);

    d->lowerTabs = new RkEzTabBar(this);
    d->lowerTabs->setUsesScrollButtons(true);
    d->lowerTabs->setShape(QTabBar::RoundedSouth);
    d->lowerTabs->setContextMenuPolicy(Qt::CustomContextMenu);

    d->upperTabs->addTab(QStringLiteral("Foo"));
    d->lowerTabs->addTab(QStringLiteral("+"));

    auto* tabs = new QVBoxLayout;
    tabs->setContentsMargins(0, 0, 0, 0);
    tabs->setSpacing(0);
    tabs->addWidget(d->upperTabs, 0);
    tabs->addLayout(d->stack, 0);
    tabs->addWidget(d->lowerTabs, 0);
    layout->addLayout(tabs, 100);

    connect(d->upperTabs, &QTabBar::currentChanged, this, &RkEzPropertiesWgt::upperTabChanged);
    connect(d->lowerTabs, &QTabBar::currentChanged, this, &RkEzPropertiesWgt::lowerTabChanged);
    connect(d->lowerTabs, &QWidget::customContextMenuRequested, this,
            &RkEzPropertiesWgt::lowerTabContextMenu);
    connect(rkScene, &RkScene::sceneClearStarting, this, &RkEzPropertiesWgt::blockTimer);
    connect(rkScene, &RkScene::sceneCleared, this, &RkEzPropertiesWgt::unblockTimer);
    connect(rkScene, &RkScene::sceneLoadStarting, this, &RkEzPropertiesWgt::blockTimer);
    connect(rkScene, &RkScene::sceneLoaded, this, &RkEzPropertiesWgt::unblockTimer);
    connect(rkScene, &RkScene::primarySelectionChanged, this,
            &RkEzPropertiesWgt::primarySelectionChanged);
    connect(d->categoryView, &QAbstractItemView::activated, this,
            &RkEzPropertiesWgt::viewActivated);
    connect(d->filterEdit, &QLineEdit::textChanged, this, &RkEzPropertiesWgt::filterChanged);
    setMode(d->mode);
}

RkEzPropertiesWgt::~RkEzPropertiesWgt()
{
    d->timer->stop();
}

int RkEzPropertiesWgt::getMode() const
{
    return d->mode;
}

RkDropDownView* RkEzPropertiesWgt::getCategoryView() const
{
    return d->categoryView;
}

QStandardItemModel* RkEzPropertiesWgt::getCategoryModel() const
{
    return d->categoryModel;
}

QLineEdit* RkEzPropertiesWgt::getFilterEdit() const
{
    return d->filterEdit;
}

RkEzTabBar* RkEzPropertiesWgt::getUpperTabs() const
{
    return d->upperTabs;
}

RkEzTabBar* RkEzPropertiesWgt::getLowerTabs() const
{
    return d->lowerTabs;
}

QStackedLayout* RkEzPropertiesWgt::getStack() const
{
    return d->stack;
}

QVector<RkEzPropertiesPage*> RkEzPropertiesWgt::getPages() const
{
    return d->pages;
}

QVector<RkEzMixerWgt*> RkEzPropertiesWgt::getMixerPages() const
{
    return d->mixerPages;
}

RkEzPropertiesPage* RkEzPropertiesWgt::getCurrentPage() const
{
    return qobject_cast<RkEzPropertiesPage*>(d->stack->currentWidget());
}

RkNode* RkEzPropertiesWgt::getFigure() const
{
    return d->figure;
}

int RkEzPropertiesWgt::getRebuildCount() const
{
    return d->rebuildCount;
}

void RkEzPropertiesWgt::setMode(int mode)
{
    d->mode = mode;
    d->lowerTabs->setVisible(mode == 0);
    for (RkEzPropertiesPage* page : qAsConst(d->pages))
        page->setMode(mode);
}

void RkEzPropertiesWgt::primarySelectionChanged(RkNode* node)
{
    if (node != s_lastPrimarySelection.data()) {
        s_lastPrimarySelection = node;
        startTimer();
    }
    for (RkEzPropertiesPage* page : qAsConst(d->pages))
        page->getIconGrid()->cancelMakeImages();
}

void RkEzPropertiesWgt::startTimer()
{
    d->timer->stop();
    d->timer->start(kSelectionDelayMs);
}

void RkEzPropertiesWgt::timeoutTimer()
{
    RkNode* node = rkScene->getPrimarySelection();
    if (node == d->lastNode.data() && !d->shownNodeGone)
        return;
    const bool figureGone = d->shownNodeGone;
    d->shownNodeGone = false;
    d->lastNode = node;
    watchShownNode(node);
    ++d->rebuildCount;
    d->categoryModel->clear();
    if (node && node->getPropertyGroups())
        buildCategoryItems(node->getPropertyGroups()->getFirstChild(),
                           d->categoryModel->invisibleRootItem());
    // The chooser reports its new root only when its first level changes; an empty model after
    // an empty model would leave pages of a figure that is gone.
    if (d->categoryModel->rowCount() == 0)
        showCategory(QString());

    RkNode* newFigure = node;
    if (qobject_cast<RkBone*>(node))
        newFigure = node->getSkeleton();
    if (newFigure == d->figure.data() && !figureGone)
        return;
    rebuildMixerPages(newFigure);
}

void RkEzPropertiesWgt::watchShownNode(RkNode* node)
{
    if (!node)
        return;
    connect(node, &QObject::destroyed, this, &RkEzPropertiesWgt::shownNodeDestroyed,
            Qt::UniqueConnection);
    if (RkNode* skeleton = node->getSkeleton())
        connect(skeleton, &QObject::destroyed, this, &RkEzPropertiesWgt::shownNodeDestroyed,
                Qt::UniqueConnection);
}

void RkEzPropertiesWgt::shownNodeDestroyed()
{
    // Pages drop the morphs that went with the node by themselves; the rebuild empties the
    // chooser and the mixer pages. While a load or clear runs, its end starts the timer.
    d->shownNodeGone = true;
    startTimer();
}

void RkEzPropertiesWgt::rebuildMixerPages(RkNode* newFigure)
{
    const QSignalBlocker blocker(d->lowerTabs);
    for (int j = d->mixerPages.size() - 1; j >= 0; --j) {
        RkEzMixerWgt* page = d->mixerPages[j];
        d->stack->removeWidget(page);
        page->hide();
        page->deleteLater();
    }
    for (int t = d->lowerTabs->count() - 2; t >= 0; --t)
        d->lowerTabs->removeTab(t);
    d->mixerPages.clear();
    d->figure = newFigure;
    d->mixers = RkEzMixerSetup::findMixers(newFigure);
    if (d->mixers) {
        for (RkEzMixer* mixer : d->mixers->getMixers()) {
            auto* page = new RkEzMixerWgt(this, mixer);
            d->mixerPages.append(page);
            const int n = d->mixerPages.size();
            d->stack->insertWidget(d->pages.size() + n - 1, page);
            d->lowerTabs->insertTab(n - 1, RkEzMixerSetup::tabText(n));
        }
    }
}

bool RkEzPropertiesWgt::buildCategoryItems(RkPropertyGroup* first, QStandardItem* parent)
{
    bool kept = false;
    for (RkPropertyGroup* group = first; group; group = group->getNextSibling()) {
        if (isSkippedCategory(group))
            continue;
        auto* item = new QStandardItem(group->getName());
        item->setData(group->getPath(), kPathRole);
        const bool own = hasOwnMorph(group);
        if (buildCategoryItems(group->getFirstChild(), item) || own) {
            parent->appendRow(item);
            kept = true;
        } else {
            delete item;
        }
    }
    return kept;
}

void RkEzPropertiesWgt::blockTimer()
{
    if (!d->timerUnblocked)
        return;
    d->timerUnblocked = false;
    disconnect(d->timer, &QTimer::timeout, this, &RkEzPropertiesWgt::timeoutTimer);
    d->timer->stop();
}

void RkEzPropertiesWgt::unblockTimer()
{
    if (!d->timerUnblocked) {
        d->timerUnblocked = true;
        connect(d->timer, &QTimer::timeout, this, &RkEzPropertiesWgt::timeoutTimer);
    }
    startTimer();
}

void RkEzPropertiesWgt::viewActivated(QModelIndex index)
{
    d->upperTabs->setCurrentIndex(0);
    showCategory(d->categoryModel->data(index, kPathRole).toString());
}

void RkEzPropertiesWgt::filterChanged()
{
    showCategory(d->categoryPath);
}

void RkEzPropertiesWgt::showCategory(const QString& path)
{
    d->categoryPath = path;
    const QString filter = d->filterEdit->text();
    QVector<RkProperty*> ownList;
    QString ownName;
    {
        const QSignalBlocker upperBlocker(d->upperTabs);
        const QSignalBlocker lowerBlocker(d->lowerTabs);
        if (!d->hasOwnTab)
            d->upperTabs->insertTab(0, QString());
        for (int k = d->pages.size() - 1; k >= 1; --k) {
            d->upperTabs->removeTab(k);
            d->stack->removeWidget(d->pages[k]);
            d->pages[k]->hide();
            d->pages[k]->deleteLater();
        }
        d->pages.resize(1);

        bool anyChild = false;
        RkNode* node = rkScene->getPrimarySelection();
        RkPropertyGroupTree* tree = node ? node->getPropertyGroups() : nullptr;
        if (tree) {
            RkPropertyGroup* start = tree->getFirstChild();
            if (RkPropertyGroup* group = path.isEmpty() ? nullptr : tree->findChild(path)) {
                ownName = group->getName();
                start = group->getFirstChild();
                if (filter.isEmpty()) {
                    ownList = ownMorphs(group);
                } else {
                    for (RkProperty* property : ownMorphs(group)) {
                        if (property->getLabel().contains(filter, Qt::CaseInsensitive))
                            ownList.append(property);
                    }
                    collectMatches(group->getFirstChild(), filter, ownList);
                }
            } else if (!filter.isEmpty()) {
                collectMatches(start, filter, ownList);
            }
            // With a filter everything found is on the first page; no other tabs.
            for (RkPropertyGroup* child = start; child && filter.isEmpty();
                 child = child->getNextSibling()) {
                const QVector<RkProperty*> list = ownMorphs(child);
                if (list.isEmpty())
                    continue;
                auto* page = new RkEzPropertiesPage(this);
                d->stack->insertWidget(d->pages.size(), page);
                d->upperTabs->addTab(child->getName());
                page->setProperties(list);
                d->pages.append(page);
                anyChild = true;
            }
        }
        d->hasOwnTab = true;
        d->upperTabs->setTabText(0, ownName);
        d->firstPage->setProperties(ownList);
        if (anyChild && ownList.isEmpty()) {
            d->hasOwnTab = false;
            d->upperTabs->removeTab(0);
        }
    }
    d->upperTabs->setCurrentIndex(0);
    upperTabChanged(0);
    updateGeometry();
    update();
}

void RkEzPropertiesWgt::upperTabChanged(int index)
{
    if (index == -1)
        return;
    const int p = d->hasOwnTab ? index : index + 1;
    if (p < 0 || p >= d->pages.size())
        return;
    d->stack->setCurrentIndex(p);
    if (!d->lowerTabs->isActive() || d->lowerTabs->QTabBar::currentIndex() == -1)
        d->pages[p]->getIconGrid()->scheduleMakeImages();
    d->lowerTabs->setCurrentIndex(-1);
}

RkEzMixerWgt* RkEzPropertiesWgt::addMixerPage()
{
    RkEzMixer* mixer = RkEzMixerSetup::addMixer(d->figure);
    if (!mixer)
        return nullptr;
    d->mixers = RkEzMixerSetup::findMixers(d->figure);
    auto* page = new RkEzMixerWgt(this, mixer);
    d->mixerPages.append(page);
    const int n = d->mixerPages.size();
    d->stack->insertWidget(d->pages.size() + n - 1, page);
    const QSignalBlocker blocker(d->lowerTabs);
    d->lowerTabs->insertTab(n - 1, RkEzMixerSetup::tabText(n));
    return page;
}

void RkEzPropertiesWgt::lowerTabChanged(int index)
{
    if (index == -1)
        return;
    if (index == d->mixerPages.size() && d->figure) {
        if (addMixerPage()) {
            // The insertion moved "+" on; selecting the new tab shows it.
            d->lowerTabs->setCurrentIndex(d->mixerPages.size() - 1);
            if (d->stack->currentIndex() != d->pages.size() + d->mixerPages.size() - 1) {
                d->stack->setCurrentIndex(d->pages.size() + d->mixerPages.size() - 1);
                d->upperTabs->setCurrentIndex(-1);
            }
            return;
        }
    }
    d->stack->setCurrentIndex(d->pages.size() + index);
    d->upperTabs->setCurrentIndex(-1);
}

void RkEzPropertiesWgt::lowerTabContextMenu(const QPoint& pos)
{
    const int t = d->lowerTabs->tabAt(pos);
    if (t < 0 || t >= d->lowerTabs->count() - 1 || t >= d->mixerPages.size())
        return;
    d->lowerTabs->setCurrentIndex(t);
    d->menuPage = d->mixerPages[t];
    if (!d->tabMenu) {
        d->tabMenu = new QMenu(this);
        d->tabMenu->addAction(QStringLiteral("Delete"), this, &RkEzPropertiesWgt::lowerTabRemove);
    }
    d->tabMenu->popup(QCursor::pos());
}

void RkEzPropertiesWgt::lowerTabRemove()
{
    RkEzMixerWgt* page = d->menuPage;
    d->menuPage = nullptr;
    const int t = page ? d->mixerPages.indexOf(page) : -1;
    if (t < 0)
        return;
    d->stack->removeWidget(page);
    page->hide();
    page->deleteLater();
    d->mixerPages.remove(t);
    if (d->mixers && page->getMixer())
        d->mixers->removeMixer(page->getMixer());
    d->lowerTabs->removeTab(t);
    if (d->lowerTabs->count() > 1)
        d->lowerTabs->setCurrentIndex(t > 0 ? t - 1 : -1);
}

void RkEzPropertiesWgt::addControlToMixer(RkEzPropertiesControl* tile)
{
    if (!tile || !tile->getProperty())
        return;
    const int plus = d->lowerTabs->count() - 1;
    int m;
    if (plus == 0 || (d->lowerTabs->isActive() && d->lowerTabs->QTabBar::currentIndex() == plus))
        m = 0;
    else
        m = std::max(0, d->lowerTabs->QTabBar::currentIndex());
    const int u = d->upperTabs->currentIndex();
    d->lowerTabs->setCurrentIndex(m);
    // A bar that already had "+" selected reports nothing; the mixer is still wanted.
    if (m >= d->mixerPages.size())
        lowerTabChanged(m);
    if (m < d->mixerPages.size()) {
        RkEzMixerWgt* page = d->mixerPages[m];
        if (RkEzMixerControl* control =
                RkEzMixerSetup::addControl(page->getMixer(), tile->getProperty(), tile->getImage()))
            page->addControlWgt(control);
    }
    if (u != -1)
        d->upperTabs->setCurrentIndex(u);
}
