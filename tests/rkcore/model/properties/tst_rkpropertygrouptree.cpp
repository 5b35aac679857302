#include "properties/rkfloatproperty.h"
#include "properties/rkintproperty.h"
#include "properties/rkpropertygroup.h"
#include "properties/rkpropertygrouptree.h"
#include "rktestmain.h"
#include "scene/rkelement.h"

#include <QSignalSpy>

namespace
{

// The tree as "path: labels" lines, walked the way panes walk it: first child, next sibling.
void dump(RkPropertyGroup* group, QStringList& out)
{
    for (; group; group = group->getNextSibling()) {
        QStringList labels;
        for (int i = 0; i < group->getNumProperties(); ++i)
            labels << group->getProperty(i)->getLabel();
        out << group->getPath() + ": " + labels.join(",");
        dump(group->getFirstChild(), out);
    }
}

QStringList dump(RkPropertyGroupTree* tree)
{
    QStringList out;
    dump(tree->getFirstChild(), out);
    return out;
}

RkFloatProperty* addFloat(RkElement& e, const QString& name, const QString& path)
{
    auto* p = new RkFloatProperty(name, name.toUpper());
    e.addProperty(p, path);
    return p;
}

} // namespace

class TestRkPropertyGroupTree : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void groupsFollowPaths();
    void propertiesLeaveTheirGroups();
};

void TestRkPropertyGroupTree::groupsFollowPaths()
{
    RkElement e;
    QSignalSpy treeChanged(&e, &RkElement::propertyTreeChanged);
    addFloat(e, "smile", "Morphs/Head/Face");
    addFloat(e, "ears", "/Morphs/Head/Ears/");
    addFloat(e, "body", "Morphs/Body");
    addFloat(e, "bend", "Deformers");
    RkFloatProperty* frown = addFloat(e, "frown", "Morphs/Head/Face");
    QCOMPARE(dump(e.getPropertyGroups()),
             QStringList({"Morphs: ", "Morphs/Head: ", "Morphs/Head/Face: SMILE,FROWN",
                          "Morphs/Head/Ears: EARS", "Morphs/Body: BODY", "Deformers: BEND"}));
    QCOMPARE(frown->getPath(), QStringLiteral("Morphs/Head/Face"));
    QCOMPARE(RkElement::elementOf(frown), &e);
    QCOMPARE(treeChanged.count(), 5);

    RkPropertyGroupTree* tree = e.getPropertyGroups();
    QCOMPARE(tree->findChild("Morphs/Head/Ears")->getName(), QStringLiteral("Ears"));
    QCOMPARE(tree->findChild("/Morphs/Head"), tree->findChild("Morphs/Head"));
    QCOMPARE(tree->findChild("Morphs/Head/Nose"), nullptr);
    QCOMPARE(tree->findChild(""), nullptr);
    QCOMPARE(e.findProperty("ears")->getLabel(), QStringLiteral("EARS"));

    QSignalSpy collapsed(tree->findChild("Deformers"), &RkPropertyGroup::collapsedChanged);
    tree->findChild("Deformers")->setCollapsed(true);
    tree->findChild("Deformers")->setCollapsed(true);
    QCOMPARE(collapsed.count(), 1);
    QVERIFY(tree->findChild("Deformers")->getCollapsed());
}

void TestRkPropertyGroupTree::propertiesLeaveTheirGroups()
{
    RkElement e;
    RkFloatProperty* ears = addFloat(e, "ears", "Morphs/Head/Ears");
    addFloat(e, "body", "Morphs/Body");
    RkFloatProperty* bend = addFloat(e, "bend", "Deformers");

    // Moving the only property of a branch takes the emptied groups away.
    e.getPropertyGroups()->addProperty(ears, "Morphs/Body");
    QCOMPARE(dump(e.getPropertyGroups()),
             QStringList({"Morphs: ", "Morphs/Body: BODY,EARS", "Deformers: BEND"}));
    QCOMPARE(ears->getPath(), QStringLiteral("Morphs/Body"));

    delete bend; // deleted from outside: the element and the tree both let go
    QCOMPARE(e.getNumProperties(), 2);
    QCOMPARE(dump(e.getPropertyGroups()), QStringList({"Morphs: ", "Morphs/Body: BODY,EARS"}));

    e.removeProperty(ears);
    QCOMPARE(e.findProperty("ears"), nullptr);
    QCOMPARE(dump(e.getPropertyGroups()), QStringList({"Morphs: ", "Morphs/Body: BODY"}));
}

RK_TEST_MAIN(TestRkPropertyGroupTree)
#include "tst_rkpropertygrouptree.moc"
