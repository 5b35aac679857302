#include "scene/rkscene.h"

#include "scene/rkscenefile.h"
#include "undo/rkundostack.h"

#include <QHash>

RkScene* rkScene = nullptr;

namespace
{

QHash<QString, RkScene::SourceBuilder>& sourceBuilders()
{
    static QHash<QString, RkScene::SourceBuilder> builders;
    return builders;
}

struct Scheme {
    RkScene::SchemeBuilder builder;
    RkScene::SchemeStorer storer;
};

QHash<QString, Scheme>& sourceSchemes()
{
    static QHash<QString, Scheme> schemes;
    return schemes;
}

const Scheme* schemeOf(const QString& source)
{
    const int colon = source.indexOf(QLatin1Char(':'));
    if (colon <= 0)
        return nullptr;
    const auto it = sourceSchemes().constFind(source.left(colon));
    return it == sourceSchemes().constEnd() ? nullptr : &*it;
}

} // namespace

struct RkScene::Private {
    RkNodeList nodes;
    RkNodeList selection;
    RkNode* primary = nullptr;
    double time = 0.0;
    bool playing = false;
    QString fileName;
};

RkScene::RkScene(QObject* parent) : QObject(parent), d(std::make_unique<Private>()) {}

RkScene::~RkScene()
{
    // Nodes go silently: nobody should hear from a scene that is being destroyed.
    const RkNodeList nodes = d->nodes;
    d->nodes.clear();
    d->selection.clear();
    d->primary = nullptr;
    for (RkNode* node : nodes)
        disconnect(node, nullptr, this, nullptr);
    for (int i = nodes.size() - 1; i >= 0; --i)
        delete nodes.at(i);
}

void RkScene::addNode(RkNode* node)
{
    if (!node || d->nodes.contains(node))
        return;
    node->setParent(this);
    d->nodes.append(node);
    // A node deleted by someone else leaves the scene as it goes.
    connect(node, &QObject::destroyed, this, [this](QObject* object) {
        for (int i = d->nodes.size() - 1; i >= 0; --i) {
            if (static_cast<QObject*>(d->nodes.at(i)) == object)
                d->nodes.removeAt(i);
        }
        bool listChanged = false;
        for (int i = d->selection.size() - 1; i >= 0; --i) {
            if (static_cast<QObject*>(d->selection.at(i)) == object) {
                d->selection.removeAt(i);
                listChanged = true;
            }
        }
        const bool primaryChanged = static_cast<QObject*>(d->primary) == object;
        if (primaryChanged)
            d->primary = d->selection.isEmpty() ? nullptr : d->selection.last();
        if (listChanged)
            Q_EMIT nodeSelectionListChanged();
        if (primaryChanged)
            Q_EMIT primarySelectionChanged(d->primary);
    });
    Q_EMIT nodeAdded(node);
}

void RkScene::detachFromSelection(RkNode* node, bool& listChanged, bool& primaryChanged)
{
    if (d->selection.removeAll(node)) {
        node->setSelectedFlag(false);
        listChanged = true;
    }
    if (d->primary == node) {
        d->primary = d->selection.isEmpty() ? nullptr : d->selection.last();
        primaryChanged = true;
    }
}

void RkScene::removeNode(RkNode* node)
{
    if (!node || !d->nodes.contains(node))
        return;
    // Everything below the node goes too, deepest first.
    RkNodeList doomed;
    std::function<void(RkNode*)> collect = [&](RkNode* n) {
        for (RkNode* child : n->getNodeChildren())
            collect(child);
        if (d->nodes.contains(n))
            doomed.append(n);
    };
    collect(node);

    bool listChanged = false;
    bool primaryChanged = false;
    for (RkNode* n : qAsConst(doomed))
        detachFromSelection(n, listChanged, primaryChanged);
    if (listChanged)
        Q_EMIT nodeSelectionListChanged();
    if (primaryChanged)
        Q_EMIT primarySelectionChanged(d->primary);

    for (RkNode* n : qAsConst(doomed)) {
        Q_EMIT nodeRemoved(n);
        d->nodes.removeAll(n);
        delete n;
    }
}

int RkScene::getNumNodes() const
{
    return d->nodes.size();
}

RkNode* RkScene::getNode(int index) const
{
    return d->nodes.value(index);
}

RkNodeList RkScene::getNodes() const
{
    return d->nodes;
}

RkNodeListIterator RkScene::nodeListIterator() const
{
    return RkNodeListIterator(d->nodes);
}

RkNode* RkScene::findNode(const QString& name) const
{
    for (RkNode* node : d->nodes) {
        if (node->getName() == name)
            return node;
    }
    return nullptr;
}

bool RkScene::contains(const RkNode* node) const
{
    return d->nodes.contains(const_cast<RkNode*>(node));
}

void RkScene::selectNode(RkNode* node, bool addToSelection)
{
    if (!node || !d->nodes.contains(node))
        return;
    bool listChanged = false;
    if (!addToSelection) {
        for (RkNode* n : qAsConst(d->selection)) {
            if (n != node) {
                n->setSelectedFlag(false);
                listChanged = true;
            }
        }
        const bool had = d->selection.contains(node);
        d->selection.clear();
        d->selection.append(node);
        listChanged = listChanged || !had;
    } else if (!d->selection.contains(node)) {
        d->selection.append(node);
        listChanged = true;
    }
    node->setSelectedFlag(true);
    const bool primaryChanged = d->primary != node;
    d->primary = node;
    if (listChanged)
        Q_EMIT nodeSelectionListChanged();
    if (primaryChanged)
        Q_EMIT primarySelectionChanged(node);
}

void RkScene::deselectNode(RkNode* node)
{
    bool listChanged = false;
    bool primaryChanged = false;
    detachFromSelection(node, listChanged, primaryChanged);
    if (listChanged)
        Q_EMIT nodeSelectionListChanged();
    if (primaryChanged)
        Q_EMIT primarySelectionChanged(d->primary);
}

void RkScene::clearSelection()
{
    if (d->selection.isEmpty() && !d->primary)
        return;
    for (RkNode* n : qAsConst(d->selection))
        n->setSelectedFlag(false);
    const bool listChanged = !d->selection.isEmpty();
    d->selection.clear();
    const bool primaryChanged = d->primary != nullptr;
    d->primary = nullptr;
    if (listChanged)
        Q_EMIT nodeSelectionListChanged();
    if (primaryChanged)
        Q_EMIT primarySelectionChanged(nullptr);
}

RkNodeListIterator RkScene::selectedNodeListIterator() const
{
    return RkNodeListIterator(d->selection);
}

RkNodeList RkScene::getSelectedNodes() const
{
    return d->selection;
}

int RkScene::getNumSelectedNodes() const
{
    return d->selection.size();
}

RkNode* RkScene::getPrimarySelection() const
{
    return d->primary;
}

double RkScene::getTime() const
{
    return d->time;
}

void RkScene::setTime(double seconds)
{
    if (!qIsFinite(seconds) || seconds == d->time)
        return;
    d->time = seconds;
    Q_EMIT timeChanged(seconds);
}

bool RkScene::isPlaying() const
{
    return d->playing;
}

void RkScene::setPlaying(bool playing)
{
    if (playing == d->playing)
        return;
    d->playing = playing;
    Q_EMIT playingChanged(playing);
}

void RkScene::clear()
{
    Q_EMIT sceneClearStarting();
    clearSelection();
    // Top-level nodes take their children with them; what is left goes on its own.
    while (!d->nodes.isEmpty()) {
        RkNode* top = d->nodes.last();
        while (top->getNodeParent() && d->nodes.contains(top->getNodeParent()))
            top = top->getNodeParent();
        removeNode(top);
    }
    if (rkUndoStack)
        rkUndoStack->clear();
    Q_EMIT sceneCleared();
}

bool RkScene::save(const QString& path, QString* error)
{
    if (!RkSceneWriter::writeFile(d->nodes, path, error))
        return false;
    setFileName(path);
    return true;
}

bool RkScene::load(const QString& path, QString* error)
{
    RkSceneReader reader;
    if (!reader.readFile(path)) {
        if (error)
            *error = reader.errorString();
        return false;
    }
    clear();
    Q_EMIT sceneLoadStarting();
    const RkNodeList nodes = reader.takeNodes();
    for (RkNode* node : nodes)
        addNode(node);
    reader.postLoad();
    setFileName(path);
    Q_EMIT sceneLoaded();
    return true;
}

QString RkScene::getFileName() const
{
    return d->fileName;
}

void RkScene::setFileName(const QString& path)
{
    if (path == d->fileName)
        return;
    d->fileName = path;
    Q_EMIT fileNameChanged(path);
}

void RkScene::registerSourceBuilder(const QString& source, SourceBuilder builder)
{
    if (builder)
        sourceBuilders().insert(source, std::move(builder));
    else
        sourceBuilders().remove(source);
}

void RkScene::registerSourceScheme(const QString& scheme, SchemeBuilder builder,
                                   SchemeStorer storer)
{
    if (builder)
        sourceSchemes().insert(scheme, Scheme{std::move(builder), std::move(storer)});
    else
        sourceSchemes().remove(scheme);
}

bool RkScene::buildFromSource(RkNode* node, const QString& sceneFile)
{
    if (!node || node->getSource().isEmpty())
        return false;
    const auto it = sourceBuilders().constFind(node->getSource());
    if (it != sourceBuilders().constEnd()) {
        (*it)(node);
        return true;
    }
    const Scheme* scheme = schemeOf(node->getSource());
    if (!scheme)
        return false;
    scheme->builder(node, sceneFile);
    return true;
}

QString RkScene::storedSource(const QString& source, const QString& sceneFile)
{
    if (sourceBuilders().contains(source))
        return source;
    const Scheme* scheme = schemeOf(source);
    return scheme && scheme->storer ? scheme->storer(source, sceneFile) : source;
}
