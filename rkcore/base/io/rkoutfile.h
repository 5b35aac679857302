#pragma once

#include "rkcoreglobal.h"

#include <QByteArray>
#include <QString>

#include <memory>

class RkBase;

// What a stored object writes its sections into (RkBase::save). A section is a run of typed
// values under a 16-bit id; sections do not nest. A pointer refers to another object of the
// file: a node of the scene, a property of such a node, or any other RkBase, which is then
// stored too (it belongs to the object that points at it).
class RKCORE_EXPORT RkOutFile
{
public:
    ~RkOutFile();
    RkOutFile(const RkOutFile&) = delete;
    RkOutFile& operator=(const RkOutFile&) = delete;

    void startSection(short id);
    void endSection();

    void writeInt(int value);
    void writeFloat(float value);
    void writeDouble(double value);
    void writeBool(bool value);
    void writeString(const QString& value);
    void writeByteArray(const QByteArray& value);
    // A reference to object (null is allowed); index is handed back to setPointer on load.
    void writePointer(const RkBase* object, short index);

    // A section holding one pointer.
    void writePointerSection(short id, const RkBase* object, short index);
    // A section holding one byte array.
    void writeByteArraySection(short id, const QByteArray& bytes);

    // The file being written, when the writer knows it; empty otherwise.
    QString fileName() const;

    bool hasError() const;
    QString errorString() const;
    void setError(const QString& message);

private:
    friend class RkSceneWriter;
    RkOutFile();

    struct Private;
    std::unique_ptr<Private> d;
};
