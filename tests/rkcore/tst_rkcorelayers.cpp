// The core library is a stack of layers, base < model < shell, each made of area folders. Reads
// every #include line of the library and checks that no include points into a higher layer and
// that the areas depend on each other without a cycle.
#include <QDir>
#include <QDirIterator>
#include <QFile>
#include <QHash>
#include <QRegularExpression>
#include <QSet>
#include <QtTest>

namespace
{

const QStringList Layers = {QStringLiteral("base"), QStringLiteral("model"),
                            QStringLiteral("shell")};

struct Include {
    QString file; // relative to rkcore/, for messages
    int line = 0;
    QString text;
    QString fromArea; // "model/scene"
    QString toArea;   // empty when the header is not in the library
};

struct Library {
    QStringList areas;       // "base/log", ..., in layer order
    QList<Include> includes; // every quoted include of every file
};

int layerOf(const QString& area)
{
    return Layers.indexOf(area.section(QLatin1Char('/'), 0, 0));
}

// Finds which area a quoted include names: "scene/rknode.h" is rkcore/<layer>/scene/rknode.h, and
// a bare "rkcoreglobal.h" lies at a layer's root.
QString resolve(const QString& root, const QString& included)
{
    for (const QString& layer : Layers) {
        if (QFile::exists(root + QLatin1Char('/') + layer + QLatin1Char('/') + included)) {
            const QString folder = included.section(QLatin1Char('/'), 0, -2);
            return folder.isEmpty() ? layer : layer + QLatin1Char('/') + folder;
        }
    }
    return QString();
}

Library readLibrary(const QString& root)
{
    static const QRegularExpression includeLine(
        QStringLiteral("^\\s*#\\s*include\\s+\"([^\"]+)\""));
    Library lib;
    for (const QString& layer : Layers) {
        lib.areas.append(layer);
        const QDir dir(root + QLatin1Char('/') + layer);
        for (const QString& area : dir.entryList(QDir::Dirs | QDir::NoDotAndDotDot, QDir::Name))
            lib.areas.append(layer + QLatin1Char('/') + area);
    }
    QDirIterator it(root, {QStringLiteral("*.h"), QStringLiteral("*.cpp")}, QDir::Files,
                    QDirIterator::Subdirectories);
    while (it.hasNext()) {
        const QString path = it.next();
        const QString rel = QDir(root).relativeFilePath(path);
        QFile file(path);
        if (!file.open(QIODevice::ReadOnly | QIODevice::Text))
            continue;
        int number = 0;
        while (!file.atEnd()) {
            const QString line = QString::fromUtf8(file.readLine());
            ++number;
            const QRegularExpressionMatch m = includeLine.match(line);
            if (!m.hasMatch())
                continue;
            Include inc;
            inc.file = rel;
            inc.line = number;
            inc.text = m.captured(1);
            inc.fromArea = rel.section(QLatin1Char('/'), 0, -2);
            inc.toArea = resolve(root, inc.text);
            lib.includes.append(inc);
        }
    }
    return lib;
}

// A path through the area graph that comes back to its start, or an empty list.
QStringList findCycle(const QHash<QString, QSet<QString>>& edges)
{
    QHash<QString, int> state; // 1 on the current path, 2 done
    QStringList path;
    std::function<bool(const QString&)> visit = [&](const QString& area) {
        state[area] = 1;
        path.append(area);
        for (const QString& next : edges.value(area)) {
            if (state.value(next) == 1) {
                path = path.mid(path.indexOf(next)) << next;
                return true;
            }
            if (state.value(next) == 0 && visit(next))
                return true;
        }
        path.removeLast();
        state[area] = 2;
        return false;
    };
    for (auto it = edges.constBegin(); it != edges.constEnd(); ++it) {
        if (state.value(it.key()) == 0 && visit(it.key()))
            return path;
    }
    return {};
}

} // namespace

class TestRkCoreLayers : public QObject
{
    Q_OBJECT
private Q_SLOTS:
    void initTestCase();
    void includesPointDownwards();
    void areasHaveNoCycle();
    void checksCatchFaults();

private:
    Library lib;
};

void TestRkCoreLayers::initTestCase()
{
    lib = readLibrary(QStringLiteral(RK_SOURCE_DIR "/rkcore"));
    QVERIFY2(lib.includes.size() > 100, "the library's sources were not found");
    for (const QString& layer : Layers)
        QVERIFY2(lib.areas.contains(layer), qPrintable(layer));
}

void TestRkCoreLayers::includesPointDownwards()
{
    QStringList faults;
    for (const Include& inc : lib.includes) {
        const QString where =
            QStringLiteral("%1:%2: \"%3\"").arg(inc.file).arg(inc.line).arg(inc.text);
        if (inc.toArea.isEmpty())
            faults << where + QStringLiteral(" is not a header of the library");
        else if (layerOf(inc.toArea) > layerOf(inc.fromArea))
            faults << where + QStringLiteral(" reaches up from %1 into %2")
                                  .arg(inc.fromArea, inc.toArea);
    }
    QVERIFY2(faults.isEmpty(), qPrintable(faults.join(QLatin1Char('\n'))));
}

void TestRkCoreLayers::areasHaveNoCycle()
{
    QHash<QString, QSet<QString>> edges;
    for (const Include& inc : lib.includes) {
        if (!inc.toArea.isEmpty() && inc.toArea != inc.fromArea)
            edges[inc.fromArea].insert(inc.toArea);
    }
    const QStringList cycle = findCycle(edges);
    QVERIFY2(cycle.isEmpty(), qPrintable(cycle.join(QStringLiteral(" -> "))));
}

// The two checks must see a fault when there is one: an include up a layer and a cycle.
void TestRkCoreLayers::checksCatchFaults()
{
    QHash<QString, QSet<QString>> edges;
    edges[QStringLiteral("model/undo")] << QStringLiteral("model/properties");
    edges[QStringLiteral("model/properties")] << QStringLiteral("base/io");
    QVERIFY(findCycle(edges).isEmpty());
    edges[QStringLiteral("base/io")] << QStringLiteral("model/undo");
    QCOMPARE(findCycle(edges).size(), 4);

    const QString root = QStringLiteral(RK_SOURCE_DIR "/rkcore");
    QCOMPARE(resolve(root, QStringLiteral("app/rkapp.h")), QStringLiteral("shell/app"));
    QCOMPARE(resolve(root, QStringLiteral("rkcoreglobal.h")), QStringLiteral("base"));
    QVERIFY(resolve(root, QStringLiteral("rknode.h")).isEmpty());
    QVERIFY(layerOf(QStringLiteral("shell/app")) > layerOf(QStringLiteral("model/scene")));
}

QTEST_GUILESS_MAIN(TestRkCoreLayers)
#include "tst_rkcorelayers.moc"
