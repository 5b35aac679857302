#pragma once

#include "scene/rknode.h"

#include <QByteArray>
#include <QPointer>

#include <memory>

// Writes the scene file of a list of nodes: every node, its properties' definitions, values
// and flags, its data items and every object they point at.
class RKCORE_EXPORT RkSceneWriter
{
public:
    // fileName: where the bytes will be stored, so that sources beside it are stored relative.
    static QByteArray write(const RkNodeList& nodes, QString* error = nullptr,
                            const QString& fileName = QString());
    static bool writeFile(const RkNodeList& nodes, const QString& path, QString* error = nullptr);
};

// Reads a scene file into new objects without touching the scene. Until takeNodes() the reader
// owns what it made, and deletes all of it when it is destroyed, so a failed read leaks
// nothing and changes nothing.
class RKCORE_EXPORT RkSceneReader
{
public:
    RkSceneReader();
    ~RkSceneReader();
    RkSceneReader(const RkSceneReader&) = delete;
    RkSceneReader& operator=(const RkSceneReader&) = delete;

    // Only for fuzzing and tests that want to reach the structure checks behind the checksum.
    void setVerifyChecksum(bool on);

    bool read(const QByteArray& bytes, const QString& fileName = QString());
    bool readFile(const QString& path);
    QString errorString() const;

    // Hands over the loaded nodes, parents before children; the caller owns them from now on.
    RkNodeList takeNodes();
    // Calls postLoadFile() on every loaded object that is still alive.
    void postLoad();

private:
    struct Private;
    std::unique_ptr<Private> d;
};
