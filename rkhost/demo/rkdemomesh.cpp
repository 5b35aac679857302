#include "demo/rkdemomesh.h"

#include "demo/rkdemoscene.h"
#include "geometry/rkmap.h"
#include "geometry/rkpolymesh.h"
#include "geometry/rksubdmesh.h"
#include "properties/rkfloatproperty.h"
#include "scene/rkbone.h"
#include "scene/rkmaterial.h"
#include "scene/rkobject.h"
#include "scene/rkscene.h"
#include "scene/rkshape.h"
#include "scene/rkskeleton.h"

#include <QHash>

#include <algorithm>
#include <cmath>
#include <functional>

namespace
{

const float kPi = float(M_PI);

struct BoneDef {
    const char* name;
    int parent;
    RkVec3 centre;
};

// Joints of the figure, parents first. The arms stretch out along x at shoulder height.
const BoneDef kBones[] = {
    {"hip", -1, {0.0f, 0.95f, 0.0f}},     {"abdomen", 0, {0.0f, 1.05f, 0.0f}},
    {"chest", 1, {0.0f, 1.25f, 0.0f}},    {"neck", 2, {0.0f, 1.48f, 0.0f}},
    {"head", 3, {0.0f, 1.58f, 0.0f}},     {"lCollar", 2, {0.04f, 1.42f, 0.0f}},
    {"lShldr", 5, {0.18f, 1.42f, 0.0f}},  {"lForeArm", 6, {0.45f, 1.42f, 0.0f}},
    {"lHand", 7, {0.70f, 1.42f, 0.0f}},   {"rCollar", 2, {-0.04f, 1.42f, 0.0f}},
    {"rShldr", 9, {-0.18f, 1.42f, 0.0f}}, {"rForeArm", 10, {-0.45f, 1.42f, 0.0f}},
    {"rHand", 11, {-0.70f, 1.42f, 0.0f}}, {"lThigh", 0, {0.10f, 0.92f, 0.0f}},
    {"lShin", 13, {0.10f, 0.50f, 0.0f}},  {"lFoot", 14, {0.10f, 0.08f, 0.0f}},
    {"rThigh", 0, {-0.10f, 0.92f, 0.0f}}, {"rShin", 16, {-0.10f, 0.50f, 0.0f}},
    {"rFoot", 17, {-0.10f, 0.08f, 0.0f}},
};
const int kNumBones = int(sizeof(kBones) / sizeof(kBones[0]));

int boneIndex(const QByteArray& name)
{
    for (int i = 0; i < kNumBones; ++i) {
        if (name == kBones[i].name)
            return i;
    }
    return -1;
}

// One body part: a closed surface of revolution around the axis a-b, with radii rx and rz across
// the axis. At angle phi of the profile the ring lies at (1 - cos phi) / 2 along the axis with
// radius sin(phi)^shape: shape 1 gives an ellipsoid, a small shape a tube with rounded ends.
// taper > 0 makes the a end wider.
struct PartDef {
    QByteArray name;
    QByteArray bone;
    int material;
    RkVec3 a, b;
    float rx, rz;
    float shape;
    float taper;
    int rings, segs;
};

RkVec3 mirror(const RkVec3& v)
{
    return RkVec3(-v.x, v.y, v.z);
}

QVector<PartDef> partDefs()
{
    using M = RkDemoMesh;
    const float arm = 1.42f;
    QVector<PartDef> parts = {
        {"head", "head", M::Skin, {0, 1.56f, 0}, {0, 1.82f, 0}, 0.095f, 0.11f, 1.0f, 0, 14, 20},
        {"lEye",
         "head",
         M::Eyes,
         {0.035f, 1.71f, 0.080f},
         {0.035f, 1.71f, 0.114f},
         0.017f,
         0.017f,
         1.0f,
         0,
         6,
         10},
        {"nose",
         "head",
         M::Skin,
         {0, 1.685f, 0.09f},
         {0, 1.65f, 0.128f},
         0.014f,
         0.014f,
         0.8f,
         0,
         5,
         8},
        {"lEar",
         "head",
         M::Skin,
         {0.097f, 1.655f, 0},
         {0.097f, 1.725f, 0},
         0.012f,
         0.024f,
         0.9f,
         0,
         6,
         10},
        {"neck", "neck", M::Skin, {0, 1.44f, 0}, {0, 1.60f, 0}, 0.05f, 0.05f, 0.2f, 0, 6, 12},
        {"chest",
         "chest",
         M::Shirt,
         {0, 1.18f, 0},
         {0, 1.50f, 0},
         0.17f,
         0.11f,
         0.35f,
         -0.1f,
         10,
         20},
        {"abdomen",
         "abdomen",
         M::Shirt,
         {0, 1.0f, 0},
         {0, 1.25f, 0},
         0.14f,
         0.10f,
         0.35f,
         0,
         8,
         20},
        {"hip", "hip", M::Trousers, {0, 0.84f, 0}, {0, 1.05f, 0}, 0.16f, 0.11f, 0.4f, 0.05f, 8, 20},
        {"lCollar",
         "lCollar",
         M::Shirt,
         {0.03f, arm, 0},
         {0.23f, arm, 0},
         0.055f,
         0.06f,
         0.6f,
         0,
         6,
         12},
        {"lUpperArm",
         "lShldr",
         M::Shirt,
         {0.17f, arm, 0},
         {0.47f, arm, 0},
         0.052f,
         0.055f,
         0.2f,
         0.1f,
         8,
         12},
        {"lForeArm",
         "lForeArm",
         M::Skin,
         {0.45f, arm, 0},
         {0.71f, arm, 0},
         0.042f,
         0.042f,
         0.25f,
         0.15f,
         8,
         12},
        {"lHand",
         "lHand",
         M::Skin,
         {0.70f, arm, 0},
         {0.87f, arm, 0},
         0.02f,
         0.045f,
         0.6f,
         0,
         6,
         10},
        {"lThigh",
         "lThigh",
         M::Trousers,
         {0.10f, 0.97f, 0},
         {0.10f, 0.48f, 0},
         0.08f,
         0.085f,
         0.2f,
         0.15f,
         10,
         12},
        {"lShin",
         "lShin",
         M::Trousers,
         {0.10f, 0.52f, 0},
         {0.10f, 0.07f, 0},
         0.056f,
         0.058f,
         0.2f,
         0.15f,
         10,
         12},
        {"lFoot",
         "lFoot",
         M::Skin,
         {0.10f, 0.04f, -0.05f},
         {0.10f, 0.04f, 0.17f},
         0.045f,
         0.035f,
         0.6f,
         0,
         6,
         10},
    };
    // The right side mirrors every part whose name starts with "l".
    for (int i = 0, n = parts.size(); i < n; ++i) {
        if (!parts[i].name.startsWith('l'))
            continue;
        PartDef r = parts[i];
        r.name = "r" + r.name.mid(1);
        if (r.bone.startsWith('l'))
            r.bone = "r" + r.bone.mid(1);
        r.a = mirror(r.a);
        r.b = mirror(r.b);
        parts.append(r);
    }
    return parts;
}

// Where each vertex came from, so morphs can shape parts by their own coordinates.
struct VertexInfo {
    int part = 0;
    float t = 0.0f;   // along the part's axis, 0 at a, 1 at b
    RkVec3 axisPoint; // the point on the axis the vertex rings around
    RkVec3 radial;    // vertex minus axisPoint
    RkVec3 pos() const { return axisPoint + radial; }
};

using Offset = std::function<RkVec3(const VertexInfo&, const PartDef&)>;

struct MorphDef {
    const char* name;
    const char* region;
    QStringList parts;
    Offset offset;
};

RkVec3 axisOf(const PartDef& p)
{
    return (p.b - p.a).normalized();
}

float side(const PartDef& p)
{
    return p.a.x + p.b.x >= 0.0f ? 1.0f : -1.0f;
}

// 1 at centre, falling to 0 at width away.
float band(float x, float centre, float width)
{
    return std::max(0.0f, 1.0f - std::fabs(x - centre) / width);
}

// How much a head vertex faces forwards (0 at the sides and back).
float front(const VertexInfo& v)
{
    return std::max(0.0f, v.radial.normalized().z);
}

Offset scalePartAbout(float at, float s)
{
    return [at, s](const VertexInfo& v, const PartDef& p) {
        return (v.pos() - (p.a + (p.b - p.a) * at)) * (s - 1.0f);
    };
}

Offset swell(float s, bool middle)
{
    return [s, middle](const VertexInfo& v, const PartDef&) {
        return v.radial * (s * (middle ? std::sin(kPi * v.t) : 1.0f));
    };
}

QVector<MorphDef> morphDefs()
{
    const RkVec3 headCentre(0.0f, 1.69f, 0.0f);
    const QStringList both = {"lEar", "rEar"};
    QVector<MorphDef> m = {
        // Face: the mouth sits low on the front of the head, the brow high.
        {"Smile",
         "face",
         {"head"},
         [](const VertexInfo& v, const PartDef& p) {
             const float w = band(v.t, 0.27f, 0.1f) * front(v);
             const float corner = std::fabs(v.radial.x) / p.rx;
             return RkVec3(v.radial.x * 0.15f * w, 0.02f * w * corner, -0.004f * w);
         }},
        {"Frown",
         "face",
         {"head"},
         [](const VertexInfo& v, const PartDef& p) {
             const float w = band(v.t, 0.27f, 0.1f) * front(v);
             const float corner = std::fabs(v.radial.x) / p.rx;
             return RkVec3(0, -0.02f * w * corner, 0.006f * w);
         }},
        {"BrowUp",
         "face",
         {"head"},
         [](const VertexInfo& v, const PartDef&) {
             const float w = band(v.t, 0.63f, 0.12f) * front(v);
             return RkVec3(0, 0.02f * w, 0.012f * w);
         }},
        {"CheeksPuff",
         "face",
         {"head"},
         [](const VertexInfo& v, const PartDef&) {
             const float w = band(v.t, 0.4f, 0.16f) * front(v) *
                             std::min(1.0f, std::fabs(v.radial.normalized().x) * 2.0f);
             return v.radial.normalized() * (0.025f * w);
         }},
        {"JawOpen",
         "face",
         {"head"},
         [](const VertexInfo& v, const PartDef&) {
             const float w = std::max(0.0f, 0.3f - v.t) / 0.3f * front(v);
             return RkVec3(0, -0.04f * w, 0.01f * w);
         }},
        {"NoseLong",
         "face",
         {"nose"},
         [](const VertexInfo& v, const PartDef& p) { return axisOf(p) * (0.04f * v.t); }},
        // Ears
        {"EarsPointed", "ears", both,
         [](const VertexInfo& v, const PartDef&) {
             const float up = std::max(0.0f, v.t - 0.4f) / 0.6f;
             return RkVec3(0, 0.05f * up * up, -0.02f * up);
         }},
        {"EarsLarge", "ears", both, scalePartAbout(0.5f, 2.0f)},
        {"EarsBack", "ears", both,
         [](const VertexInfo& v, const PartDef& p) {
             // Turn the ear backwards about its front edge.
             return RkVec3(side(p) * 0.012f, 0, -0.03f - v.radial.z * 0.5f) *
                    std::sin(kPi * 0.5f * (0.3f + 0.7f * v.t));
         }},
        // Head
        {"HeadRound",
         "head",
         {"head"},
         [headCentre](const VertexInfo& v, const PartDef&) {
             const RkVec3 onSphere = headCentre + (v.pos() - headCentre).normalized() * 0.12f;
             return onSphere - v.pos();
         }},
        {"HeadLong",
         "head",
         {"head"},
         [](const VertexInfo& v, const PartDef&) {
             return RkVec3(0, 0.07f * v.t * v.t, 0.01f * v.t);
         }},
        {"HeadWide",
         "head",
         {"head", "lEar", "rEar", "lEye", "rEye"},
         [headCentre](const VertexInfo& v, const PartDef&) {
             return RkVec3((v.pos().x - headCentre.x) * 0.3f, 0, 0);
         }},
        // Body
        {"BodyHeavy", "body", {"chest", "abdomen", "hip"}, swell(0.25f, false)},
        {"BodyThin", "body", {"chest", "abdomen", "hip"}, swell(-0.18f, false)},
        {"Belly",
         "body",
         {"abdomen"},
         [](const VertexInfo& v, const PartDef&) {
             return RkVec3(0, 0, std::max(0.0f, v.radial.z) * 0.9f * std::sin(kPi * v.t));
         }},
        {"ChestBroad",
         "body",
         {"chest"},
         [](const VertexInfo& v, const PartDef&) {
             return RkVec3(v.radial.x * 0.3f * v.t, 0, std::max(0.0f, v.radial.z) * 0.2f);
         }},
        {"ShouldersWide",
         "body",
         {"lCollar", "rCollar"},
         [](const VertexInfo& v, const PartDef& p) {
             return RkVec3(side(p) * 0.05f * v.t, 0, 0) + v.radial * (0.3f * v.t);
         }},
        // Arms
        {"ArmsMuscular", "arms", {"lUpperArm", "rUpperArm"}, swell(0.45f, true)},
        {"ArmsLong",
         "arms",
         {"lForeArm", "rForeArm", "lHand", "rHand"},
         [](const VertexInfo& v, const PartDef& p) {
             const bool hand = p.name.endsWith("Hand");
             return axisOf(p) * (0.08f * (hand ? 1.0f : v.t));
         }},
        {"HandsLarge", "arms", {"lHand", "rHand"}, scalePartAbout(0.0f, 1.35f)},
        // Legs
        {"LegsLong",
         "legs",
         {"lShin", "rShin", "lFoot", "rFoot"},
         [](const VertexInfo& v, const PartDef& p) {
             const bool foot = p.name.endsWith("Foot");
             return RkVec3(0, -0.07f * (foot ? 1.0f : v.t), 0);
         }},
        {"ThighsHeavy", "legs", {"lThigh", "rThigh"}, swell(0.35f, true)},
        {"CalvesStrong",
         "legs",
         {"lShin", "rShin"},
         [](const VertexInfo& v, const PartDef&) {
             const float calf = band(v.t, 0.35f, 0.35f);
             return v.radial * 0.45f * calf + RkVec3(0, 0, -0.01f * calf);
         }},
        {"FeetLarge",
         "legs",
         {"lFoot", "rFoot"},
         [](const VertexInfo& v, const PartDef& p) {
             return (v.pos() - (p.a + RkVec3(0, -0.04f, 0))) * 0.3f;
         }},
        // A small correction of the waist that goes with the body shapes.
        {"BodyCorrection", "body", {"abdomen"}, swell(-0.06f, true)},
    };
    return m;
}

} // namespace

struct RkDemoMesh::Private {
    std::unique_ptr<RkPolyMesh> mesh;
    QVector<int> vertexBones;
    QVector<RkMorphDeltas> morphs;
};

RkDemoMesh::RkDemoMesh() : d(std::make_unique<Private>())
{
    d->mesh = std::make_unique<RkPolyMesh>();
    RkPolyMesh& mesh = *d->mesh;
    const QVector<PartDef> parts = partDefs();
    QVector<VertexInfo> info;

    // UV islands: one cell of a 6 by 6 layout per part, with a margin between cells.
    const int cells = 6;
    const float cell = 1.0f / cells, margin = 0.01f;

    for (int pi = 0; pi < parts.size(); ++pi) {
        const PartDef& p = parts[pi];
        const int bone = boneIndex(p.bone);
        if (bone < 0)
            continue;
        const RkVec3 axis = axisOf(p);
        const RkVec3 ref = std::fabs(axis.z) > 0.9f ? RkVec3(0, 1, 0) : RkVec3(0, 0, 1);
        const RkVec3 u = axis.cross(ref).normalized();
        const RkVec3 w = u.cross(axis).normalized();
        const float len = (p.b - p.a).length();
        const float u0 = (pi % cells) * cell + margin, v0 = (pi / cells) * cell + margin;
        const float span = cell - 2.0f * margin;

        auto addVertex = [&](const RkVec3& pos, float t, const RkVec3& axisPoint) {
            VertexInfo vi;
            vi.part = pi;
            vi.t = t;
            vi.axisPoint = axisPoint;
            vi.radial = pos - axisPoint;
            info.append(vi);
            d->vertexBones.append(bone);
            return mesh.addVertex(pos);
        };

        const int bottom = addVertex(p.a, 0.0f, p.a);
        QVector<int> ring; // (rings - 1) rings of segs vertices
        for (int r = 1; r < p.rings; ++r) {
            // Rings are spaced by angle so that the rounded ends get as many rings as the middle.
            const float phi = kPi * float(r) / p.rings;
            const float t = 0.5f * (1.0f - std::cos(phi));
            const float s = std::pow(std::sin(phi), p.shape) * (1.0f + p.taper * (0.5f - t));
            const RkVec3 c = p.a + axis * (len * t);
            for (int j = 0; j < p.segs; ++j) {
                const float th = 2.0f * kPi * j / p.segs;
                const RkVec3 pos =
                    c + u * (std::cos(th) * p.rx * s) + w * (std::sin(th) * p.rz * s);
                ring.append(addVertex(pos, t, c));
            }
        }
        const int top = addVertex(p.b, 1.0f, p.b);

        // UVs: a grid with a duplicated seam column, and one pole value per pole triangle.
        QVector<int> gridUV;
        for (int r = 1; r < p.rings; ++r) {
            for (int j = 0; j <= p.segs; ++j)
                gridUV.append(mesh.addUV(u0 + span * j / p.segs, v0 + span * r / p.rings));
        }
        auto vtx = [&](int r, int j) { return ring[(r - 1) * p.segs + (j % p.segs)]; };
        auto uvi = [&](int r, int j) { return gridUV[(r - 1) * (p.segs + 1) + j]; };

        const int last = p.rings - 1;
        for (int j = 0; j < p.segs; ++j) {
            RkTriFacet tri;
            tri.material = quint8(p.material);
            tri.vertices[0] = bottom;
            tri.vertices[1] = vtx(1, j + 1);
            tri.vertices[2] = vtx(1, j);
            tri.uvs[0] = mesh.addUV(u0 + span * (j + 0.5f) / p.segs, v0);
            tri.uvs[1] = uvi(1, j + 1);
            tri.uvs[2] = uvi(1, j);
            mesh.addTri(tri);

            tri.vertices[0] = top;
            tri.vertices[1] = vtx(last, j);
            tri.vertices[2] = vtx(last, j + 1);
            tri.uvs[0] = mesh.addUV(u0 + span * (j + 0.5f) / p.segs, v0 + span);
            tri.uvs[1] = uvi(last, j);
            tri.uvs[2] = uvi(last, j + 1);
            mesh.addTri(tri);
        }
        for (int r = 1; r < last; ++r) {
            for (int j = 0; j < p.segs; ++j) {
                RkQuadFacet q;
                q.material = quint8(p.material);
                q.vertices[0] = vtx(r, j);
                q.vertices[1] = vtx(r, j + 1);
                q.vertices[2] = vtx(r + 1, j + 1);
                q.vertices[3] = vtx(r + 1, j);
                q.uvs[0] = uvi(r, j);
                q.uvs[1] = uvi(r, j + 1);
                q.uvs[2] = uvi(r + 1, j + 1);
                q.uvs[3] = uvi(r + 1, j);
                mesh.addQuad(q);
            }
        }
    }

    for (const MorphDef& def : morphDefs()) {
        RkMorphDeltas morph;
        morph.name = QString::fromLatin1(def.name);
        for (int v = 0; v < info.size(); ++v) {
            const PartDef& p = parts[info[v].part];
            if (!def.parts.contains(QString::fromLatin1(p.name)))
                continue;
            const RkVec3 off = def.offset(info[v], p);
            if (off.lengthSquared() < 1e-12f)
                continue;
            morph.indices.append(v);
            morph.deltas.append(off);
        }
        d->morphs.append(morph);
    }
}

RkDemoMesh::~RkDemoMesh() = default;

std::unique_ptr<RkPolyMesh> RkDemoMesh::createFigureMesh() const
{
    auto copy = std::make_unique<RkPolyMesh>();
    for (const RkVec3& v : d->mesh->getVertices())
        copy->addVertex(v);
    const RkMap* src = d->mesh->getUVs();
    auto* uvs = new RkMap(RkMap::Point2D);
    uvs->setValues(
        QVector<float>(src->getValuesPtr(), src->getValuesPtr() + 2 * src->getNumValues()));
    copy->setUVs(uvs);
    for (int i = 0; i < d->mesh->getNumTris(); ++i)
        copy->addTri(d->mesh->getTrisPtr()[i]);
    for (int i = 0; i < d->mesh->getNumQuads(); ++i)
        copy->addQuad(d->mesh->getQuadsPtr()[i]);
    return copy;
}

std::unique_ptr<RkPolyMesh> RkDemoMesh::createBoneMesh(int bone) const
{
    const RkPolyMesh& all = *d->mesh;
    QHash<int, int> vmap, umap;
    auto out = std::make_unique<RkPolyMesh>();
    auto vertex = [&](int v) {
        auto it = vmap.constFind(v);
        if (it == vmap.constEnd())
            it = vmap.insert(v, out->addVertex(all.getVertices()[v]));
        return it.value();
    };
    auto uv = [&](int i) {
        auto it = umap.constFind(i);
        if (it == umap.constEnd()) {
            const RkPnt2 p = all.getUVs()->getPnt2(i);
            it = umap.insert(i, out->addUV(p.x, p.y));
        }
        return it.value();
    };
    // Vertices first, in the whole mesh's order, so that boneMorphs() can remap the same way.
    for (int v = 0; v < d->vertexBones.size(); ++v) {
        if (d->vertexBones[v] == bone)
            vertex(v);
    }
    if (vmap.isEmpty())
        return nullptr;
    for (int i = 0; i < all.getNumTris(); ++i) {
        RkTriFacet f = all.getTrisPtr()[i];
        if (d->vertexBones[f.vertices[0]] != bone)
            continue;
        for (int c = 0; c < 3; ++c) {
            f.vertices[c] = vertex(f.vertices[c]);
            f.uvs[c] = uv(f.uvs[c]);
        }
        out->addTri(f);
    }
    for (int i = 0; i < all.getNumQuads(); ++i) {
        RkQuadFacet f = all.getQuadsPtr()[i];
        if (d->vertexBones[f.vertices[0]] != bone)
            continue;
        for (int c = 0; c < 4; ++c) {
            f.vertices[c] = vertex(f.vertices[c]);
            f.uvs[c] = uv(f.uvs[c]);
        }
        out->addQuad(f);
    }
    return out;
}

QVector<RkMorphDeltas> RkDemoMesh::boneMorphs(int bone) const
{
    QVector<int> local(d->vertexBones.size(), -1);
    int next = 0;
    for (int v = 0; v < d->vertexBones.size(); ++v) {
        if (d->vertexBones[v] == bone)
            local[v] = next++;
    }
    QVector<RkMorphDeltas> out;
    for (const RkMorphDeltas& m : d->morphs) {
        RkMorphDeltas part;
        part.name = m.name;
        for (int i = 0; i < m.indices.size(); ++i) {
            const int v = local[m.indices[i]];
            if (v < 0)
                continue;
            part.indices.append(v);
            part.deltas.append(m.deltas[i]);
        }
        if (!part.indices.isEmpty())
            out.append(part);
    }
    return out;
}

std::unique_ptr<RkSubDMesh> RkDemoMesh::createPropMesh(const RkVec3& centre)
{
    // A cube cage of 4 by 4 patches per face, pulled most of the way onto a sphere so the prop
    // reads as a ball; each face is its own UV island in a cross layout.
    auto mesh = std::make_unique<RkSubDMesh>();
    const int n = 4;
    const float half = 0.2f;
    struct Face {
        RkVec3 normal, du, dv;
        float cu, cv; // island origin in the cross
    };
    const Face faces[6] = {
        {{0, 0, 1}, {1, 0, 0}, {0, 1, 0}, 0.25f, 0.375f},
        {{1, 0, 0}, {0, 0, -1}, {0, 1, 0}, 0.5f, 0.375f},
        {{0, 0, -1}, {-1, 0, 0}, {0, 1, 0}, 0.75f, 0.375f},
        {{-1, 0, 0}, {0, 0, 1}, {0, 1, 0}, 0.0f, 0.375f},
        {{0, 1, 0}, {1, 0, 0}, {0, 0, -1}, 0.25f, 0.625f},
        {{0, -1, 0}, {1, 0, 0}, {0, 0, 1}, 0.25f, 0.125f},
    };
    const float island = 0.25f, inset = 0.01f;
    QHash<QString, int> shared; // cage points shared by neighbouring faces
    for (const Face& face : faces) {
        int vid[n + 1][n + 1];
        int uid[n + 1][n + 1];
        for (int i = 0; i <= n; ++i) {
            for (int j = 0; j <= n; ++j) {
                const float a = -1.0f + 2.0f * i / n, b = -1.0f + 2.0f * j / n;
                const RkVec3 cube = face.normal + face.du * a + face.dv * b;
                const QString key = QStringLiteral("%1,%2,%3")
                                        .arg(qRound(cube.x * n))
                                        .arg(qRound(cube.y * n))
                                        .arg(qRound(cube.z * n));
                auto it = shared.constFind(key);
                if (it == shared.constEnd()) {
                    const RkVec3 sphere = cube.normalized() * 1.1f;
                    it = shared.insert(
                        key, mesh->addVertex(centre + (cube * 0.15f + sphere * 0.85f) * half));
                }
                vid[i][j] = it.value();
                uid[i][j] = mesh->addUV(face.cu + inset + (island - 2 * inset) * i / n,
                                        face.cv + inset + (island - 2 * inset) * j / n);
            }
        }
        for (int i = 0; i < n; ++i) {
            for (int j = 0; j < n; ++j) {
                RkSubDPatch patch;
                const int ci[4][2] = {{i, j}, {i + 1, j}, {i + 1, j + 1}, {i, j + 1}};
                for (int c = 0; c < 4; ++c) {
                    patch.vertices[c] = vid[ci[c][0]][ci[c][1]];
                    patch.uvs[c] = uid[ci[c][0]][ci[c][1]];
                }
                mesh->addPatch(patch);
            }
        }
    }
    return mesh;
}

QStringList RkDemoMesh::materialNames()
{
    return {QStringLiteral("Skin"), QStringLiteral("Eyes"), QStringLiteral("Shirt"),
            QStringLiteral("Trousers")};
}

QVector<QColor> RkDemoMesh::materialColours()
{
    return {QColor(224, 172, 140), QColor(40, 70, 140), QColor(70, 120, 190), QColor(60, 60, 72)};
}

QStringList RkDemoMesh::boneNames()
{
    QStringList names;
    for (const BoneDef& b : kBones)
        names << QString::fromLatin1(b.name);
    return names;
}

int RkDemoMesh::boneParent(int bone)
{
    return bone >= 0 && bone < kNumBones ? kBones[bone].parent : -1;
}

RkVec3 RkDemoMesh::jointCentre(int bone)
{
    return bone >= 0 && bone < kNumBones ? kBones[bone].centre : RkVec3();
}

const QVector<int>& RkDemoMesh::vertexBones() const
{
    return d->vertexBones;
}

const QVector<RkMorphDeltas>& RkDemoMesh::morphs() const
{
    return d->morphs;
}

QString RkDemoMesh::morphRegion(const QString& morph)
{
    for (const MorphDef& def : morphDefs()) {
        if (morph == QLatin1String(def.name))
            return QString::fromLatin1(def.region);
    }
    return QString();
}

const RkDemoMesh& RkDemoMesh::instance()
{
    static const RkDemoMesh mesh;
    return mesh;
}

void RkDemoMesh::buildFigure(RkNode* node)
{
    auto* figure = qobject_cast<RkSkeleton*>(node);
    if (!figure)
        return;
    const RkDemoMesh& demo = instance();

    // The figure's own object holds the materials its bones share; a rebuild replaces them all.
    auto* holder = new RkObject(QStringLiteral("Figure"));
    auto* materialShape = new RkShape(QStringLiteral("Materials"));
    QList<RkMaterial*> materials;
    const QStringList names = materialNames();
    const QVector<QColor> colours = materialColours();
    for (int i = 0; i < names.size(); ++i) {
        auto* m = new RkMaterial(names[i]);
        m->setDiffuseColor(colours[i]);
        materialShape->addMaterial(m);
        materials.append(m);
    }
    holder->addShape(materialShape);

    QList<RkBone*> bones;
    figure->getAllBones(bones);
    const QStringList known = boneNames();
    for (RkBone* bone : bones) {
        const int index = known.indexOf(bone->getName());
        std::unique_ptr<RkPolyMesh> mesh = index >= 0 ? demo.createBoneMesh(index) : nullptr;
        if (!mesh) {
            bone->setObject(nullptr);
            continue;
        }
        auto* object = new RkObject(bone->getName());
        auto* shape = new RkShape(bone->getName());
        for (RkMaterial* m : materials)
            shape->addMaterial(m);
        object->addShape(shape);
        object->setGeometry(mesh.release());
        for (const RkMorphDeltas& morph : demo.boneMorphs(index)) {
            if (auto* p = qobject_cast<RkFloatProperty*>(figure->findProperty(morph.name)))
                object->addMorph(morph, p);
        }
        bone->setObject(object);
    }
    // Set last: the old materials (and with them the old holder) go only now that no new shape
    // refers to them.
    figure->setObject(holder);
}

void RkDemoMesh::buildProp(RkNode* node)
{
    if (!node)
        return;
    const QVector3D o = node->getOrigin();
    auto* object = new RkObject(QStringLiteral("Ball"));
    auto* shape = new RkShape(QStringLiteral("Ball"));
    auto* material = new RkMaterial(QStringLiteral("Ball"));
    material->setDiffuseColor(QColor(214, 120, 52));
    shape->addMaterial(material);
    object->addShape(shape);
    object->setGeometry(createPropMesh(RkVec3(o.x(), o.y(), o.z())).release());
    node->setObject(object);
}
