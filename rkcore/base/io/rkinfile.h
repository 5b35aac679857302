#pragma once

#include "rkcoreglobal.h"

#include <QByteArray>
#include <QString>

#include <memory>

class RkBase;

// What a stored object reads its sections from (RkBase::loadSection). Every read stays inside
// the current section and checks the type of the stored value; a read that fails sets the
// file's error, which fails the whole load, and leaves the target untouched.
class RKCORE_EXPORT RkInFile
{
public:
    ~RkInFile();
    RkInFile(const RkInFile&) = delete;
    RkInFile& operator=(const RkInFile&) = delete;

    bool readInt(int& value);
    // Refuses values that are not finite numbers.
    bool readFloat(float& value);
    bool readDouble(double& value);
    bool readBool(bool& value);
    bool readString(QString& value);
    bool readByteArray(QByteArray& value);
    QByteArray readByteArray();
    // Reads one stored pointer and registers it for the owner; the loader later resolves it
    // with setPointer(file, section, index, object). Returns 0 when a pointer was read and
    // non-zero when the section holds no further value (or on error), so a list of pointers
    // is read by calling it until it returns non-zero.
    int readPointer();

    // The id of the section being read and whether all of it has been read.
    short currentSection() const;
    bool atSectionEnd() const;

    QString fileName() const;
    int formatVersion() const;

    bool hasError() const;
    QString errorString() const;
    // Fails the load with this message; the first error wins.
    void setError(const QString& message);

private:
    friend class RkSceneReader;
    RkInFile();

    struct Private;
    std::unique_ptr<Private> d;
};
