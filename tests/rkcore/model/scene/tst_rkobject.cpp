#include "demo/rkdemoscene.h"
#include "geometry/rkpolymesh.h"
#include "properties/rkfloatproperty.h"
#include "rktestmain.h"
#include "scene/rkbone.h"
#include "scene/rkmaterial.h"
#include "scene/rkobject.h"
#include "scene/rkscene.h"
#include "scene/rkshape.h"
#include "scene/rkskeleton.h"

#include <QPointer>
#include <QSignalSpy>
#include <QTemporaryDir>

namespace
{

QList<RkShape*> shapesOf(const RkMaterial* material)
{
    QList<RkShape*> shapes;
    QListIterator<RkShape*> it = material->shapeListIterator();
    while (it.hasNext())
        shapes.append(it.next());
    return shapes;
}

RkPolyMesh* twoPointMesh()
{
    auto* mesh = new RkPolyMesh;
    mesh->addVertex(RkVec3(0, 0, 0));
    mesh->addVertex(RkVec3(1, 0, 0));
    return mesh;
}

} // namespace

class TestRkObject : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void cleanup();
    void materialRegistryAndSelection();
    void shapesShareMaterials();
    void geometryChangeReachesNodeAndMaterials();
    void deformedVerticesFollowMorphsAndNode();
    void demoFigureCarriesItsMesh();
    void loadRebuildsTheMesh();
};

void TestRkObject::cleanup()
{
    rkScene->clear();
    QCOMPARE(RkMaterial::getNumMaterials(), 0);
}

void TestRkObject::materialRegistryAndSelection()
{
    QSignalSpy changed(rkScene, &RkScene::materialSelectionChanged);
    auto skin = std::make_unique<RkMaterial>(QStringLiteral("Skin"));
    auto eyes = std::make_unique<RkMaterial>(QStringLiteral("Eyes"));
    auto* cloth = new RkMaterial(QStringLiteral("Cloth"));
    QCOMPARE(RkMaterial::getNumMaterials(), 3);
    QCOMPARE(RkMaterial::getMaterial(1), eyes.get());
    QVERIFY(!RkMaterial::getMaterial(3));
    QVERIFY(!RkMaterial::getMaterial(-1));

    eyes->setSelected(true);
    eyes->setSelected(true); // no change, no signal
    cloth->setSelected(true);
    QCOMPARE(changed.count(), 2);
    QCOMPARE(RkMaterial::getSelectedMaterials(), QList<RkMaterial*>({eyes.get(), cloth}));

    // A selected material that goes away leaves the selection, and says so.
    delete cloth;
    QCOMPARE(changed.count(), 3);
    QCOMPARE(RkMaterial::getNumMaterials(), 2);
    QCOMPARE(RkMaterial::getSelectedMaterials(), QList<RkMaterial*>({eyes.get()}));

    RkMaterial::clearMaterialSelection();
    RkMaterial::clearMaterialSelection(); // nothing left to clear: no signal
    QCOMPARE(changed.count(), 4);
    QVERIFY(!eyes->isSelected());
}

void TestRkObject::shapesShareMaterials()
{
    auto* owner = new RkShape(QStringLiteral("Head"));
    auto* other = new RkShape(QStringLiteral("Hand"));
    QPointer<RkMaterial> skin = new RkMaterial(QStringLiteral("Skin"));
    auto* eyes = new RkMaterial(QStringLiteral("Eyes"));
    QCOMPARE(owner->addMaterial(skin), 0);
    QCOMPARE(owner->addMaterial(eyes), 1);
    QCOMPARE(owner->addMaterial(skin), 0); // listed once
    QCOMPARE(other->addMaterial(skin), 0);
    QCOMPARE(skin->parent(), owner); // the first shape took the parentless material

    QCOMPARE(owner->findMaterialIndex(eyes), 1);
    QCOMPARE(other->findMaterialIndex(eyes), -1);
    QCOMPARE(other->findMaterialIndex(nullptr), -1);
    QCOMPARE(shapesOf(skin), QList<RkShape*>({owner, other}));

    delete other;
    QCOMPARE(shapesOf(skin), QList<RkShape*>({owner}));

    // A material deleted while another shape uses it leaves an empty slot, not a dangling one.
    auto* user = new RkShape(QStringLiteral("Foot"));
    user->addMaterial(eyes);
    user->addMaterial(skin);
    delete owner; // deletes skin and eyes, which it owns
    QVERIFY(!skin);
    QCOMPARE(user->getNumMaterials(), 2);
    QVERIFY(!user->getMaterial(0));
    QVERIFY(!user->getMaterial(1));
    QCOMPARE(RkMaterial::getNumMaterials(), 0);
    delete user;
}

void TestRkObject::geometryChangeReachesNodeAndMaterials()
{
    auto* node = new RkNode;
    rkScene->addNode(node);
    auto* object = new RkObject(QStringLiteral("Thing"));
    auto* shape = new RkShape(QStringLiteral("Thing"));
    auto* material = new RkMaterial(QStringLiteral("Paint"));
    shape->addMaterial(material);
    object->addShape(shape);

    QSignalSpy nodeUVs(node, &RkNode::uvsChanged);
    node->setObject(object);
    QCOMPARE(nodeUVs.count(), 1);
    QCOMPARE(node->getObject(), object);
    QCOMPARE(object->getNode(), node);
    // A shape leads back to its object, as the UV view walks it.
    QCOMPARE(qobject_cast<RkObject*>(object->getShape(0)->getElementParent()), object);
    QVERIFY(!object->getShape(1));

    QSignalSpy materialUVs(material, &RkMaterial::uvsChanged);
    object->setGeometry(twoPointMesh());
    QCOMPARE(nodeUVs.count(), 2);
    QCOMPARE(materialUVs.count(), 1);
    QCOMPARE(object->getGeometry()->getNumVertices(), 2);

    // Replacing the object deletes the old one with its shapes and materials.
    QPointer<RkMaterial> watched = material;
    node->setObject(nullptr);
    QVERIFY(!watched);
    QCOMPARE(nodeUVs.count(), 3);
}

void TestRkObject::deformedVerticesFollowMorphsAndNode()
{
    auto* node = new RkNode;
    rkScene->addNode(node);
    auto* object = new RkObject;
    node->setObject(object);
    object->setGeometry(twoPointMesh());
    auto* morph = new RkFloatProperty(QStringLiteral("Lift"), QStringLiteral("Lift"));
    node->addProperty(morph, QStringLiteral("Morphs"));
    RkMorphDeltas lift;
    lift.indices = {1};
    lift.deltas = {RkVec3(0, 2, 0)};
    object->addMorph(lift, morph);

    QVector<RkVec3> out;
    morph->setValue(0.5f);
    node->getXTranslate()->setValue(10);
    object->getDeformedVertices(out);
    QCOMPARE(out.size(), 2);
    QCOMPARE(out[0], RkVec3(10, 0, 0));
    QCOMPARE(out[1], RkVec3(11, 1, 0));
    object->getDeformedVertices(out, false); // rest coordinates: the morph only
    QCOMPARE(out[1], RkVec3(1, 1, 0));

    // The morph property going away leaves the rest shape, and nothing dangling.
    node->removeProperty(morph);
    object->getDeformedVertices(out, false);
    QCOMPARE(out[1], RkVec3(1, 0, 0));

    // A new geometry drops the morphs made for the old one.
    object->setGeometry(twoPointMesh());
    QCOMPARE(object->getNumMorphs(), 0);
}

void TestRkObject::demoFigureCarriesItsMesh()
{
    RkSkeleton* figure = rkBuildDemoScene(rkScene);
    QList<RkBone*> bones;
    figure->getAllBones(bones);
    for (RkBone* bone : bones) {
        QVERIFY2(bone->getObject() && bone->getObject()->getGeometry(),
                 qPrintable(bone->getName()));
        QCOMPARE(bone->getObject()->getNumShapes(), 1);
    }
    // The figure shares four materials between its bones; the prop has its own.
    QCOMPARE(RkMaterial::getNumMaterials(), 5);
    RkMaterial* skin = RkMaterial::getMaterial(0);
    QCOMPARE(skin->getName(), QStringLiteral("Skin"));
    RkShape* headShape = figure->findBone(QStringLiteral("head"))->getObject()->getShape(0);
    QVERIFY(shapesOf(skin).contains(headShape));
    QCOMPARE(headShape->findMaterialIndex(skin), 0);
    QVERIFY(figure->getObject() && !figure->getObject()->getGeometry());
    RkNode* prop = rkScene->findNode(QLatin1String(RkDemoPropName));
    QVERIFY(prop && prop->getObject() && prop->getObject()->getGeometry());

    // The head's mesh answers to the figure's head morphs, and only to those that touch it.
    RkObject* head = figure->findBone(QStringLiteral("head"))->getObject();
    QStringList driven;
    for (int i = 0; i < head->getNumMorphs(); ++i)
        driven << head->getMorphProperty(i)->getName();
    QVERIFY(driven.contains(QStringLiteral("HeadLong")));
    QVERIFY(driven.contains(QStringLiteral("Smile")));
    QVERIFY(!driven.contains(QStringLiteral("FeetLarge")));

    // Turning the neck carries the head along.
    QVector<RkVec3> before, after;
    head->getDeformedVertices(before);
    figure->findBone(QStringLiteral("neck"))->getXRotate()->setValue(30);
    head->getDeformedVertices(after);
    QVERIFY((before[0] - after[0]).length() > 0.01f);
}

void TestRkObject::loadRebuildsTheMesh()
{
    QTemporaryDir dir;
    const QString path = dir.filePath(QStringLiteral("demo.rks"));
    RkSkeleton* figure = rkBuildDemoScene(rkScene);
    qobject_cast<RkFloatProperty*>(figure->findProperty(QStringLiteral("HeadLong")))->setValue(1);
    QString error;
    QVERIFY2(rkScene->save(path, &error), qPrintable(error));
    QVERIFY2(rkScene->load(path, &error), qPrintable(error));

    // The file holds no geometry: the loaded figure has its mesh rebuilt, the old materials are
    // gone, and the head still follows the loaded morph value.
    QCOMPARE(RkMaterial::getNumMaterials(), 5);
    auto* loaded = qobject_cast<RkSkeleton*>(rkScene->findNode(QLatin1String(RkDemoFigureName)));
    QVERIFY(loaded);
    RkObject* head = loaded->findBone(QStringLiteral("head"))->getObject();
    QVERIFY(head && head->getGeometry());
    QVector<RkVec3> shaped, rest;
    head->getDeformedVertices(shaped, false);
    qobject_cast<RkFloatProperty*>(loaded->findProperty(QStringLiteral("HeadLong")))->setValue(0);
    head->getDeformedVertices(rest, false);
    QVERIFY(shaped != rest);
}

RK_TEST_MAIN(TestRkObject)
#include "tst_rkobject.moc"
