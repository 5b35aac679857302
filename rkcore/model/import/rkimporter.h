#pragma once

#include "rkcoreglobal.h"

#include <QString>
#include <QStringList>

#include <functional>
#include <memory>

class RkNode;
class RkScene;

// Imports a model file (any format the import library reads) as one node: a figure (RkSkeleton
// with its bones) when the file has a skeleton, else a prop. read() does the slow part and
// touches no scene, so it may run on a worker thread; addToScene() then builds the nodes.
//
// What is made: one mesh of triangles and quads (larger polygons become fans), the first UV
// channel, one shape per source mesh (all shapes share the node's material list, so a facet's
// material index means the same in each), materials with name, diffuse colour and texture,
// bones in the file's hierarchy turning about their joints, linear blend skinning with at most
// four influences per vertex, and morph targets as float properties (0..1, clamped, percent)
// under "Morphs/<mesh name>". Positions are converted to metres with Y up and the model is
// set on the floor, centred.
class RKCORE_EXPORT RkImporter
{
public:
    RkImporter();
    ~RkImporter();
    RkImporter(const RkImporter&) = delete;
    RkImporter& operator=(const RkImporter&) = delete;

    // Makes scenes rebuild imported nodes from their files on load (and store the paths relative
    // to the scene file when the model lies beside it). Safe to call more than once.
    static void registerFileSource();
    // Problems met while rebuilding imported nodes since the last call (missing or changed
    // files), one sentence each; the list is emptied.
    static QStringList takeSourceProblems();

    // File dialog patterns of every format the import library reads ("*.gltf *.glb ...").
    static QStringList filePatterns();

    // Called now and then during read() with the progress (0..1); returning false cancels.
    void setProgressCallback(std::function<bool(float)> callback);

    // Reads and checks the file. False when it is refused (unreadable, unsupported, broken
    // beyond repair, cancelled): errorString() says why. Repairs made are listed by warnings().
    bool read(const QString& path);
    QString errorString() const;
    QStringList warnings() const;
    bool wasCancelled() const;

    // The source key of the file read: "file:", its path, "#" and a fingerprint of its bytes.
    QString getSource() const;
    int getNumVertices() const;
    bool hasSkeleton() const;

    // Adds the model read to the scene as a new node (a figure comes with its bones), named after
    // the file and unique in the scene; null when nothing was read. Once only.
    RkNode* addToScene(RkScene* scene);
    // Gives an existing node the model read: its geometry, materials and morphs, and skinning to
    // the bones of the node's figure found by name. Properties it already has are reused. Once.
    void applyTo(RkNode* node);

private:
    struct Private;
    std::unique_ptr<Private> d;
};
