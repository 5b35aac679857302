#include "app/rkmainwindow.h"
#include "cdropbutton.h"
#include "demo/rkdemoscene.h"
#include "plugin/rkpluginmgr.h"
#include "properties/rkfloatproperty.h"
#include "render/rk3dviewport.h"
#include "rkcomponentsplugin.h"
#include "rkdropdownview.h"
#include "rkezicongridwgt.h"
#include "rkezmixer.h"
#include "rkezmixercontrol.h"
#include "rkezmixerdriver.h"
#include "rkezmixers.h"
#include "rkezmixersetup.h"
#include "rkezmixerwgt.h"
#include "rkezpageheaderwgt.h"
#include "rkezpropertiescontrol.h"
#include "rkezpropertiespage.h"
#include "rkezpropertiespane.h"
#include "rkezpropertieswgt.h"
#include "rkeztabbar.h"
#include "rktestmain.h"
#include "scene/rkbone.h"
#include "scene/rkscene.h"
#include "scene/rkskeleton.h"
#include "undo/rkundostack.h"

#include <QComboBox>
#include <QFile>
#include <QLabel>
#include <QLineEdit>
#include <QMenu>
#include <QMimeData>
#include <QPushButton>
#include <QSpinBox>
#include <QStackedLayout>
#include <QStandardItemModel>
#include <QTemporaryDir>
#include <QWindow>
#include <QtEndian>

namespace
{

QStringList modelTexts(const QStandardItemModel* model, const QModelIndex& parent = QModelIndex())
{
    QStringList texts;
    for (int r = 0; r < model->rowCount(parent); ++r) {
        const QModelIndex index = model->index(r, 0, parent);
        texts << index.data().toString() << modelTexts(model, index);
    }
    return texts;
}

QStringList labelsOf(const QVector<RkProperty*>& properties)
{
    QStringList labels;
    for (const RkProperty* p : properties)
        labels << p->getLabel();
    return labels;
}

QStringList tabTexts(const QTabBar* bar)
{
    QStringList texts;
    for (int i = 0; i < bar->count(); ++i)
        texts << bar->tabText(i);
    return texts;
}

RkFloatProperty* addMorph(RkNode* node, const QString& name, const QString& group)
{
    auto* p = new RkFloatProperty(name, name);
    node->addProperty(p, group);
    return p;
}

// A figure that always lives at the same address: one deleted and the next one made share it, as
// the allocator may arrange for any two nodes.
class SameSpotFigure : public RkSkeleton
{
public:
    static void* operator new(size_t size)
    {
        Q_ASSERT(size <= sizeof(s_spot) && !s_taken);
        s_taken = true;
        return &s_spot;
    }
    static void operator delete(void*) { s_taken = false; }

private:
    alignas(std::max_align_t) static unsigned char s_spot[sizeof(RkSkeleton) + 64];
    static bool s_taken;
};
alignas(std::max_align_t) unsigned char SameSpotFigure::s_spot[sizeof(RkSkeleton) + 64];
bool SameSpotFigure::s_taken = false;

// One record of a scene file: class name, the raw bytes after its length, and per section its id
// and the tags of its values in order.
struct StoredRecord {
    QString className;
    QByteArray bytes;
    QVector<QPair<int, QByteArray>> sections;
};

template <typename T> T takeLE(const QByteArray& data, int& pos)
{
    const T value = qFromLittleEndian<T>(data.constData() + pos);
    pos += int(sizeof(T));
    return value;
}

QString takeString(const QByteArray& data, int& pos)
{
    const int n = int(takeLE<quint32>(data, pos));
    const QString s = QString::fromUtf8(data.mid(pos, n));
    pos += n;
    return s;
}

QVector<StoredRecord> readRecords(const QByteArray& file)
{
    QVector<StoredRecord> records;
    int pos = 24;
    while (pos + 4 <= file.size()) {
        const int length = int(takeLE<quint32>(file, pos));
        StoredRecord record;
        record.bytes = file.mid(pos, length);
        const int end = pos + length;
        takeString(file, pos);
        record.className = takeString(file, pos);
        takeString(file, pos);
        const int sections = int(takeLE<quint32>(file, pos));
        for (int k = 0; k < sections; ++k) {
            const int id = takeLE<quint16>(file, pos);
            const int payloadEnd = int(takeLE<quint32>(file, pos)) + pos;
            QByteArray tags;
            while (pos < payloadEnd) {
                const char tag = file.at(pos++);
                tags.append(tag);
                if (tag == 1 || tag == 2)
                    pos += 4;
                else if (tag == 3)
                    pos += 8;
                else if (tag == 4)
                    pos += 1;
                else if (tag == 5 || tag == 6)
                    pos += int(takeLE<quint32>(file, pos));
                else if (tag == 7 && file.at(pos) == 2)
                    pos += 7, takeString(file, pos);
                else if (tag == 7)
                    pos += 7;
            }
            record.sections.append({id, tags});
        }
        pos = end;
        records.append(record);
    }
    return records;
}

} // namespace

class TestRkEzPropertiesPane : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void initTestCase();
    void init();
    void cleanup();
    void selectionIsCoalescedAndWaitsForLoads();
    void categoriesSkipGeneralAndDeformers();
    void pagingTexts();
    void droppedTilesFillMixers();
    void bonesKeepMixersAndTabsReselect();
    void figureLeavingTheSceneRebuilds();
    void newNodeAtTheSameAddressRebuilds();
    void deleteFromAStaleMenuDoesNothing();
    void filterFindsMorphsByLabel();
    void switchingCategoriesLeavesNoWidgets();
    void storedMixerForm();
    void droppedMixerDrivesAcrossSaveAndOpen();

private:
    RkEzPropertiesWgt* wgt() const { return m_pane->getPropertiesWgt(); }
    QComboBox* comboAt(int level) const;
    void choose(int level, const QString& text);
    void drop(RkEzPropertiesControl* tile);

    std::unique_ptr<RkMainWindow> m_window;
    std::unique_ptr<RkEzPropertiesPane> m_pane;
    RkSkeleton* m_figure = nullptr;
};

void TestRkEzPropertiesPane::initTestCase()
{
    rkApp->getPluginMgr()->addPlugin(rkComponentsPlugin());
}

void TestRkEzPropertiesPane::init()
{
    rkScene->clear();
    m_window = rkMakeTestMainWindow();
    m_window->setSceneWidget(new Rk3DViewport);
    m_window->show();
    QVERIFY(QTest::qWaitForWindowExposed(m_window.get()));
    m_pane = std::make_unique<RkEzPropertiesPane>();
    m_pane->resize(420, 760);
    m_pane->show();
    QVERIFY(QTest::qWaitForWindowExposed(m_pane.get()));
    // The tab starts quiet until the scene is first cleared or loaded.
    rkScene->clear();
    m_figure = rkBuildDemoScene(rkScene);
    rkScene->selectNode(m_figure);
    QTRY_COMPARE(wgt()->getFigure(), static_cast<RkNode*>(m_figure));
    QTRY_VERIFY(wgt()->getCategoryModel()->rowCount() > 0);
    // The chooser lays its first level out on the view's own delayed layout.
    QTRY_VERIFY(comboAt(0));
}

void TestRkEzPropertiesPane::cleanup()
{
    m_pane.reset();
    m_window.reset();
    QCoreApplication::sendPostedEvents(nullptr, QEvent::DeferredDelete);
    rkUndoStack->clear();
    rkScene->clear();
}

QComboBox* TestRkEzPropertiesPane::comboAt(int level) const
{
    // Levels that were dropped stay hidden until the event loop takes them.
    QList<QComboBox*> shown;
    for (QComboBox* combo : wgt()->getCategoryView()->findChildren<QComboBox*>()) {
        if (combo->isVisible())
            shown << combo;
    }
    return shown.value(level);
}

void TestRkEzPropertiesPane::choose(int level, const QString& text)
{
    QComboBox* combo = nullptr;
    QTRY_VERIFY((combo = comboAt(level)) != nullptr);
    const int i = combo->findText(text);
    QVERIFY2(i >= 0, qPrintable(text));
    combo->setCurrentIndex(i);
}

void TestRkEzPropertiesPane::drop(RkEzPropertiesControl* tile)
{
    // A real drag is modal; the drop target sees what it would: the tile's label as "text".
    auto* button = wgt()->getCurrentPage()->findChild<CDropButton*>();
    QVERIFY(button);
    QMimeData mime;
    mime.setData(QStringLiteral("text"), tile->getProperty()->getLabel().toLatin1());
    const QPoint at = button->rect().center();
    QDragEnterEvent enter(at, Qt::CopyAction, &mime, Qt::LeftButton, Qt::NoModifier);
    QApplication::sendEvent(button, &enter);
    QVERIFY(enter.isAccepted());
    QDropEvent dropEvent(at, Qt::CopyAction, &mime, Qt::LeftButton, Qt::NoModifier);
    QApplication::sendEvent(button, &dropEvent);
    QVERIFY(dropEvent.isAccepted());
}

void TestRkEzPropertiesPane::selectionIsCoalescedAndWaitsForLoads()
{
    RkNode* ball = rkScene->findNode(QLatin1String(RkDemoPropName));
    QVERIFY(ball);
    const int before = wgt()->getRebuildCount();
    rkScene->selectNode(ball);
    rkScene->selectNode(m_figure);
    rkScene->selectNode(ball);
    QTRY_COMPARE(wgt()->getRebuildCount(), before + 1);
    QTest::qWait(60);
    QCOMPARE(wgt()->getRebuildCount(), before + 1);
    // The node already handled gives none.
    rkScene->selectNode(m_figure);
    rkScene->selectNode(ball);
    QTest::qWait(60);
    QCOMPARE(wgt()->getRebuildCount(), before + 1);

    // A load that selects nodes and lets the event loop run meanwhile rebuilds once, at its end.
    QTemporaryDir dir;
    const QString path = dir.filePath(QStringLiteral("scene.rks"));
    QVERIFY(rkScene->save(path));
    int duringLoad = -1;
    auto added = connect(rkScene, &RkScene::nodeAdded, this, [&](RkNode* node) {
        rkScene->selectNode(node);
        QTest::qWait(40);
    });
    auto loaded = connect(rkScene, &RkScene::sceneLoaded, this,
                          [&] { duringLoad = wgt()->getRebuildCount(); });
    const int beforeLoad = wgt()->getRebuildCount();
    QVERIFY(rkScene->load(path));
    disconnect(added);
    disconnect(loaded);
    QCOMPARE(duringLoad, beforeLoad);
    QTRY_COMPARE(wgt()->getRebuildCount(), beforeLoad + 1);
    QTest::qWait(60);
    QCOMPARE(wgt()->getRebuildCount(), beforeLoad + 1);
}

void TestRkEzPropertiesPane::categoriesSkipGeneralAndDeformers()
{
    addMorph(m_figure, QStringLiteral("Hidden1"), QStringLiteral("Morphs/Head/Deformers"));
    addMorph(m_figure, QStringLiteral("Hidden2"), QStringLiteral("Morphs/General/Inner"));
    addMorph(m_figure, QStringLiteral("Shown"), QStringLiteral("Morphs/Extra/General2"));
    rkScene->clearSelection();
    QTRY_COMPARE(wgt()->getCategoryModel()->rowCount(), 0);
    rkScene->selectNode(m_figure);
    QTRY_VERIFY(wgt()->getCategoryModel()->rowCount() > 0);
    const QStringList texts = modelTexts(wgt()->getCategoryModel());
    QVERIFY(!texts.contains(QStringLiteral("General")));
    QVERIFY(!texts.contains(QStringLiteral("Deformers")));
    QVERIFY(!texts.contains(QStringLiteral("Inner")));
    for (const char* expected : {"Morphs", "Head", "Face", "Ears", "Body", "Arms", "Legs", "Extra",
                                 "General2", "Transforms"})
        QVERIFY2(texts.contains(QLatin1String(expected)), expected);
    // Top-level groups of those names still become tabs when nothing is chosen.
    QVERIFY(!tabTexts(wgt()->getUpperTabs()).contains(QStringLiteral("General")));
    addMorph(m_figure, QStringLiteral("Top"), QStringLiteral("General"));
    wgt()->getCategoryView()->reset();
    QTRY_VERIFY(tabTexts(wgt()->getUpperTabs()).contains(QStringLiteral("General")));
    QVERIFY(!modelTexts(wgt()->getCategoryModel()).contains(QStringLiteral("General")));
}

void TestRkEzPropertiesPane::pagingTexts()
{
    // "Head" has three morphs of its own; its children "Face" and "Ears" are tabs beside it.
    choose(0, QStringLiteral("Morphs"));
    choose(1, QStringLiteral("Head"));
    QTRY_COMPARE(tabTexts(wgt()->getUpperTabs()), QStringList({"Head", "Face", "Ears"}));

    RkEzPropertiesPage* page = wgt()->getPages()[0];
    RkEzPageHeaderWgt* header = page->getHeader();
    QVector<RkProperty*> set;
    for (int i = 0; i < 9; ++i)
        set << addMorph(m_figure, QStringLiteral("M%1").arg(i), QStringLiteral("Extra"));

    page->setProperties({});
    QCOMPARE(header->getPagingLabel()->text(), QStringLiteral("Navigate above."));
    QCOMPARE(header->getTotalLabel()->text(), QStringLiteral("Navigate above."));
    QVERIFY(!header->getPager()->isVisible());

    page->setProperties(set.mid(0, 8));
    QCOMPARE(header->getPagingLabel()->text(), QStringLiteral("1-8 of 8"));
    QCOMPARE(header->getPageSpin()->maximum(), 1);
    QCOMPARE(page->getIconGrid()->getTiles().size(), 8);

    page->setProperties(set);
    QCOMPARE(header->getPagingLabel()->text(), QStringLiteral("1-8 of 9"));
    QTest::mouseClick(header->getNextButton(), Qt::LeftButton);
    QCOMPARE(header->getPagingLabel()->text(), QStringLiteral("9-9 of 9"));
    QCOMPARE(page->getIconGrid()->getTiles().size(), 1);
    QCOMPARE(page->getIconGrid()->getTiles()[0]->getProperty(), set[8]);
    QTest::mouseClick(header->getNextButton(), Qt::LeftButton);
    QCOMPARE(header->getPagingLabel()->text(), QStringLiteral("9-9 of 9"));

    // The list view button of one page switches every page and hides the mixer tabs.
    QTest::mouseClick(header->getListViewButton(), Qt::LeftButton);
    QCOMPARE(wgt()->getMode(), 1);
    QVERIFY(!wgt()->getLowerTabs()->isVisible());
    QCOMPARE(header->getTotalLabel()->text(), QStringLiteral("9 sliders in this tab"));
    QVERIFY(wgt()->getPages()[1]->getHeader()->getListViewButton()->isChecked());
    QTest::mouseClick(header->getImageViewButton(), Qt::LeftButton);
    QVERIFY(wgt()->getLowerTabs()->isVisible());

    rkScene->clearSelection();
    page->setProperties({});
    QCOMPARE(header->getPagingLabel()->text(), QStringLiteral("Select something."));
}

void TestRkEzPropertiesPane::droppedTilesFillMixers()
{
    QCOMPARE(tabTexts(wgt()->getLowerTabs()), QStringList({"+"}));
    const QVector<RkEzPropertiesControl*> tiles =
        wgt()->getCurrentPage()->getIconGrid()->getTiles();
    QVERIFY(!tiles.isEmpty());
    drop(tiles[0]);
    QCOMPARE(tabTexts(wgt()->getLowerTabs()), QStringList({"Mixer 1", "+"}));
    RkEzMixers* mixers = RkEzMixerSetup::findMixers(m_figure);
    QVERIFY(mixers);
    QCOMPARE(mixers->getMixers().size(), 1);
    RkEzMixer* mixer = mixers->getMixers()[0];
    QCOMPARE(mixer->getControls().size(), 1);
    QCOMPARE(mixer->getControls()[0]->getControlProperty(), tiles[0]->getProperty());
    // The user stays on the page the tile came from.
    QCOMPARE(wgt()->getUpperTabs()->currentIndex(), 0);
    QCOMPARE(wgt()->getMixerPages()[0]->getControlWgts().size(), 1);

    for (int i = 1; i < 9; ++i)
        drop(tiles[i % tiles.size()]);
    QCOMPARE(mixers->getMixers().size(), 1);
    QCOMPARE(mixer->getControls().size(), 9);
    QCOMPARE(QPoint(mixer->getControls()[8]->getX(), mixer->getControls()[8]->getY()),
             QPoint(105, 42));
    QCOMPARE(QPoint(mixer->getControls()[1]->getX(), mixer->getControls()[1]->getY()),
             QPoint(168, 127));
}

void TestRkEzPropertiesPane::bonesKeepMixersAndTabsReselect()
{
    drop(wgt()->getCurrentPage()->getIconGrid()->getTiles().value(0));
    QPointer<RkEzMixerWgt> page = wgt()->getMixerPages().value(0);
    QVERIFY(page);
    for (RkBone* bone : {m_figure->findBone("chest"), m_figure->findBone("neck")}) {
        QVERIFY(bone);
        const int before = wgt()->getRebuildCount();
        rkScene->selectNode(bone);
        QTRY_COMPARE(wgt()->getRebuildCount(), before + 1);
        // Same figure: the mixer pages stay as they were.
        QCOMPARE(wgt()->getMixerPages().value(0), page.data());
        QCOMPARE(tabTexts(wgt()->getLowerTabs()), QStringList({"Mixer 1", "+"}));
    }

    // A click on the still drawn tab of the row that is not active shows its page again.
    RkEzTabBar* upper = wgt()->getUpperTabs();
    RkEzTabBar* lower = wgt()->getLowerTabs();
    for (int round = 0; round < 2; ++round) {
        QTest::mouseClick(lower, Qt::LeftButton, {}, lower->tabRect(0).center());
        QTRY_VERIFY(page->isVisible());
        QCOMPARE(upper->currentIndex(), -1);
        QTest::mouseClick(upper, Qt::LeftButton, {}, upper->tabRect(0).center());
        QTRY_VERIFY(wgt()->getCurrentPage()->isVisible());
        QVERIFY(!page->isVisible());
        QCOMPARE(lower->currentIndex(), -1);
    }

    rkScene->selectNode(rkScene->findNode(QLatin1String(RkDemoPropName)));
    QTRY_COMPARE(tabTexts(wgt()->getLowerTabs()), QStringList({"+"}));
}

void TestRkEzPropertiesPane::figureLeavingTheSceneRebuilds()
{
    // A tile previews its morph while hovered; then the figure goes.
    choose(0, QStringLiteral("Morphs"));
    RkEzPropertiesControl* tile = wgt()->getCurrentPage()->getIconGrid()->getTiles().value(0);
    QVERIFY(tile);
    QWidget* image = tile->childAt(tile->width() / 2, tile->width() / 4);
    while (image && image->parentWidget() != tile)
        image = image->parentWidget();
    QVERIFY(image);
    QEvent enter(QEvent::Enter);
    QApplication::sendEvent(image, &enter);
    QVERIFY(tile->isPreviewing());
    rkScene->removeNode(m_figure);
    m_figure = nullptr;
    QTRY_COMPARE(wgt()->getCategoryModel()->rowCount(), 0);
    QTRY_COMPARE(wgt()->getFigure(), static_cast<RkNode*>(nullptr));
    QCOMPARE(wgt()->getPages().size(), 1);
    QVERIFY(wgt()->getPages()[0]->getProperties().isEmpty());
    QCOMPARE(wgt()->getPages()[0]->getHeader()->getPagingLabel()->text(),
             QStringLiteral("Select something."));
    QVERIFY(!rkUndoStack->canPushItems());
    QTest::qWait(50);
}

void TestRkEzPropertiesPane::newNodeAtTheSameAddressRebuilds()
{
    RkNode* shown = new SameSpotFigure;
    addMorph(shown, QStringLiteral("Old"), QStringLiteral("Oldies"));
    rkScene->addNode(shown);
    rkScene->selectNode(shown);
    QTRY_VERIFY(modelTexts(wgt()->getCategoryModel()).contains(QStringLiteral("Oldies")));
    const int before = wgt()->getRebuildCount();
    // Gone and replaced before the timer runs.
    rkScene->removeNode(shown);
    RkNode* reborn = new SameSpotFigure;
    QCOMPARE(reborn, shown);
    addMorph(reborn, QStringLiteral("Fresh"), QStringLiteral("Newcomers"));
    rkScene->addNode(reborn);
    rkScene->selectNode(reborn);
    QTRY_VERIFY(modelTexts(wgt()->getCategoryModel()).contains(QStringLiteral("Newcomers")));
    QVERIFY(!modelTexts(wgt()->getCategoryModel()).contains(QStringLiteral("Oldies")));
    QVERIFY(wgt()->getRebuildCount() > before);
    rkScene->removeNode(reborn);
}

void TestRkEzPropertiesPane::deleteFromAStaleMenuDoesNothing()
{
    RkNode* ball = rkScene->findNode(QLatin1String(RkDemoPropName));
    RkEzMixerSetup::addMixer(ball);
    // Figure: two mixers through "+"; open the menu on the first.
    RkEzTabBar* lower = wgt()->getLowerTabs();
    QTest::mouseClick(lower, Qt::LeftButton, {}, lower->tabRect(0).center());
    QTest::mouseClick(lower, Qt::LeftButton, {}, lower->tabRect(1).center());
    QCOMPARE(tabTexts(lower), QStringList({"Mixer 1", "Mixer 2", "+"}));
    QCOMPARE(wgt()->getStack()->currentWidget(), wgt()->getMixerPages()[1]);

    // Deleting the first leaves the second, still named after its old place.
    QPoint at = lower->tabRect(0).center();
    Q_EMIT lower->customContextMenuRequested(at);
    QMenu* menu = wgt()->findChild<QMenu*>();
    QVERIFY(menu);
    menu->actions().value(0)->trigger();
    menu->close();
    QCOMPARE(tabTexts(lower), QStringList({"Mixer 2", "+"}));
    QCOMPARE(RkEzMixerSetup::findMixers(m_figure)->getMixers().size(), 1);
    QCOMPARE(lower->currentIndex(), -1);
    QCoreApplication::sendPostedEvents(nullptr, QEvent::DeferredDelete);

    // Open the menu again, then the selection moves to the ball with one mixer of its own.
    Q_EMIT lower->customContextMenuRequested(lower->tabRect(0).center());
    menu = wgt()->findChild<QMenu*>();
    QVERIFY(menu);
    QAction* remove = menu->actions().value(0);
    QVERIFY(remove);
    rkScene->selectNode(ball);
    QTRY_COMPARE(wgt()->getFigure(), ball);
    QCOMPARE(tabTexts(lower), QStringList({"Mixer 1", "+"}));
    const QVector<RkEzMixer*> ballMixers = RkEzMixerSetup::findMixers(ball)->getMixers();
    remove->trigger();
    QCOMPARE(RkEzMixerSetup::findMixers(ball)->getMixers(), ballMixers);
    QCOMPARE(RkEzMixerSetup::findMixers(m_figure)->getMixers().size(), 1);
    QCOMPARE(tabTexts(lower), QStringList({"Mixer 1", "+"}));
    menu->close();
}

void TestRkEzPropertiesPane::filterFindsMorphsByLabel()
{
    choose(0, QStringLiteral("Morphs"));
    QTRY_COMPARE(tabTexts(wgt()->getUpperTabs()), QStringList({"Head", "Body"}));
    const QStringList normalTabs = tabTexts(wgt()->getUpperTabs());
    const QStringList normalFirst = labelsOf(wgt()->getCurrentPage()->getProperties());

    QTest::keyClicks(wgt()->getFilterEdit(), QStringLiteral("eaR"));
    QCOMPARE(tabTexts(wgt()->getUpperTabs()).size(), 1);
    QCOMPARE(labelsOf(wgt()->getCurrentPage()->getProperties()),
             QStringList({"Ears Pointed", "Ears Large", "Ears Back"}));
    wgt()->getFilterEdit()->clear();
    QCOMPARE(tabTexts(wgt()->getUpperTabs()), normalTabs);
    QCOMPARE(labelsOf(wgt()->getCurrentPage()->getProperties()), normalFirst);

    QTest::keyClicks(wgt()->getFilterEdit(), QStringLiteral("heavy"));
    QCOMPARE(labelsOf(wgt()->getCurrentPage()->getProperties()),
             QStringList({"Body Heavy", "Thighs Heavy"}));
}

void TestRkEzPropertiesPane::switchingCategoriesLeavesNoWidgets()
{
    QComboBox* combo = comboAt(0);
    QVERIFY(combo);
    const int morphs = combo->findText(QStringLiteral("Morphs"));
    const int display = combo->findText(QStringLiteral("Transforms"));
    QVERIFY(morphs >= 0 && display >= 0);
    combo->setCurrentIndex(display);
    QCoreApplication::sendPostedEvents(nullptr, QEvent::DeferredDelete);
    const int widgets = m_pane->findChildren<QWidget*>().size();
    // The posted work of each switch (deferred deletes, layouts, repaints) is done before the
    // next, as the event loop would between two choices of the user.
    for (int i = 0; i < 1000; ++i) {
        combo->setCurrentIndex(i % 2 ? display : morphs);
        QCoreApplication::sendPostedEvents();
        QCoreApplication::sendPostedEvents(nullptr, QEvent::DeferredDelete);
    }
    QCoreApplication::sendPostedEvents(nullptr, QEvent::DeferredDelete);
    QCOMPARE(m_pane->findChildren<QWidget*>().size(), widgets);
}

void TestRkEzPropertiesPane::storedMixerForm()
{
    choose(0, QStringLiteral("Morphs"));
    const QVector<RkEzPropertiesControl*> tiles =
        wgt()->getCurrentPage()->getIconGrid()->getTiles();
    QVERIFY(tiles.size() >= 2);
    drop(tiles[0]);
    drop(tiles[1]);
    QTemporaryDir dir;
    const QString path = dir.filePath(QStringLiteral("mixers.rks"));
    QVERIFY(rkScene->save(path));
    QFile file(path);
    QVERIFY(file.open(QIODevice::ReadOnly));
    const QVector<StoredRecord> records = readRecords(file.readAll());

    auto indexOf = [&](const char* className) {
        for (int i = 0; i < records.size(); ++i) {
            if (records[i].className == QLatin1String(className))
                return i;
        }
        return -1;
    };
    const int mixersAt = indexOf("RkEzMixers");
    const int mixerAt = indexOf("RkEzMixer");
    QVERIFY(mixersAt >= 0 && mixerAt >= 0);

    // The mixer list: guid, class, name, one section 0x210 holding one object pointer (kind 1,
    // index 0, the mixer's record).
    QByteArray expected = QByteArray::fromHex(
        "24000000 65623362383065302d626462312d313164652d393862302d303030326135643563353162"
        "0a000000 526b457a4d6978657273 0a000000 526b457a4d6978657273 01000000"
        "1002 08000000 07 01 0000");
    char target[4];
    qToLittleEndian<qint32>(mixerAt, target);
    expected.append(target, 4);
    QCOMPARE(records[mixersAt].bytes.toHex(), expected.toHex());

    // The others: section ids and value tags in their order.
    using Sections = QVector<QPair<int, QByteArray>>;
    const QByteArray P("\x07", 1), F("\x02", 1), I("\x01", 1), B("\x06", 1);
    QCOMPARE(records[mixerAt].sections, Sections({{0x220, P + P}, {0x230, P}}));
    int controls = 0;
    int drivers = 0;
    for (const StoredRecord& record : records) {
        if (record.className == QLatin1String("RkEzMixerControl")) {
            ++controls;
            QCOMPARE(record.sections, Sections({{0x222, B}, {0x221, P + F}, {0x223, I + I}}));
        } else if (record.className == QLatin1String("RkEzMixerDriver")) {
            ++drivers;
            QCOMPARE(record.sections, Sections({{0x231, I + I}}));
        }
    }
    QCOMPARE(controls, 2);
    QCOMPARE(drivers, 1);
}

void TestRkEzPropertiesPane::droppedMixerDrivesAcrossSaveAndOpen()
{
    choose(0, QStringLiteral("Morphs"));
    const QVector<RkEzPropertiesControl*> tiles =
        wgt()->getCurrentPage()->getIconGrid()->getTiles();
    QVERIFY(tiles.size() >= 2);
    const QString first = tiles[0]->getProperty()->getName();
    const QString second = tiles[1]->getProperty()->getName();
    drop(tiles[0]);
    drop(tiles[1]);

    // Drags the shown mixer's handle onto one of its controls; that control's morph goes to full
    // strength, the other's to zero. After the open the handle starts on the second control,
    // where it must still be within reach.
    const QStringList names = {first, second};
    auto driveTo = [this, &names](RkNode* figure, int control) {
        RkEzTabBar* lower = wgt()->getLowerTabs();
        QTest::mouseClick(lower, Qt::LeftButton, {}, lower->tabRect(0).center());
        RkEzMixerWgt* page = wgt()->getMixerPages().value(0);
        QTRY_VERIFY(page && page->isVisible());
        QCOMPARE(page->getControlWgts().size(), 2);
        RkEzMixerControl* target = page->getMixer()->getControls().value(control);
        // Through the pane's window, as the window system would send them: the pane shares the
        // screen with the main window, so cursor moves must not depend on what lies on top.
        QWindow* window = page->window()->windowHandle();
        const QPoint from = page->mapTo(page->window(), page->getMixer()->getDriver()->getPoint());
        const QPoint to = page->mapTo(page->window(), QPoint(target->getX(), target->getY()));
        QVERIFY(from != to);
        QTest::mousePress(window, Qt::LeftButton, {}, from);
        QTest::mouseMove(window, (from + to) / 2);
        QTest::mouseMove(window, to);
        QTest::mouseRelease(window, Qt::LeftButton, {}, to);
        for (int i = 0; i < 2; ++i) {
            auto* morph = qobject_cast<RkFloatProperty*>(figure->findProperty(names[i]));
            QVERIFY(morph);
            QVERIFY2(qAbs(morph->getValue() - (i == control ? 1.f : 0.f)) < 1e-3f,
                     qPrintable(names[i] + QString::number(morph->getValue())));
        }
    };
    driveTo(m_figure, 1);
    if (QTest::currentTestFailed())
        return;

    QTemporaryDir dir;
    const QString path = dir.filePath(QStringLiteral("mixed.rks"));
    QVERIFY(rkScene->save(path));
    rkScene->clear();
    QVERIFY(rkScene->load(path));
    auto* figure = qobject_cast<RkSkeleton*>(rkScene->findNode(QLatin1String(RkDemoFigureName)));
    QVERIFY(figure);
    m_figure = figure;
    rkScene->selectNode(figure);
    QTRY_COMPARE(wgt()->getFigure(), static_cast<RkNode*>(figure));
    QTRY_COMPARE(tabTexts(wgt()->getLowerTabs()), QStringList({"Mixer 1", "+"}));
    driveTo(figure, 0);
}

RK_TEST_MAIN(TestRkEzPropertiesPane)
#include "tst_rkezpropertiespane.moc"
