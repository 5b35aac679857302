#include "io/rkbase.h"

#include "io/rkinfile.h"

RkBase::RkBase(QObject* parent, const QString& name) : QObject(parent)
{
    setObjectName(name);
}

RkBase::~RkBase() = default;

QString RkBase::getName() const
{
    return objectName();
}

void RkBase::setName(const QString& name)
{
    setObjectName(name);
}

void RkBase::startLoad(RkInFile*) {}

void RkBase::loadSection(RkInFile* file, short sectionId)
{
    file->setError(QStringLiteral("%1 does not know section 0x%2")
                       .arg(className())
                       .arg(quint16(sectionId), 0, 16));
}

void RkBase::finishLoad(RkInFile*) {}

void RkBase::postLoadFile(RkInFile*) {}

void RkBase::setPointer(const RkInFile*, short sectionId, short, RkBase*)
{
    // A pointer nobody takes would leave its object to nobody: the load fails instead.
    throw QStringLiteral("%1 takes no pointer from section 0x%2")
        .arg(className())
        .arg(quint16(sectionId), 0, 16);
}

void RkBase::setStorablePaths(const QString&) {}

void RkBase::save(RkOutFile*) const {}

void RkBase::makePersistent()
{
    m_persistent = true;
}

QString RkBase::className() const
{
    return QString::fromLatin1(metaObject()->className());
}

bool RkBase::inherits(const char* name) const
{
    return QObject::inherits(name);
}

bool RkBase::isPersistent() const
{
    return m_persistent;
}
