#include "scene/rkscenefile.h"

#include "io/rkfileformat.h"
#include "io/rkinfile_p.h"
#include "io/rkoutfile_p.h"
#include "log/rklog.h"
#include "plugin/rkclassfactory.h"
#include "plugin/rkguid.h"
#include "plugin/rkpluginmgr.h"
#include "properties/rkproperty.h"
#include "scene/rkscene.h"

#include <QFile>
#include <QHash>
#include <QSaveFile>

#include <exception>
#include <vector>

using namespace RkFileFormat;

namespace
{

void setError(QString* error, const QString& message)
{
    if (error)
        *error = message;
}

// Stored objects are written with the GUID of their class and made again through the class
// registry, which knows the core's scene classes and the classes of modules alike.
QString storedClassGuid(const QString& className)
{
    RkPluginMgr* registry = RkPluginMgr::instance();
    RkClassFactory* factory = registry ? registry->findClassFactory(className) : nullptr;
    return factory ? factory->getGUID().toString() : QString();
}

RkBase* createStoredObject(const QString& guid, QString* error)
{
    RkPluginMgr* registry = RkPluginMgr::instance();
    const RkGUID id = RkGUID::fromString(guid);
    RkClassFactory* factory = registry && !id.isNull() ? registry->findClassFactory(id) : nullptr;
    if (!factory) {
        *error = QStringLiteral("no class is known by the GUID %1").arg(guid);
        return nullptr;
    }
    QObject* made = factory->createInstance();
    if (!made) {
        *error = QStringLiteral("the class factory of %1 made nothing").arg(factory->className());
        return nullptr;
    }
    auto* object = qobject_cast<RkBase*>(made);
    if (!object) {
        delete made;
        *error = QStringLiteral("%1 (GUID %2) is not a class that a scene can store")
                     .arg(factory->className(), guid);
    }
    return object;
}

QString describe(const QObject* object)
{
    const QString name = object->objectName();
    const QString cls = QString::fromLatin1(object->metaObject()->className());
    return name.isEmpty() ? cls : QStringLiteral("%1 \"%2\"").arg(cls, name);
}

} // namespace

QByteArray RkSceneWriter::write(const RkNodeList& nodes, QString* error, const QString& fileName)
{
    // The object table: the nodes first, then every object they point at, in the order met.
    QList<const RkBase*> objects;
    QHash<const QObject*, int> indexOf;
    QHash<const QObject*, int> references;
    for (const RkNode* node : nodes) {
        if (node && !indexOf.contains(node)) {
            indexOf.insert(node, objects.size());
            objects.append(node);
        }
    }

    RkOutFile out;
    out.d->fileName = fileName;
    out.d->resolve = [&](const RkBase* object, quint8& kind, qint32& target, QString& property) {
        if (auto* p = qobject_cast<const RkProperty*>(object)) {
            const RkElement* owner = RkElement::elementOf(p);
            const auto it = indexOf.constFind(owner);
            if (it == indexOf.constEnd() || !qobject_cast<const RkNode*>(owner)) {
                rkLog(QStringLiteral("Saving: a pointer to property \"%1\" of something that "
                                     "is not saved is stored as null")
                          .arg(p->getName()));
                kind = PointerNull;
                return true;
            }
            kind = PointerProperty;
            target = *it;
            property = p->getName();
            return true;
        }
        if (qobject_cast<const RkNode*>(object)) {
            const auto it = indexOf.constFind(object);
            if (it == indexOf.constEnd()) {
                rkLog(QStringLiteral("Saving: a pointer to %1, which is not in the scene, is "
                                     "stored as null")
                          .arg(describe(object)));
                kind = PointerNull;
                return true;
            }
            kind = PointerObject;
            target = *it;
            return true;
        }
        // Any other object belongs to the one pointing at it, so only one may point at it.
        if (references.value(object) > 0) {
            out.setError(QStringLiteral("%1 is pointed at twice").arg(describe(object)));
            return false;
        }
        references[object]++;
        auto it = indexOf.constFind(object);
        if (it == indexOf.constEnd()) {
            it = indexOf.insert(object, objects.size());
            objects.append(object);
        }
        kind = PointerObject;
        target = *it;
        return true;
    };

    QByteArray body;
    for (int i = 0; i < objects.size(); ++i) {
        const RkBase* object = objects.at(i);
        const QString cls = object->className();
        const QString guid = storedClassGuid(cls);
        if (guid.isEmpty()) {
            setError(error, QStringLiteral("%1 cannot be stored: its class has no class "
                                           "factory")
                                .arg(describe(object)));
            return QByteArray();
        }
        out.d->sections.clear();
        out.d->sectionCount = 0;
        out.d->inSection = false;
        try {
            object->save(&out);
        } catch (const QString& message) {
            out.setError(message);
        } catch (const std::exception& e) {
            out.setError(QString::fromLocal8Bit(e.what()));
        }
        if (out.d->inSection)
            out.setError(QStringLiteral("%1 left a section open").arg(describe(object)));
        if (out.hasError()) {
            setError(
                error,
                QStringLiteral("Saving %1 failed: %2").arg(describe(object), out.errorString()));
            return QByteArray();
        }
        QByteArray record;
        putString(record, guid);
        putString(record, cls);
        putString(record, object->getName());
        put<quint32>(record, out.d->sectionCount);
        record.append(out.d->sections);
        put<quint32>(body, quint32(record.size()));
        body.append(record);
    }

    QByteArray file;
    file.reserve(HeaderSize + body.size());
    file.append(Magic, 8);
    put<quint32>(file, Version);
    put<quint32>(file, quint32(objects.size()));
    put<quint32>(file, quint32(body.size()));
    put<quint32>(file, crc32(body.constData(), body.size()));
    file.append(body);
    return file;
}

bool RkSceneWriter::writeFile(const RkNodeList& nodes, const QString& path, QString* error)
{
    QString problem;
    const QByteArray bytes = write(nodes, &problem, path);
    if (bytes.isEmpty()) {
        setError(error, problem);
        return false;
    }
    // The old file stays until the new one is complete.
    QSaveFile file(path);
    if (!file.open(QIODevice::WriteOnly)) {
        setError(error, QStringLiteral("Cannot write \"%1\": %2").arg(path, file.errorString()));
        return false;
    }
    if (file.write(bytes) != bytes.size() || !file.commit()) {
        setError(error, QStringLiteral("Cannot write \"%1\": %2").arg(path, file.errorString()));
        return false;
    }
    return true;
}

struct RkSceneReader::Private {
    struct Section {
        short id = 0;
        int offset = 0;
        int length = 0;
    };
    struct Record {
        QString guid;
        QString className;
        QString name;
        QVector<Section> sections;
    };

    bool verifyChecksum = true;
    QString error;
    RkInFile file;
    std::vector<QPointer<RkBase>> objects;
    std::vector<bool> isNode;
    std::vector<bool> adopted;
    bool nodesTaken = false;

    bool fail(const QString& message)
    {
        if (error.isEmpty())
            error = message;
        return false;
    }
    bool parse(QVector<Record>& records);
    bool build(const QVector<Record>& records);
    bool resolvePointers();
    bool checkHierarchy();
    void discard();
};

bool RkSceneReader::Private::parse(QVector<Record>& records)
{
    const QByteArray& data = file.d->data;
    if (data.size() < HeaderSize)
        return fail(QStringLiteral("the file is too short to be a scene file"));
    if (std::memcmp(data.constData(), Magic, 8) != 0)
        return fail(QStringLiteral("the file is not a scene file"));
    const char* p = data.constData();
    const quint32 version = get<quint32>(p + 8);
    const quint32 count = get<quint32>(p + 12);
    const quint32 bodyLength = get<quint32>(p + 16);
    const quint32 crc = get<quint32>(p + 20);
    if (version == 0 || version > Version)
        return fail(QStringLiteral("the file has format version %1; this program reads up to "
                                   "version %2")
                        .arg(version)
                        .arg(Version));
    file.d->version = int(version);
    const quint32 available = quint32(data.size() - HeaderSize);
    if (bodyLength > available)
        return fail(QStringLiteral("the file is truncated: %1 of %2 bytes are there")
                        .arg(available)
                        .arg(bodyLength));
    if (bodyLength < available)
        return fail(
            QStringLiteral("the file has %1 bytes after its end").arg(available - bodyLength));
    if (verifyChecksum && crc32(p + HeaderSize, int(bodyLength)) != crc)
        return fail(QStringLiteral("the file is damaged: its checksum does not match"));
    // Every record takes at least 20 bytes, which bounds the count before anything is
    // allocated for it.
    if (count > bodyLength / 20 + 1)
        return fail(QStringLiteral("the file claims %1 objects, more than it can hold").arg(count));

    int pos = HeaderSize;
    const int fileEnd = data.size();
    auto readString = [&](int end, QString& out) {
        if (end - pos < 4)
            return false;
        const quint32 n = get<quint32>(p + pos);
        if (n > quint32(end - pos - 4))
            return false;
        out = QString::fromUtf8(p + pos + 4, int(n));
        pos += 4 + int(n);
        return true;
    };
    records.reserve(int(count));
    for (quint32 i = 0; i < count; ++i) {
        if (fileEnd - pos < 4)
            return fail(QStringLiteral("object %1 is missing: the file ends early").arg(i));
        const quint32 length = get<quint32>(p + pos);
        pos += 4;
        if (length > quint32(fileEnd - pos))
            return fail(QStringLiteral("object %1 runs past the end of the file").arg(i));
        const int end = pos + int(length);
        Record record;
        quint32 sectionCount = 0;
        if (!readString(end, record.guid) || !readString(end, record.className) ||
            !readString(end, record.name) || end - pos < 4)
            return fail(QStringLiteral("the header of object %1 is broken").arg(i));
        sectionCount = get<quint32>(p + pos);
        pos += 4;
        if (sectionCount > quint32(end - pos) / 6)
            return fail(QStringLiteral("object %1 claims more sections than it holds").arg(i));
        for (quint32 s = 0; s < sectionCount; ++s) {
            if (end - pos < 6)
                return fail(QStringLiteral("section %1 of object %2 is cut off").arg(s).arg(i));
            Section section;
            section.id = get<qint16>(p + pos);
            const quint32 sectionLength = get<quint32>(p + pos + 2);
            pos += 6;
            if (sectionLength > quint32(end - pos))
                return fail(QStringLiteral("section 0x%1 of object %2 (%3) runs past its "
                                           "object")
                                .arg(quint16(section.id), 0, 16)
                                .arg(i)
                                .arg(record.className));
            section.offset = pos;
            section.length = int(sectionLength);
            pos += int(sectionLength);
            record.sections.append(section);
        }
        if (pos != end)
            return fail(QStringLiteral("object %1 (%2) has %3 bytes after its last section")
                            .arg(i)
                            .arg(record.className)
                            .arg(end - pos));
        records.append(record);
    }
    if (pos != fileEnd)
        return fail(QStringLiteral("the file holds more than its %1 objects").arg(count));
    return true;
}

bool RkSceneReader::Private::build(const QVector<Record>& records)
{
    for (int i = 0; i < records.size(); ++i) {
        const Record& record = records.at(i);
        QString problem;
        RkBase* object = createStoredObject(record.guid, &problem);
        if (!object)
            return fail(QStringLiteral("object %1 (%2) cannot be made: %3")
                            .arg(i)
                            .arg(record.className, problem));
        objects.emplace_back(object);
        isNode.push_back(qobject_cast<RkNode*>(object) != nullptr);
        adopted.push_back(false);
        object->setName(record.name);
    }

    RkInFile::Private* in = file.d.get();
    for (int i = 0; i < records.size(); ++i) {
        RkBase* object = objects[size_t(i)];
        if (!object)
            return fail(QStringLiteral("object %1 (%2) was deleted while the file was read")
                            .arg(i)
                            .arg(records.at(i).className));
        in->currentObject = i;
        in->currentClass = object->className();
        try {
            object->startLoad(&file);
            for (const Section& section : records.at(i).sections) {
                if (file.hasError())
                    break;
                in->inSection = true;
                in->sectionId = section.id;
                in->pos = section.offset;
                in->end = section.offset + section.length;
                object->loadSection(&file, section.id);
                in->inSection = false;
            }
            if (!file.hasError())
                object->finishLoad(&file);
        } catch (const QString& message) {
            in->inSection = false;
            return fail(QStringLiteral("object %1 (%2): %3").arg(i).arg(in->currentClass, message));
        } catch (const std::exception& e) {
            in->inSection = false;
            return fail(QStringLiteral("object %1 (%2): %3")
                            .arg(i)
                            .arg(in->currentClass, QString::fromLocal8Bit(e.what())));
        }
        if (file.hasError())
            return fail(file.errorString());
    }
    in->currentObject = -1;
    return true;
}

bool RkSceneReader::Private::resolvePointers()
{
    const auto& refs = file.d->refs;
    const int count = int(objects.size());
    std::vector<int> referenced(objects.size(), 0);
    for (const RkInFile::Private::PointerRef& ref : refs) {
        RkBase* owner = objects[size_t(ref.owner)];
        const QString where = QStringLiteral("a pointer in section 0x%1 of object %2")
                                  .arg(quint16(ref.section), 0, 16)
                                  .arg(ref.owner);
        if (!owner)
            return fail(QStringLiteral("%1: its object is gone").arg(where));
        RkBase* target = nullptr;
        if (ref.kind == PointerObject || ref.kind == PointerProperty) {
            if (ref.target < 0 || ref.target >= count)
                return fail(QStringLiteral("%1 refers to object %2, which the file does not hold")
                                .arg(where)
                                .arg(ref.target));
            target = objects[size_t(ref.target)];
            if (!target)
                return fail(QStringLiteral("%1 refers to object %2, which is gone")
                                .arg(where)
                                .arg(ref.target));
        }
        if (ref.kind == PointerProperty) {
            auto* node = qobject_cast<RkNode*>(target);
            if (!node)
                return fail(QStringLiteral("%1 refers to a property of object %2, which is not "
                                           "a node")
                                .arg(where)
                                .arg(ref.target));
            target = node->findProperty(ref.property);
            if (!target)
                return fail(QStringLiteral("%1 refers to property \"%2\", which node \"%3\" "
                                           "does not have")
                                .arg(where, ref.property, node->getName()));
        } else if (ref.kind == PointerObject && !isNode[size_t(ref.target)]) {
            // An object that is not a node belongs to the one object that points at it.
            if (ref.target == ref.owner)
                return fail(QStringLiteral("%1 refers to its own object").arg(where));
            if (referenced[size_t(ref.target)]++ > 0)
                return fail(
                    QStringLiteral("object %1 is pointed at more than once").arg(ref.target));
        }
        try {
            owner->setPointer(&file, ref.section, ref.index, target);
        } catch (const QString& message) {
            return fail(QStringLiteral("%1: %2").arg(where, message));
        } catch (const std::exception& e) {
            return fail(QStringLiteral("%1: %2").arg(where, QString::fromLocal8Bit(e.what())));
        }
        if (ref.kind == PointerObject && !isNode[size_t(ref.target)])
            adopted[size_t(ref.target)] = true;
    }
    return true;
}

bool RkSceneReader::Private::checkHierarchy()
{
    // Depths with memory, so that long chains cost one walk each.
    QHash<const RkNode*, int> depth;
    for (size_t i = 0; i < objects.size(); ++i) {
        auto* node = isNode[i] ? static_cast<RkNode*>(objects[i].data()) : nullptr;
        if (!node)
            continue;
        QList<const RkNode*> chain;
        int base = 0;
        for (const RkNode* n = node; n; n = n->getNodeParent()) {
            const auto known = depth.constFind(n);
            if (known != depth.constEnd()) {
                base = *known;
                break;
            }
            chain.append(n);
        }
        for (int k = chain.size() - 1; k >= 0; --k)
            depth.insert(chain.at(k), ++base);
        if (base > RkNode::MaxHierarchyDepth)
            return fail(QStringLiteral("the node hierarchy is deeper than %1 levels")
                            .arg(RkNode::MaxHierarchyDepth));
    }
    return true;
}

void RkSceneReader::Private::discard()
{
    // Nodes first: they take their data items, and those what they adopted. Whatever is left
    // was adopted by nobody.
    for (size_t i = 0; i < objects.size(); ++i) {
        if (isNode[i] && !nodesTaken)
            delete objects[i].data();
    }
    for (size_t i = 0; i < objects.size(); ++i) {
        if (!isNode[i] && !adopted[i])
            delete objects[i].data();
    }
}

RkSceneReader::RkSceneReader() : d(std::make_unique<Private>()) {}

RkSceneReader::~RkSceneReader()
{
    d->discard();
}

void RkSceneReader::setVerifyChecksum(bool on)
{
    d->verifyChecksum = on;
}

bool RkSceneReader::read(const QByteArray& bytes, const QString& fileName)
{
    if (!d->objects.empty() || !d->error.isEmpty()) {
        d->error = QStringLiteral("a reader reads one file only");
        return false;
    }
    d->file.d->data = bytes;
    d->file.d->fileName = fileName;
    QVector<Private::Record> records;
    bool ok = d->parse(records) && d->build(records) && d->resolvePointers() && d->checkHierarchy();
    if (ok) {
        // Content that the file names but does not hold, such as geometry, is rebuilt now,
        // while a failure can still leave the scene alone.
        try {
            for (size_t i = 0; i < d->objects.size(); ++i) {
                if (d->isNode[i] && d->objects[i])
                    RkScene::buildFromSource(static_cast<RkNode*>(d->objects[i].data()),
                                             d->file.fileName());
            }
        } catch (const QString& message) {
            ok = d->fail(message);
        } catch (const std::exception& e) {
            ok = d->fail(QString::fromLocal8Bit(e.what()));
        }
    }
    if (!ok) {
        d->discard();
        d->objects.clear();
        d->isNode.clear();
        d->adopted.clear();
        return false;
    }
    // Objects nobody took are of no use to anyone.
    for (size_t i = 0; i < d->objects.size(); ++i) {
        if (!d->isNode[i] && !d->adopted[i] && d->objects[i]) {
            rkLog(QStringLiteral("Loading: object %1 (%2) belongs to nothing and was dropped")
                      .arg(i)
                      .arg(d->objects[i]->className()));
            delete d->objects[i].data();
        }
    }
    return true;
}

bool RkSceneReader::readFile(const QString& path)
{
    QFile f(path);
    if (!f.open(QIODevice::ReadOnly)) {
        d->error = QStringLiteral("cannot open \"%1\": %2").arg(path, f.errorString());
        return false;
    }
    return read(f.readAll(), path);
}

QString RkSceneReader::errorString() const
{
    return d->error;
}

RkNodeList RkSceneReader::takeNodes()
{
    RkNodeList nodes;
    for (size_t i = 0; i < d->objects.size(); ++i) {
        if (d->isNode[i] && d->objects[i])
            nodes.append(static_cast<RkNode*>(d->objects[i].data()));
    }
    d->nodesTaken = true;
    return nodes;
}

void RkSceneReader::postLoad()
{
    for (size_t i = 0; i < d->objects.size(); ++i) {
        RkBase* object = d->objects[i];
        if (!object)
            continue;
        try {
            object->postLoadFile(&d->file);
        } catch (const QString& message) {
            rkLog(QStringLiteral("Loading: %1 failed after the load: %2")
                      .arg(describe(object), message));
        } catch (const std::exception& e) {
            rkLog(QStringLiteral("Loading: %1 failed after the load: %2")
                      .arg(describe(object), QString::fromLocal8Bit(e.what())));
        }
    }
}
