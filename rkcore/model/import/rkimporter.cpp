#include "import/rkimporter.h"

#include "geometry/rkmap.h"
#include "geometry/rkpolymesh.h"
#include "log/rklog.h"
#include "properties/rkfloatproperty.h"
#include "properties/rkpropertygrouptree.h"
#include "scene/rkbone.h"
#include "scene/rkmaterial.h"
#include "scene/rkobject.h"
#include "scene/rkscene.h"
#include "scene/rkshape.h"
#include "scene/rkskeleton.h"

#include <QCryptographicHash>
#include <QDir>
#include <QFile>
#include <QFileInfo>
#include <QHash>
#include <QImage>
#include <QJsonArray>
#include <QJsonDocument>
#include <QJsonObject>
#include <QMutex>
#include <QSet>
#include <QtEndian>

#include <assimp/Importer.hpp>
#include <assimp/ProgressHandler.hpp>
#include <assimp/postprocess.h>
#include <assimp/scene.h>

#include <algorithm>
#include <cmath>

namespace
{

const int kMaxBones = 65535;
const int kMaxMaterials = 256; // a facet names its material in one byte
const int kMaxNodeDepth = 1024;

const char* const kScheme = "file";

// A 3x4 affine transform in double precision, as the import library's matrices are.
struct Affine {
    double m[3][4] = {{1, 0, 0, 0}, {0, 1, 0, 0}, {0, 0, 1, 0}};

    static Affine from(const aiMatrix4x4& a)
    {
        Affine r;
        for (int i = 0; i < 3; ++i) {
            for (int j = 0; j < 4; ++j)
                r.m[i][j] = a[i][j];
        }
        return r;
    }
    Affine operator*(const Affine& o) const
    {
        Affine r;
        for (int i = 0; i < 3; ++i) {
            for (int j = 0; j < 4; ++j) {
                double s = j == 3 ? m[i][3] : 0.0;
                for (int k = 0; k < 3; ++k)
                    s += m[i][k] * o.m[k][j];
                r.m[i][j] = s;
            }
        }
        return r;
    }
    void addScaled(const Affine& o, double w)
    {
        for (int i = 0; i < 3; ++i) {
            for (int j = 0; j < 4; ++j)
                m[i][j] += o.m[i][j] * w;
        }
    }
    void scale(double s)
    {
        for (auto& row : m) {
            for (double& v : row)
                v *= s;
        }
    }
    RkVec3 point(const aiVector3D& p) const
    {
        return RkVec3(float(m[0][0] * p.x + m[0][1] * p.y + m[0][2] * p.z + m[0][3]),
                      float(m[1][0] * p.x + m[1][1] * p.y + m[1][2] * p.z + m[1][3]),
                      float(m[2][0] * p.x + m[2][1] * p.y + m[2][2] * p.z + m[2][3]));
    }
    RkVec3 vector(const aiVector3D& p) const
    {
        return RkVec3(float(m[0][0] * p.x + m[0][1] * p.y + m[0][2] * p.z),
                      float(m[1][0] * p.x + m[1][1] * p.y + m[1][2] * p.z),
                      float(m[2][0] * p.x + m[2][1] * p.y + m[2][2] * p.z));
    }
    bool isFinite() const
    {
        for (const auto& row : m) {
            for (double v : row) {
                if (!std::isfinite(v))
                    return false;
            }
        }
        return true;
    }
};

bool finite(const RkVec3& v)
{
    return std::isfinite(v.x) && std::isfinite(v.y) && std::isfinite(v.z);
}

bool finite(const aiVector3D& v)
{
    return std::isfinite(v.x) && std::isfinite(v.y) && std::isfinite(v.z);
}

QString text(const aiString& s)
{
    return QString::fromUtf8(s.C_Str(), int(s.length)).trimmed();
}

class ProgressRelay : public Assimp::ProgressHandler
{
public:
    explicit ProgressRelay(std::function<bool(float)> callback) : m_callback(std::move(callback)) {}
    bool Update(float percentage) override
    {
        // The library's own steps make up the first nine tenths; building the mesh the rest.
        return !m_callback || m_callback(std::clamp(percentage, 0.0f, 1.0f) * 0.9f);
    }

private:
    std::function<bool(float)> m_callback;
};

struct SourceProblems {
    QMutex mutex;
    QStringList list;
};

SourceProblems& sourceProblems()
{
    static SourceProblems problems;
    return problems;
}

void reportSourceProblem(const QString& message)
{
    rkLog(QStringLiteral("Loading: %1").arg(message));
    SourceProblems& p = sourceProblems();
    QMutexLocker lock(&p.mutex);
    p.list.append(message);
}

// A short fingerprint of the file's bytes, so that a scene can tell when a model was replaced.
QString fingerprint(const QString& path)
{
    QFile f(path);
    if (!f.open(QIODevice::ReadOnly))
        return QString();
    QCryptographicHash hash(QCryptographicHash::Sha1);
    hash.addData(&f);
    return QString::fromLatin1(hash.result().toHex().left(16));
}

// "file:<path>#<fingerprint>" split into its parts.
void splitSource(const QString& source, QString& path, QString& print)
{
    QString rest = source.mid(int(qstrlen(kScheme)) + 1);
    const int hash = rest.lastIndexOf(QLatin1Char('#'));
    print = hash >= 0 ? rest.mid(hash + 1) : QString();
    path = hash >= 0 ? rest.left(hash) : rest;
}

} // namespace

struct RkImporter::Private {
    struct Material {
        QString name;
        QColor colour = QColor(200, 200, 200);
        QImage texture;
        QString textureName;
    };
    struct Bone {
        QString name;
        int parent = -1;
        RkVec3 origin;
    };
    struct Morph {
        QString group;
        QString name;
        RkMorphDeltas deltas;
    };

    QString path;
    QString fingerprint;
    QString error;
    QStringList warnings;
    // Log lines of the read, written when the model is built: the read may run on a worker
    // thread, and the log belongs to the main one.
    QStringList notes;
    bool cancelled = false;
    std::function<bool(float)> progress;

    std::unique_ptr<RkPolyMesh> mesh;
    QStringList meshNames;
    QVector<Material> materials;
    QVector<Bone> bones;
    // MaxInfluences per vertex, as the deformer keeps them.
    QVector<RkBoneInfluence> influences;
    QVector<Morph> morphs;

    bool fail(const QString& message)
    {
        error = message;
        return false;
    }
    bool report(float value)
    {
        if (progress && !progress(value))
            cancelled = true;
        return !cancelled;
    }
    bool convert(const aiScene* scene);
    Material readMaterial(const aiScene* scene, const aiMaterial* material, int index);
    void buildObject(RkNode* node);
};

RkImporter::Private::Material
RkImporter::Private::readMaterial(const aiScene* scene, const aiMaterial* material, int index)
{
    Material m;
    aiString name;
    if (material->Get(AI_MATKEY_NAME, name) == AI_SUCCESS)
        m.name = text(name);
    if (m.name.isEmpty())
        m.name = QStringLiteral("Material %1").arg(index + 1);
    aiColor4D c;
    if (material->Get(AI_MATKEY_COLOR_DIFFUSE, c) == AI_SUCCESS ||
        material->Get(AI_MATKEY_BASE_COLOR, c) == AI_SUCCESS) {
        const auto channel = [](float v) {
            return std::isfinite(v) ? std::clamp(v, 0.0f, 1.0f) : 0.8f;
        };
        m.colour = QColor::fromRgbF(channel(c.r), channel(c.g), channel(c.b));
    }

    aiString file;
    if (material->GetTexture(aiTextureType_DIFFUSE, 0, &file) != AI_SUCCESS &&
        material->GetTexture(aiTextureType_BASE_COLOR, 0, &file) != AI_SUCCESS)
        return m;
    const QString reference = text(file);
    if (reference.isEmpty())
        return m;
    QImage image;
    if (const aiTexture* embedded = scene->GetEmbeddedTexture(file.C_Str())) {
        if (embedded->mHeight == 0) {
            // Compressed (PNG, JPEG...): mWidth is the byte count.
            image = QImage::fromData(reinterpret_cast<const uchar*>(embedded->pcData),
                                     int(embedded->mWidth));
        } else if (embedded->mWidth <= 8192 && embedded->mHeight <= 8192) {
            const int w = int(embedded->mWidth), h = int(embedded->mHeight);
            image = QImage(w, h, QImage::Format_ARGB32);
            for (int y = 0; y < h; ++y) {
                auto* line = reinterpret_cast<QRgb*>(image.scanLine(y));
                for (int x = 0; x < w; ++x) {
                    const aiTexel& t = embedded->pcData[y * w + x];
                    line[x] = qRgba(t.r, t.g, t.b, t.a);
                }
            }
        }
        m.textureName = reference;
    } else {
        // Paths are often written on another system: either slash, relative to the model.
        QString relative = reference;
        relative.replace(QLatin1Char('\\'), QLatin1Char('/'));
        const QDir dir = QFileInfo(path).absoluteDir();
        QString found = dir.absoluteFilePath(relative);
        if (!QFileInfo::exists(found))
            found = dir.absoluteFilePath(QFileInfo(relative).fileName());
        image = QImage(found);
        m.textureName = QFileInfo(found).fileName();
    }
    if (image.isNull()) {
        warnings.append(QStringLiteral("The texture \"%1\" of material \"%2\" could not be read; "
                                       "the material shows its colour only.")
                            .arg(reference, m.name));
        m.textureName.clear();
    } else {
        m.texture = image.convertToFormat(QImage::Format_ARGB32);
    }
    return m;
}

bool RkImporter::Private::convert(const aiScene* scene)
{
    if (!scene->mRootNode)
        return fail(QStringLiteral("the file holds no node hierarchy"));

    // Nodes depth first, parents before children, with their transforms in the file's space.
    QVector<const aiNode*> order;
    QHash<const aiNode*, const aiNode*> parentOf;
    QHash<const aiNode*, Affine> world;
    {
        struct Pending {
            const aiNode* node;
            const aiNode* parent;
            int depth;
        };
        QVector<Pending> stack{{scene->mRootNode, nullptr, 0}};
        while (!stack.isEmpty()) {
            const Pending p = stack.takeLast();
            if (world.contains(p.node))
                return fail(QStringLiteral("its node hierarchy loops"));
            if (p.depth > kMaxNodeDepth)
                return fail(QStringLiteral("its node hierarchy is deeper than %1 levels")
                                .arg(kMaxNodeDepth));
            const Affine local = Affine::from(p.node->mTransformation);
            world.insert(p.node, p.parent ? world.value(p.parent) * local : local);
            parentOf.insert(p.node, p.parent);
            order.append(p.node);
            for (int i = int(p.node->mNumChildren) - 1; i >= 0; --i) {
                if (p.node->mChildren[i])
                    stack.append({p.node->mChildren[i], p.node, p.depth + 1});
            }
        }
    }

    // Nodes by name, the first in hierarchy order winning as a search from the root would find.
    QHash<QByteArray, const aiNode*> byName;
    for (const aiNode* node : qAsConst(order)) {
        const QByteArray name(node->mName.C_Str(), int(node->mName.length));
        if (!byName.contains(name))
            byName.insert(name, node);
    }
    auto findNode = [&byName](const aiString& name) {
        return byName.value(QByteArray(name.C_Str(), int(name.length)));
    };

    // Bones: every node a skin names, and the nodes between them and the root.
    QSet<const aiNode*> boneNodes;
    for (unsigned mi = 0; mi < scene->mNumMeshes; ++mi) {
        const aiMesh* mesh = scene->mMeshes[mi];
        for (unsigned b = 0; mesh && b < mesh->mNumBones; ++b) {
            const aiNode* node = findNode(mesh->mBones[b]->mName);
            for (; node && node != scene->mRootNode && !boneNodes.contains(node);
                 node = parentOf.value(node))
                boneNodes.insert(node);
            if (boneNodes.size() > kMaxBones)
                return fail(QStringLiteral("it has more than %1 bones").arg(kMaxBones));
        }
    }
    QHash<const aiNode*, int> boneIndex;
    QVector<RkVec3> boneJoints;
    QSet<QString> boneNames;
    for (const aiNode* node : order) {
        if (!boneNodes.contains(node))
            continue;
        Bone bone;
        bone.name = text(node->mName);
        if (bone.name.isEmpty())
            bone.name = QStringLiteral("Bone %1").arg(bones.size() + 1);
        for (int n = 2; boneNames.contains(bone.name); ++n)
            bone.name = QStringLiteral("%1 %2").arg(text(node->mName)).arg(n);
        boneNames.insert(bone.name);
        for (const aiNode* up = parentOf.value(node); up; up = parentOf.value(up)) {
            if (boneIndex.contains(up)) {
                bone.parent = boneIndex.value(up);
                break;
            }
        }
        const Affine& w = world.value(node);
        boneJoints.append(RkVec3(float(w.m[0][3]), float(w.m[1][3]), float(w.m[2][3])));
        boneIndex.insert(node, bones.size());
        bones.append(bone);
    }

    mesh = std::make_unique<RkPolyMesh>();
    QVector<RkVec3> positions;
    QVector<bool> badVertex;
    QVector<RkPnt2> uvs;
    QHash<unsigned, int> materialSlot;
    QSet<QString> propertyNames = {QStringLiteral("XTranslate"), QStringLiteral("YTranslate"),
                                   QStringLiteral("ZTranslate"), QStringLiteral("XRotate"),
                                   QStringLiteral("YRotate"),    QStringLiteral("ZRotate"),
                                   QStringLiteral("Scale"),      QStringLiteral("Visible")};
    struct Facet {
        int corners[4];
        int size;
        int material;
    };
    QVector<Facet> facets;
    int badIndices = 0, badWeights = 0, badPositions = 0, droppedFacets = 0;

    for (int step = 0; step < order.size(); ++step) {
        const aiNode* node = order[step];
        if (!report(0.9f + 0.05f * float(step) / float(order.size())))
            return fail(QStringLiteral("the import was cancelled"));
        // A mesh below a bone without a skin of its own follows that bone rigidly.
        int rigidBone = -1;
        for (const aiNode* up = node; up; up = parentOf.value(up)) {
            if (boneIndex.contains(up)) {
                rigidBone = boneIndex.value(up);
                break;
            }
        }
        for (unsigned k = 0; k < node->mNumMeshes; ++k) {
            if (node->mMeshes[k] >= scene->mNumMeshes || !scene->mMeshes[node->mMeshes[k]]) {
                ++badIndices;
                continue;
            }
            const aiMesh* src = scene->mMeshes[node->mMeshes[k]];
            const int n = int(src->mNumVertices);
            if (n == 0 || !src->mVertices || src->mNumFaces == 0 || !src->mFaces)
                continue;
            const int base = positions.size();

            QString meshName = text(src->mName);
            if (meshName.isEmpty())
                meshName = text(node->mName);
            if (meshName.isEmpty())
                meshName = QStringLiteral("Mesh %1").arg(meshNames.size() + 1);
            const QString plainName = meshName;
            for (int i = 2; meshNames.contains(meshName); ++i)
                meshName = QStringLiteral("%1 %2").arg(plainName).arg(i);
            meshNames.append(meshName);

            // Each vertex's rest transform: the weighted blend of its bones' bind transforms
            // for a skinned mesh, else the mesh node's.
            const Affine nodeWorld = world.value(node);
            QVector<Affine> rest(n, nodeWorld);
            std::vector<std::vector<RkBoneInfluence>> weights(static_cast<size_t>(n));
            if (src->mNumBones > 0 && src->mBones) {
                QVector<Affine> blend(n);
                for (Affine& a : blend)
                    a.scale(0.0);
                QVector<double> sums(n, 0.0);
                for (unsigned b = 0; b < src->mNumBones; ++b) {
                    const aiBone* bone = src->mBones[b];
                    const aiNode* boneNode = findNode(bone->mName);
                    if (!boneNode || !boneIndex.contains(boneNode))
                        continue;
                    const Affine bind = world.value(boneNode) * Affine::from(bone->mOffsetMatrix);
                    if (!bind.isFinite()) {
                        badWeights += int(bone->mNumWeights);
                        continue;
                    }
                    const int index = boneIndex.value(boneNode);
                    for (unsigned w = 0; w < bone->mNumWeights && bone->mWeights; ++w) {
                        const aiVertexWeight& vw = bone->mWeights[w];
                        if (vw.mVertexId >= unsigned(n)) {
                            ++badIndices;
                            continue;
                        }
                        if (!std::isfinite(vw.mWeight) || vw.mWeight <= 0.0f) {
                            if (!std::isfinite(vw.mWeight) || vw.mWeight < 0.0f)
                                ++badWeights;
                            continue;
                        }
                        blend[int(vw.mVertexId)].addScaled(bind, vw.mWeight);
                        sums[int(vw.mVertexId)] += vw.mWeight;
                        weights[vw.mVertexId].push_back({index, vw.mWeight});
                    }
                }
                for (int v = 0; v < n; ++v) {
                    if (sums[v] > 0.0) {
                        blend[v].scale(1.0 / sums[v]);
                        rest[v] = blend[v];
                    } else if (rigidBone >= 0) {
                        weights[size_t(v)].push_back({rigidBone, 1.0f});
                    }
                }
            } else if (rigidBone >= 0) {
                for (auto& w : weights)
                    w.push_back({rigidBone, 1.0f});
            }

            influences.resize((base + n) * RkMeshDeformer::MaxInfluences);
            for (int v = 0; v < n; ++v) {
                RkVec3 p = rest[v].point(src->mVertices[v]);
                const bool bad = !finite(src->mVertices[v]) || !finite(p);
                if (bad) {
                    ++badPositions;
                    p = RkVec3();
                }
                positions.append(p);
                badVertex.append(bad);
                RkPnt2 uv;
                if (src->HasTextureCoords(0)) {
                    const aiVector3D& t = src->mTextureCoords[0][v];
                    if (std::isfinite(t.x) && std::isfinite(t.y))
                        uv = RkPnt2{t.x, t.y};
                }
                uvs.append(uv);
                // Heaviest first; the deformer renormalises what it keeps.
                auto& list = weights[size_t(v)];
                std::stable_sort(list.begin(), list.end(),
                                 [](const RkBoneInfluence& a, const RkBoneInfluence& b) {
                                     return a.weight > b.weight;
                                 });
                float sum = 0.0f;
                const int kept = std::min(int(list.size()), int(RkMeshDeformer::MaxInfluences));
                for (int i = 0; i < kept; ++i)
                    sum += list[size_t(i)].weight;
                for (int i = 0; i < kept; ++i) {
                    influences[(base + v) * RkMeshDeformer::MaxInfluences + i] = {
                        list[size_t(i)].bone, list[size_t(i)].weight / sum};
                }
            }

            int slot = materialSlot.value(src->mMaterialIndex, -1);
            if (slot < 0) {
                if (materials.size() >= kMaxMaterials) {
                    warnings.append(QStringLiteral("More than %1 materials: the rest show as the "
                                                   "last one.")
                                        .arg(kMaxMaterials));
                    slot = kMaxMaterials - 1;
                } else if (src->mMaterialIndex < scene->mNumMaterials &&
                           scene->mMaterials[src->mMaterialIndex]) {
                    slot = materials.size();
                    materials.append(readMaterial(scene, scene->mMaterials[src->mMaterialIndex],
                                                  int(src->mMaterialIndex)));
                } else {
                    slot = materials.size();
                    materials.append(Material{QStringLiteral("Default"), QColor(200, 200, 200),
                                              QImage(), QString()});
                }
                materialSlot.insert(src->mMaterialIndex, slot);
            }

            for (unsigned f = 0; f < src->mNumFaces; ++f) {
                const aiFace& face = src->mFaces[f];
                const int size = int(face.mNumIndices);
                if (size < 3 || !face.mIndices)
                    continue;
                bool ok = true;
                for (int c = 0; c < size && ok; ++c) {
                    if (face.mIndices[c] >= unsigned(n)) {
                        ++badIndices;
                        ok = false;
                    } else if (badVertex[base + int(face.mIndices[c])]) {
                        ok = false;
                    }
                }
                if (!ok) {
                    ++droppedFacets;
                    continue;
                }
                if (size <= 4) {
                    Facet facet{{0, 0, 0, 0}, size, slot};
                    for (int c = 0; c < size; ++c)
                        facet.corners[c] = base + int(face.mIndices[c]);
                    facets.append(facet);
                    continue;
                }
                for (int c = 1; c + 1 < size; ++c) {
                    facets.append({{base + int(face.mIndices[0]), base + int(face.mIndices[c]),
                                    base + int(face.mIndices[c + 1]), 0},
                                   3,
                                   slot});
                }
            }

            for (unsigned t = 0; t < src->mNumAnimMeshes && src->mAnimMeshes; ++t) {
                const aiAnimMesh* target = src->mAnimMeshes[t];
                if (!target || !target->mVertices)
                    continue;
                QString name = text(target->mName);
                if (name.isEmpty())
                    name = QStringLiteral("Morph %1").arg(t + 1);
                if (int(target->mNumVertices) != n) {
                    warnings.append(QStringLiteral("The morph \"%1\" of mesh \"%2\" has %3 "
                                                   "vertices where the mesh has %4; it was left "
                                                   "out.")
                                        .arg(name, meshName)
                                        .arg(target->mNumVertices)
                                        .arg(n));
                    continue;
                }
                Morph morph;
                morph.group = QStringLiteral("Morphs/") + meshName;
                morph.name = name;
                if (propertyNames.contains(morph.name))
                    morph.name = meshName + QLatin1Char(' ') + name;
                for (int i = 2; propertyNames.contains(morph.name); ++i)
                    morph.name = QStringLiteral("%1 %2").arg(name).arg(i);
                propertyNames.insert(morph.name);
                morph.deltas.name = morph.name;
                // Targets hold whole positions; the morph keeps the offsets that move.
                for (int v = 0; v < n; ++v) {
                    const aiVector3D offset = target->mVertices[v] - src->mVertices[v];
                    if (!finite(offset) || badVertex[base + v] ||
                        (offset.x == 0.0f && offset.y == 0.0f && offset.z == 0.0f))
                        continue;
                    const RkVec3 delta = rest[v].vector(offset);
                    if (!finite(delta))
                        continue;
                    morph.deltas.indices.append(base + v);
                    morph.deltas.deltas.append(delta);
                }
                morphs.append(morph);
            }
        }
    }
    if (facets.isEmpty())
        return fail(QStringLiteral("it holds no surface to show"));

    if (badIndices > 0)
        warnings.append(QStringLiteral("%1 indices out of range were ignored.").arg(badIndices));
    if (badWeights > 0)
        warnings.append(QStringLiteral("%1 bone weights that are not positive numbers were "
                                       "ignored.")
                            .arg(badWeights));
    if (badPositions > 0)
        warnings.append(QStringLiteral("%1 vertices without a valid position were left out, "
                                       "with the %2 facets that used them.")
                            .arg(badPositions)
                            .arg(droppedFacets));

    // Units and up axis: what the file says (only some formats say it), else a skeleton lying
    // along Z is taken to be modelled Z up.
    RkVec3 lo, hi;
    bool any = false;
    for (int i = 0; i < positions.size(); ++i) {
        if (badVertex[i])
            continue;
        const RkVec3& p = positions[i];
        if (!any) {
            lo = hi = p;
            any = true;
        }
        lo = RkVec3(std::min(lo.x, p.x), std::min(lo.y, p.y), std::min(lo.z, p.z));
        hi = RkVec3(std::max(hi.x, p.x), std::max(hi.y, p.y), std::max(hi.z, p.z));
    }
    int upAxis = 1, upSign = 1;
    double unit = 1.0;
    if (const aiMetadata* meta = scene->mMetaData) {
        int axis = 1, sign = 1;
        if (meta->Get(std::string("UpAxis"), axis) && axis >= 0 && axis <= 2)
            upAxis = axis;
        if (meta->Get(std::string("UpAxisSign"), sign))
            upSign = sign < 0 ? -1 : 1;
        float factor = 0.0f;
        // Centimetres per unit.
        if (meta->Get(std::string("UnitScaleFactor"), factor) && std::isfinite(factor) &&
            factor > 0.0f)
            unit = double(factor) / 100.0;
    }
    const RkVec3 extent = hi - lo;
    if (!bones.isEmpty() && (!scene->mMetaData || !scene->mMetaData->HasKey("UpAxis")) &&
        extent.z > 1.5f * extent.y && extent.z >= extent.x)
        upAxis = 2;
    // The rotation that takes the file's up to +Y.
    const auto toYUp = [upAxis, upSign](const RkVec3& v) {
        switch (upAxis) {
        case 0:
            return upSign > 0 ? RkVec3(-v.y, v.x, v.z) : RkVec3(v.y, -v.x, v.z);
        case 2:
            return upSign > 0 ? RkVec3(v.x, v.z, -v.y) : RkVec3(v.x, -v.z, v.y);
        default:
            return upSign > 0 ? v : RkVec3(v.x, -v.y, -v.z);
        }
    };
    bool first = true;
    for (int i = 0; i < positions.size(); ++i) {
        positions[i] = toYUp(positions[i]) * float(unit);
        if (badVertex[i])
            continue;
        const RkVec3& p = positions[i];
        if (first) {
            lo = hi = p;
            first = false;
        }
        lo = RkVec3(std::min(lo.x, p.x), std::min(lo.y, p.y), std::min(lo.z, p.z));
        hi = RkVec3(std::max(hi.x, p.x), std::max(hi.y, p.y), std::max(hi.z, p.z));
    }
    // A sensible size: a figure about as tall as a person, a prop within arm's reach. Sizes
    // already in that range are kept.
    const RkVec3 size = hi - lo;
    const float largest = std::max({size.x, size.y, size.z});
    float scale = 1.0f;
    if (!bones.isEmpty() && (largest < 0.3f || largest > 3.0f) && largest > 0.0f)
        scale = 1.8f / largest;
    else if (bones.isEmpty() && (largest < 0.05f || largest > 5.0f) && largest > 0.0f)
        scale = 1.0f / largest;
    if (upAxis != 1 || upSign != 1)
        notes.append(QStringLiteral("Import: \"%1\" was modelled with %2%3 up; turned to +Y up")
                         .arg(QFileInfo(path).fileName(),
                              upSign < 0 ? QStringLiteral("-") : QString(),
                              QString(QLatin1Char("XYZ"[upAxis]))));
    if (scale != 1.0f || unit != 1.0)
        notes.append(QStringLiteral("Import: \"%1\" scaled by %2 to a size that fits the scene")
                         .arg(QFileInfo(path).fileName())
                         .arg(double(scale) * unit));
    // On the floor, centred.
    const RkVec3 shift(-(lo.x + hi.x) * 0.5f * scale, -lo.y * scale, -(lo.z + hi.z) * 0.5f * scale);
    const auto place = [&](const RkVec3& p) { return p * scale + shift; };
    for (int i = 0; i < positions.size(); ++i)
        mesh->addVertex(badVertex[i] ? RkVec3() : place(positions[i]));
    for (Morph& morph : morphs) {
        for (RkVec3& delta : morph.deltas.deltas)
            delta = toYUp(delta) * float(unit * double(scale));
    }
    for (int b = 0; b < bones.size(); ++b)
        bones[b].origin = place(toYUp(boneJoints[b]) * float(unit));

    auto* map = new RkMap(RkMap::Point2D);
    QVector<float> values;
    values.reserve(uvs.size() * 2);
    for (const RkPnt2& uv : uvs)
        values << uv.x << uv.y;
    map->setValues(values);
    mesh->setUVs(map);
    for (const Facet& f : facets) {
        if (f.size == 4) {
            RkQuadFacet q;
            for (int c = 0; c < 4; ++c)
                q.vertices[c] = q.uvs[c] = f.corners[c];
            q.material = quint8(f.material);
            mesh->addQuad(q);
        } else {
            RkTriFacet t;
            for (int c = 0; c < 3; ++c)
                t.vertices[c] = t.uvs[c] = f.corners[c];
            t.material = quint8(f.material);
            mesh->addTri(t);
        }
    }
    bool skinned = false;
    for (const RkBoneInfluence& i : influences)
        skinned = skinned || i.bone >= 0;
    if (!skinned)
        influences.clear();
    return report(1.0f) || fail(QStringLiteral("the import was cancelled"));
}

void RkImporter::Private::buildObject(RkNode* node)
{
    if (!mesh || !node)
        return;
    for (const QString& note : notes)
        rkLog(note);
    notes.clear();
    auto* object = new RkObject(node->getName());
    QList<RkMaterial*> made;
    for (const Material& m : materials) {
        auto* material = new RkMaterial(m.name);
        material->setDiffuseColor(m.colour);
        if (!m.texture.isNull())
            material->setDiffuseTexture(m.texture, m.textureName);
        made.append(material);
    }
    // The first shape owns the materials; every shape lists them all in the same order.
    for (const QString& name : meshNames) {
        auto* shape = new RkShape(name);
        for (RkMaterial* m : made)
            shape->addMaterial(m);
        object->addShape(shape);
    }
    object->setGeometry(mesh.release());

    for (const Morph& morph : morphs) {
        auto* p = qobject_cast<RkFloatProperty*>(node->findProperty(morph.name));
        if (!p) {
            p = new RkFloatProperty(morph.name, morph.name);
            p->setMinMax(0, 1);
            p->setDefaultValue(0);
            p->setValue(0);
            p->setClamped(true);
            p->setDisplayAsPercent(true);
            p->setSensitivity(0.01f);
            node->addProperty(p, morph.group);
        }
        object->addMorph(morph.deltas, p);
    }

    if (!influences.isEmpty()) {
        const auto* figure = qobject_cast<RkSkeleton*>(node);
        QList<RkNode*> skin;
        for (const Bone& bone : bones)
            skin.append(figure ? figure->findBone(bone.name) : nullptr);
        object->setSkinBones(skin);
        const int n = influences.size() / RkMeshDeformer::MaxInfluences;
        for (int v = 0; v < n; ++v) {
            object->setVertexInfluences(v,
                                        influences.constData() + v * RkMeshDeformer::MaxInfluences,
                                        RkMeshDeformer::MaxInfluences);
        }
    }
    node->setObject(object);
}

namespace
{
// The import library's glTF reader (5.2) crashes on a skin without inverse bind matrices, which
// glTF allows; such files are refused before it sees them.
bool hasSkinWithoutBindMatrices(const QString& path)
{
    QFile file(path);
    if (!file.open(QIODevice::ReadOnly))
        return false;
    QByteArray json;
    if (file.peek(4) == "glTF") {
        // Binary: a 12-byte header, then chunks (length, type, data), the JSON chunk first.
        if (!file.seek(12))
            return false;
        const QByteArray chunk = file.read(8);
        if (chunk.size() < 8 || qFromLittleEndian<quint32>(chunk.constData() + 4) != 0x4E4F534Au)
            return false;
        const quint32 length = qFromLittleEndian<quint32>(chunk.constData());
        if (length > quint64(file.size()))
            return false;
        json = file.read(length);
    } else {
        json = file.readAll();
    }
    const QJsonArray skins = QJsonDocument::fromJson(json).object().value("skins").toArray();
    for (const QJsonValue& skin : skins) {
        if (!skin.toObject().contains(QLatin1String("inverseBindMatrices")))
            return true;
    }
    return false;
}

} // namespace

RkImporter::RkImporter() : d(std::make_unique<Private>()) {}

RkImporter::~RkImporter() = default;

void RkImporter::setProgressCallback(std::function<bool(float)> callback)
{
    d->progress = std::move(callback);
}

bool RkImporter::read(const QString& path)
{
    const QFileInfo info(path);
    d->path = info.absoluteFilePath();
    const QString shown = info.fileName();
    if (!info.exists())
        return d->fail(QStringLiteral("\"%1\" does not exist").arg(path));
    if (!info.isFile() || !info.isReadable())
        return d->fail(QStringLiteral("\"%1\" cannot be read").arg(path));

    const QString suffix = info.suffix().toLower();
    if ((suffix == QLatin1String("gltf") || suffix == QLatin1String("glb")) &&
        hasSkinWithoutBindMatrices(d->path)) {
        return d->fail(QStringLiteral("\"%1\" was refused: one of its skins has no inverse bind "
                                      "matrices, which this version cannot read")
                           .arg(shown));
    }

    Assimp::Importer importer;
    importer.SetPropertyInteger(AI_CONFIG_PP_LBW_MAX_WEIGHTS, RkMeshDeformer::MaxInfluences);
    importer.SetPropertyInteger(AI_CONFIG_PP_SBP_REMOVE,
                                aiPrimitiveType_POINT | aiPrimitiveType_LINE);
    // The importer owns the handler.
    importer.SetProgressHandler(new ProgressRelay([this](float f) { return d->report(f); }));
    const aiScene* scene =
        importer.ReadFile(QFile::encodeName(d->path).toStdString(),
                          aiProcess_JoinIdenticalVertices | aiProcess_ValidateDataStructure |
                              aiProcess_LimitBoneWeights | aiProcess_SortByPType);
    if (d->cancelled)
        return d->fail(QStringLiteral("the import was cancelled"));
    if (!scene) {
        QString why = QString::fromUtf8(importer.GetErrorString()).trimmed();
        if (why.isEmpty())
            why = QStringLiteral("its format is not known");
        return d->fail(QStringLiteral("\"%1\" could not be imported: %2").arg(shown, why));
    }
    if (scene->mFlags & AI_SCENE_FLAGS_INCOMPLETE)
        return d->fail(QStringLiteral("\"%1\" holds no complete model").arg(shown));
    d->fingerprint = fingerprint(d->path);
    bool ok = false;
    try {
        ok = d->convert(scene);
    } catch (const std::exception& e) {
        d->error = QString::fromLocal8Bit(e.what());
    }
    if (!ok) {
        d->mesh.reset();
        if (!d->error.startsWith(QLatin1Char('"')))
            d->error = QStringLiteral("\"%1\" was refused: %2").arg(shown, d->error);
        return false;
    }
    for (const QString& w : d->warnings)
        d->notes.append(QStringLiteral("Import: %1: %2").arg(shown, w));
    return true;
}

QString RkImporter::errorString() const
{
    return d->error;
}

QStringList RkImporter::warnings() const
{
    return d->warnings;
}

bool RkImporter::wasCancelled() const
{
    return d->cancelled;
}

int RkImporter::getNumVertices() const
{
    return d->mesh ? d->mesh->getNumVertices() : 0;
}

bool RkImporter::hasSkeleton() const
{
    return !d->bones.isEmpty();
}

QString RkImporter::getSource() const
{
    return QStringLiteral("%1:%2#%3").arg(QLatin1String(kScheme), d->path, d->fingerprint);
}

RkNode* RkImporter::addToScene(RkScene* scene)
{
    if (!d->mesh || !scene)
        return nullptr;
    QString base = QFileInfo(d->path).completeBaseName();
    if (base.isEmpty())
        base = QStringLiteral("Import");
    QString name = base;
    for (int n = 2; scene->findNode(name); ++n)
        name = QStringLiteral("%1 %2").arg(base).arg(n);

    RkNode* node = nullptr;
    if (!d->bones.isEmpty()) {
        auto* figure = new RkSkeleton;
        node = figure;
        node->setName(name);
        node->setLabel(base);
        node->setSource(getSource());
        scene->addNode(figure);
        QVector<RkBone*> made;
        for (const Private::Bone& b : d->bones) {
            auto* bone = new RkBone;
            bone->setName(b.name);
            bone->setLabel(b.name);
            bone->setOrigin(QVector3D(b.origin.x, b.origin.y, b.origin.z));
            bone->setNodeParent(b.parent >= 0 ? static_cast<RkNode*>(made[b.parent]) : figure);
            for (RkFloatProperty* p :
                 {bone->getXRotate(), bone->getYRotate(), bone->getZRotate(), bone->getXTranslate(),
                  bone->getYTranslate(), bone->getZTranslate()})
                bone->getPropertyGroups()->addProperty(p, QStringLiteral("Pose"));
            scene->addNode(bone);
            made.append(bone);
        }
    } else {
        node = new RkNode;
        node->setName(name);
        node->setLabel(base);
        node->setSource(getSource());
        scene->addNode(node);
    }
    d->buildObject(node);
    return node;
}

void RkImporter::applyTo(RkNode* node)
{
    d->buildObject(node);
}

QStringList RkImporter::filePatterns()
{
    std::string list;
    Assimp::Importer().GetExtensionList(list);
    QStringList patterns;
    for (const QString& p :
         QString::fromStdString(list).split(QLatin1Char(';'), Qt::SkipEmptyParts))
        patterns.append(p.trimmed());
    return patterns;
}

QStringList RkImporter::takeSourceProblems()
{
    SourceProblems& p = sourceProblems();
    QMutexLocker lock(&p.mutex);
    QStringList list;
    list.swap(p.list);
    return list;
}

void RkImporter::registerFileSource()
{
    const auto build = [](RkNode* node, const QString& sceneFile) {
        QString path, print;
        splitSource(node->getSource(), path, print);
        if (QFileInfo(path).isRelative() && !sceneFile.isEmpty())
            path = QFileInfo(sceneFile).absoluteDir().absoluteFilePath(path);
        path = QDir::cleanPath(path);
        // Kept absolute while in memory; the scene file gets it relative where it can.
        node->setSource(QStringLiteral("%1:%2#%3").arg(QLatin1String(kScheme), path, print));
        node->setObject(nullptr);
        const QString who = node->getLabel().isEmpty() ? node->getName() : node->getLabel();
        // Only plain files: a scene must not make the loader read a device or a folder.
        if (!QFileInfo(path).isFile()) {
            reportSourceProblem(QStringLiteral("The model file \"%1\" of \"%2\" is missing; "
                                               "the node was loaded without geometry.")
                                    .arg(QDir::toNativeSeparators(path), who));
            return;
        }
        if (!print.isEmpty() && fingerprint(path) != print) {
            reportSourceProblem(QStringLiteral("The model file \"%1\" of \"%2\" has changed since "
                                               "it was imported; the node was loaded without "
                                               "geometry.")
                                    .arg(QDir::toNativeSeparators(path), who));
            return;
        }
        RkImporter importer;
        if (!importer.read(path)) {
            reportSourceProblem(QStringLiteral("The model of \"%1\" could not be read (%2); the "
                                               "node was loaded without geometry.")
                                    .arg(who, importer.errorString()));
            return;
        }
        importer.applyTo(node);
    };
    const auto store = [](const QString& source, const QString& sceneFile) {
        if (sceneFile.isEmpty())
            return source;
        QString path, print;
        splitSource(source, path, print);
        const QString relative = QFileInfo(sceneFile).absoluteDir().relativeFilePath(path);
        if (relative.startsWith(QLatin1String("..")) || QFileInfo(relative).isAbsolute())
            return source;
        return QStringLiteral("%1:%2#%3").arg(QLatin1String(kScheme), relative, print);
    };
    RkScene::registerSourceScheme(QLatin1String(kScheme), build, store);
}
