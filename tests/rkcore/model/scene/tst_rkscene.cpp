#include "demo/rkdemoscene.h"
#include "properties/rkboolproperty.h"
#include "properties/rkfloatproperty.h"
#include "properties/rkpropertygroup.h"
#include "properties/rkpropertygrouptree.h"
#include "rktestmain.h"
#include "scene/rkbone.h"
#include "scene/rkscene.h"
#include "scene/rkskeleton.h"

#include <QSignalSpy>

namespace
{

RkNode* makeNode(const QString& name)
{
    auto* node = new RkNode;
    node->setName(name);
    rkScene->addNode(node);
    return node;
}

QStringList names(const RkNodeList& nodes)
{
    QStringList out;
    for (RkNode* n : nodes)
        out << n->getName();
    return out;
}

// The pointer a signal carried, without touching the object (it may be gone).
const void* nodeArg(const QList<QVariant>& args)
{
    return *static_cast<RkNode* const*>(args.at(0).constData());
}

} // namespace

class TestRkScene : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void init() { rkScene->clear(); }
    void selectionKeepsOrderAndSignals();
    void removingNodesUpdatesSelection();
    void clearEmitsInOrder();
    void bonesAndFigures();
    void transformsFollowTheHierarchy();
    void demoContent();
};

void TestRkScene::selectionKeepsOrderAndSignals()
{
    RkNode* a = makeNode("a");
    RkNode* b = makeNode("b");
    RkNode* c = makeNode("c");
    QSignalSpy list(rkScene, &RkScene::nodeSelectionListChanged);
    QSignalSpy primary(rkScene, &RkScene::primarySelectionChanged);

    rkScene->selectNode(b);
    rkScene->selectNode(a, true);
    rkScene->selectNode(c, true);
    QCOMPARE(names(rkScene->getSelectedNodes()), QStringList({"b", "a", "c"}));
    QStringList iterated;
    for (RkNodeListIterator it = rkScene->selectedNodeListIterator(); it.hasNext();)
        iterated << it.next()->getName();
    QCOMPARE(iterated, QStringList({"b", "a", "c"}));
    QCOMPARE(rkScene->getPrimarySelection(), c);
    QCOMPARE(list.count(), 3);
    QCOMPARE(primary.count(), 3);
    QCOMPARE(primary.last().at(0).value<RkNode*>(), c);
    QVERIFY(a->isSelected() && b->isSelected());

    // Selecting the primary again changes nothing.
    rkScene->selectNode(c, true);
    QCOMPARE(list.count(), 3);
    QCOMPARE(primary.count(), 3);

    // A node selected alone replaces the selection.
    rkScene->selectNode(a);
    QCOMPARE(names(rkScene->getSelectedNodes()), QStringList({"a"}));
    QVERIFY(!b->isSelected());
    QCOMPARE(primary.last().at(0).value<RkNode*>(), a);

    rkScene->deselectNode(a);
    QCOMPARE(rkScene->getPrimarySelection(), nullptr);
    QCOMPARE(primary.last().at(0).value<RkNode*>(), nullptr);
    const int before = list.count();
    rkScene->clearSelection();
    QCOMPARE(list.count(), before);

    // A node that is not in the scene cannot be selected.
    RkNode stray;
    rkScene->selectNode(&stray);
    QCOMPARE(rkScene->getNumSelectedNodes(), 0);
}

void TestRkScene::removingNodesUpdatesSelection()
{
    RkNode* a = makeNode("a");
    RkNode* b = makeNode("b");
    RkNode* child = makeNode("child");
    child->setNodeParent(b);
    rkScene->selectNode(a);
    rkScene->selectNode(child, true);
    QSignalSpy removed(rkScene, &RkScene::nodeRemoved);
    QSignalSpy primary(rkScene, &RkScene::primarySelectionChanged);
    QSignalSpy destroyed(child, &QObject::destroyed);

    rkScene->removeNode(b);
    QCOMPARE(removed.count(), 2);
    QCOMPARE(nodeArg(removed.at(0)), child); // deepest first
    QCOMPARE(destroyed.count(), 1);
    QCOMPARE(rkScene->getNumNodes(), 1);
    QCOMPARE(rkScene->getPrimarySelection(), a);
    QCOMPARE(primary.last().at(0).value<RkNode*>(), a);

    // A node deleted behind the scene's back leaves it and the selection.
    delete a;
    QCOMPARE(rkScene->getNumNodes(), 0);
    QCOMPARE(rkScene->getNumSelectedNodes(), 0);
    QCOMPARE(rkScene->getPrimarySelection(), nullptr);
}

void TestRkScene::clearEmitsInOrder()
{
    RkNode* a = makeNode("a");
    makeNode("b");
    rkScene->selectNode(a);
    QStringList events;
    QObject guard;
    connect(rkScene, &RkScene::sceneClearStarting, &guard, [&] { events << "clearStarting"; });
    connect(rkScene, &RkScene::primarySelectionChanged, &guard, [&] { events << "primary"; });
    connect(rkScene, &RkScene::nodeRemoved, &guard,
            [&](RkNode* n) { events << "removed " + n->getName(); });
    connect(a, &QObject::destroyed, &guard, [&] { events << "destroyed a"; });
    connect(rkScene, &RkScene::sceneCleared, &guard, [&] { events << "cleared"; });
    rkScene->clear();
    QCOMPARE(events, QStringList({"clearStarting", "primary", "removed b", "removed a",
                                  "destroyed a", "cleared"}));
}

void TestRkScene::bonesAndFigures()
{
    auto* figure = new RkSkeleton;
    rkScene->addNode(figure);
    auto bone = [&](const QString& name, RkNode* parent) {
        auto* b = new RkBone;
        b->setName(name);
        b->setNodeParent(parent);
        rkScene->addNode(b);
        return b;
    };
    RkBone* hip = bone("hip", figure);
    RkBone* thigh = bone("thigh", hip);
    RkBone* chest = bone("chest", hip);
    RkBone* shin = bone("shin", thigh);
    QList<RkBone*> bones;
    figure->getAllBones(bones);
    QCOMPARE(bones, QList<RkBone*>({hip, thigh, shin, chest}));
    QCOMPARE(shin->getSkeleton(), figure);
    QCOMPARE(figure->getSkeleton(), figure);
    QCOMPARE(figure->findBone("chest"), chest);
    RkBone loose;
    QCOMPARE(loose.getSkeleton(), nullptr);
    QCOMPARE(static_cast<RkNode*>(makeNode("plain"))->getSkeleton(), nullptr);

    // No loops in the hierarchy.
    QVERIFY(!hip->setNodeParent(shin));
    QCOMPARE(hip->getNodeParent(), figure);
}

void TestRkScene::transformsFollowTheHierarchy()
{
    RkNode* parent = makeNode("parent");
    RkNode* child = makeNode("child");
    child->setNodeParent(parent);
    child->setOrigin(QVector3D(1, 0, 0));
    QSignalSpy moved(child, &RkNode::transformChanged);
    parent->getYTranslate()->setValue(2);
    QCOMPARE(moved.count(), 1);
    // The child turns about its own origin and rides along with its parent.
    child->getZRotate()->setValue(90);
    const QVector3D p = child->getWorldTransform().map(QVector3D(2, 0, 0));
    QVERIFY(qFuzzyCompare(p, QVector3D(1, 3, 0)));
    child->getVisible()->setValue(false);
    QVERIFY(!child->isVisible());
}

void TestRkScene::demoContent()
{
    QSignalSpy added(rkScene, &RkScene::nodeAdded);
    RkSkeleton* figure = rkBuildDemoScene(rkScene);
    QVERIFY(figure);
    QList<RkBone*> bones;
    figure->getAllBones(bones);
    QStringList boneNames;
    for (RkBone* b : bones) {
        boneNames << b->getName();
        QCOMPARE(b->getSkeleton(), figure);
        QVERIFY(b->getPropertyGroups()->findChild("Transforms/Rotation"));
    }
    for (const char* required :
         {"hip", "abdomen", "chest", "neck", "head", "lShldr", "rShldr", "lThigh", "rThigh"})
        QVERIFY2(boneNames.contains(required), required);
    QVERIFY(figure->findBone("neck")->findProperty("XTranslate")->isHidden());

    // Morphs: floats from 0 to 1 shown as percent, in categories several levels deep.
    RkPropertyGroupTree* tree = figure->getPropertyGroups();
    int morphs = 0;
    for (RkProperty* p : tree->getAllProperties()) {
        auto* f = qobject_cast<RkFloatProperty*>(p);
        if (!f || !p->getPath().startsWith("Morphs") || p->isHidden())
            continue;
        ++morphs;
        QCOMPARE(f->getMin(), 0.0f);
        QCOMPARE(f->getMax(), 1.0f);
        QVERIFY(f->getDisplayAsPercent());
    }
    QVERIFY(morphs >= 24);
    for (const char* path : {"Morphs/Head/Face", "Morphs/Head/Ears", "Morphs/Body",
                             "Morphs/Body/Arms", "General", "Deformers"})
        QVERIFY2(tree->findChild(path), path);
    QCOMPARE(tree->findChild("Morphs/Head/Face")->getPath(), QStringLiteral("Morphs/Head/Face"));
    bool floatless = false;
    for (RkPropertyGroup* g : tree->getTopGroups()) {
        const auto props = g->getProperties();
        floatless |= !props.isEmpty() && g->getChildren().isEmpty() &&
                     std::none_of(props.begin(), props.end(),
                                  [](RkProperty* p) { return qobject_cast<RkFloatProperty*>(p); });
    }
    QVERIFY(floatless);

    QVERIFY(rkScene->findNode(RkDemoPropName));
    QVERIFY(rkScene->findNode(RkDemoCameraName));
    QVERIFY(rkScene->findNode(RkDemoLightName));
    QCOMPARE(added.count(), rkScene->getNumNodes());
}

RK_TEST_MAIN(TestRkScene)
#include "tst_rkscene.moc"
