#include "plugin/rkplugin.h"

RkPlugin::RkPlugin(const QString& name, const QString& author, const QString& description,
                   quint32 version)
    : m_name(name), m_author(author), m_description(description), m_version(version)
{
}

RkPlugin::~RkPlugin() = default;

void RkPlugin::addClassFactory(RkClassFactory* factory)
{
    if (factory && !m_factories.contains(factory))
        m_factories.append(factory);
}

quint32 RkPlugin::packVersion(int major, int minor, int revision, int build)
{
    return (quint32(major & 0xff) << 24) | (quint32(minor & 0xff) << 16) |
           (quint32(revision & 0xff) << 8) | quint32(build & 0xff);
}

QString RkPlugin::versionToString(quint32 version)
{
    return QStringLiteral("%1.%2.%3.%4")
        .arg(version >> 24)
        .arg((version >> 16) & 0xff)
        .arg((version >> 8) & 0xff)
        .arg(version & 0xff);
}
