#pragma once

#include "rkcoreglobal.h"

#include <QObject>

class RkInFile;
class RkOutFile;

// A storable object of the scene. The scene file writes every stored object with save() and,
// when reading, creates it through its class factory and hands it the stored sections:
// startLoad(), loadSection() once per section, finishLoad(), then setPointer() once for every
// stored pointer it read, in stored order, and finally postLoadFile() once the load is complete.
class RKCORE_EXPORT RkBase : public QObject
{
    Q_OBJECT
public:
    explicit RkBase(QObject* parent = nullptr, const QString& name = QString());
    ~RkBase() override;

    virtual QString getName() const;
    virtual void setName(const QString& name);

    virtual void startLoad(RkInFile* file);
    // Reads one section. A section id the object does not know fails the load.
    virtual void loadSection(RkInFile* file, short sectionId);
    virtual void finishLoad(RkInFile* file);
    virtual void postLoadFile(RkInFile* file);
    // Resolves a pointer read with RkInFile::readPointer() in section sectionId. An object that
    // was created for the file and is handed over here belongs to this object from now on;
    // an object of the wrong class must be refused by throwing a QString (the asserting cast
    // does). The default throws: a class that reads pointers resolves them itself.
    virtual void setPointer(const RkInFile* file, short sectionId, short index, RkBase* object);
    virtual void setStorablePaths(const QString& basePath);
    // Writes the object's sections.
    virtual void save(RkOutFile* file) const;
    // Marks the object as one the scene file stores.
    virtual void makePersistent();
    virtual QString className() const;
    virtual bool inherits(const char* className) const;

    bool isPersistent() const;

private:
    bool m_persistent = false;
};
