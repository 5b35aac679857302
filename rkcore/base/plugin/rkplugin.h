#pragma once

#include "rkcoreglobal.h"

#include <QList>
#include <QString>

class RkClassFactory;

// What a module tells the host about itself: name, author, packed version, description and its
// class factories in registration order. The module owns the object and its factories.
class RKCORE_EXPORT RkPlugin
{
public:
    RkPlugin(const QString& name, const QString& author, const QString& description,
             quint32 version);
    ~RkPlugin();

    RkPlugin(const RkPlugin&) = delete;
    RkPlugin& operator=(const RkPlugin&) = delete;

    QString getName() const { return m_name; }
    QString getAuthor() const { return m_author; }
    QString getDescription() const { return m_description; }
    quint32 getVersion() const { return m_version; }

    void setName(const QString& name) { m_name = name; }
    void setAuthor(const QString& author) { m_author = author; }
    void setDescription(const QString& description) { m_description = description; }
    void setVersion(quint32 version) { m_version = version; }

    // Appends a factory; the same factory is never listed twice.
    void addClassFactory(RkClassFactory* factory);
    const QList<RkClassFactory*>& getClassFactories() const { return m_factories; }
    int getNumClassFactories() const { return m_factories.size(); }
    RkClassFactory* getClassFactory(int index) const { return m_factories.value(index); }

    // Packed versions hold major, minor, revision and build in one byte each, major on top.
    static quint32 packVersion(int major, int minor, int revision, int build);
    // "2.0.8.32" for 0x02000820.
    static QString versionToString(quint32 version);

private:
    QString m_name;
    QString m_author;
    QString m_description;
    quint32 m_version = 0;
    QList<RkClassFactory*> m_factories;
};
