#pragma once

#include "rkcoreglobal.h"
#include "scene/rknode.h"

#include <QObject>

#include <functional>
#include <memory>

// The scene: its nodes, the selection and time. Owned by RkApp; rkScene points at it.
// The scene owns its nodes. Clearing emits sceneClearStarting(), removes every node (each emits
// nodeRemoved() and then destroyed) and emits sceneCleared(); a load that succeeds clears the
// scene that way and then emits sceneLoadStarting(), adds the loaded nodes and emits
// sceneLoaded(). A load that fails changes nothing and emits nothing.
class RKCORE_EXPORT RkScene : public QObject
{
    Q_OBJECT
public:
    explicit RkScene(QObject* parent = nullptr);
    ~RkScene() override;

    // Takes ownership. The node's hierarchy parent, if any, must be in the scene already.
    void addNode(RkNode* node);
    // Removes and deletes the node together with every node below it, deepest first.
    void removeNode(RkNode* node);
    int getNumNodes() const;
    RkNode* getNode(int index) const;
    RkNodeList getNodes() const;
    RkNodeListIterator nodeListIterator() const;
    RkNode* findNode(const QString& name) const;
    bool contains(const RkNode* node) const;

    // Selection, kept in the order the nodes were selected; the primary selection is the node
    // selected last. selectNode without addToSelection replaces the selection.
    void selectNode(RkNode* node, bool addToSelection = false);
    void deselectNode(RkNode* node);
    void clearSelection();
    RkNodeListIterator selectedNodeListIterator() const;
    RkNodeList getSelectedNodes() const;
    int getNumSelectedNodes() const;
    RkNode* getPrimarySelection() const;

    double getTime() const;
    void setTime(double seconds);
    bool isPlaying() const;
    void setPlaying(bool playing);

    // Removes every node, the selection and the undo history.
    void clear();

    // Writes the scene; an existing file is replaced only when the whole file was written.
    bool save(const QString& path, QString* error = nullptr);
    // Replaces the scene by the file's; on failure the scene stays exactly as it was.
    bool load(const QString& path, QString* error = nullptr);
    QString getFileName() const;
    void setFileName(const QString& path);

    // Builders that rebuild a node's content from its source key (RkNode::setSource) when a
    // scene is built or loaded.
    using SourceBuilder = std::function<void(RkNode*)>;
    static void registerSourceBuilder(const QString& source, SourceBuilder builder);
    // Builders for every source of one scheme, the part of the key before the first colon
    // ("file" for "file:figure.gltf"); a key registered as a whole wins over its scheme.
    // sceneFile is the scene file being loaded (empty outside a load). The storer, when given,
    // turns a key into what a scene file at sceneFile stores, for example a path relative to it.
    using SchemeBuilder = std::function<void(RkNode*, const QString& sceneFile)>;
    using SchemeStorer = std::function<QString(const QString& source, const QString& sceneFile)>;
    static void registerSourceScheme(const QString& scheme, SchemeBuilder builder,
                                     SchemeStorer storer = SchemeStorer());
    // Runs the builder registered for the node's source; false when there is none.
    static bool buildFromSource(RkNode* node, const QString& sceneFile = QString());
    // The key as a scene file at sceneFile stores it.
    static QString storedSource(const QString& source, const QString& sceneFile);

Q_SIGNALS:
    void nodeAdded(RkNode* node);
    void nodeRemoved(RkNode* node);
    void nodeSelectionListChanged();
    void primarySelectionChanged(RkNode* node);
    void materialSelectionChanged();
    void sceneLoadStarting();
    void sceneLoaded();
    void sceneClearStarting();
    void sceneCleared();
    void timeChanged(double seconds);
    void playingChanged(bool playing);
    void fileNameChanged(const QString& path);

private:
    void detachFromSelection(RkNode* node, bool& listChanged, bool& primaryChanged);

    struct Private;
    std::unique_ptr<Private> d;
};

RKCORE_EXPORT extern RkScene* rkScene;
