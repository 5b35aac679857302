#include "rkdemomesh.h"

#include "rkmap.h"
#include "rkpolymesh.h"
#include "rksubdmesh.h"

#include <cmath>
#include <functional>

namespace
{

const float kPi = float(M_PI);

enum Bone {
    Hip,
    Abdomen,
    Chest,
    Neck,
    Head,
    LShldr,
    LForeArm,
    LHand,
    RShldr,
    RForeArm,
    RHand,
    LThigh,
    LShin,
    LFoot,
    RThigh,
    RShin,
    RFoot,
    NumBones
};

struct BoneDef {
    const char* name;
    int parent;
    RkVec3 centre;
};

// A-pose arms: they leave the shoulder about 29 degrees below the horizontal.
const RkVec3 kArmDir = RkVec3(1.0f, -0.55f, 0.0f).normalized();
const RkVec3 kLShoulder(0.19f, 1.40f, 0.0f);
const RkVec3 kLElbow = kLShoulder + kArmDir * 0.29f;
const RkVec3 kLWrist = kLElbow + kArmDir * 0.26f;

RkVec3 mirror(const RkVec3& v)
{
    return RkVec3(-v.x, v.y, v.z);
}

const BoneDef kBones[NumBones] = {
    {"hip", -1, RkVec3(0.0f, 0.95f, 0.0f)},
    {"abdomen", Hip, RkVec3(0.0f, 1.02f, 0.0f)},
    {"chest", Abdomen, RkVec3(0.0f, 1.20f, 0.0f)},
    {"neck", Chest, RkVec3(0.0f, 1.42f, 0.0f)},
    {"head", Neck, RkVec3(0.0f, 1.53f, 0.0f)},
    {"lShldr", Chest, kLShoulder},
    {"lForeArm", LShldr, kLElbow},
    {"lHand", LForeArm, kLWrist},
    {"rShldr", Chest, mirror(kLShoulder)},
    {"rForeArm", RShldr, mirror(kLElbow)},
    {"rHand", RForeArm, mirror(kLWrist)},
    {"lThigh", Hip, RkVec3(0.09f, 0.90f, 0.0f)},
    {"lShin", LThigh, RkVec3(0.10f, 0.50f, 0.0f)},
    {"lFoot", LShin, RkVec3(0.10f, 0.08f, 0.0f)},
    {"rThigh", Hip, RkVec3(-0.09f, 0.90f, 0.0f)},
    {"rShin", RThigh, RkVec3(-0.10f, 0.50f, 0.0f)},
    {"rFoot", RShin, RkVec3(-0.10f, 0.08f, 0.0f)},
};

// One body part: a closed surface of revolution around the axis a-b, with radii rx and rz across
// the axis. At angle phi of the profile the ring lies at (1 - cos phi) / 2 along the axis with
// radius sin(phi)^shape: shape 1 gives an ellipsoid, a small shape a tube with rounded ends.
// taper > 0 makes the a end wider.
struct PartDef {
    const char* name;
    int bone;
    int material;
    RkVec3 a, b;
    float rx, rz;
    float shape;
    float taper;
    int rings, segs;
};

QVector<PartDef> partDefs()
{
    const RkVec3 ld = kArmDir, rd = mirror(kArmDir);
    using M = RkDemoMesh;
    QVector<PartDef> p = {
        {"head", Head, M::Skin, {0, 1.50f, 0}, {0, 1.76f, 0}, 0.095f, 0.11f, 1.0f, 0, 14, 20},
        {"lEye",
         Head,
         M::Eyes,
         {0.035f, 1.65f, 0.078f},
         {0.035f, 1.65f, 0.114f},
         0.018f,
         0.018f,
         1.0f,
         0,
         6,
         10},
        {"rEye",
         Head,
         M::Eyes,
         {-0.035f, 1.65f, 0.078f},
         {-0.035f, 1.65f, 0.114f},
         0.018f,
         0.018f,
         1.0f,
         0,
         6,
         10},
        {"nose",
         Head,
         M::Skin,
         {0, 1.625f, 0.09f},
         {0, 1.59f, 0.128f},
         0.014f,
         0.014f,
         0.8f,
         0,
         5,
         8},
        {"lEar",
         Head,
         M::Skin,
         {0.097f, 1.595f, 0},
         {0.097f, 1.665f, 0},
         0.012f,
         0.024f,
         0.9f,
         0,
         6,
         10},
        {"rEar",
         Head,
         M::Skin,
         {-0.097f, 1.595f, 0},
         {-0.097f, 1.665f, 0},
         0.012f,
         0.024f,
         0.9f,
         0,
         6,
         10},
        {"neck", Neck, M::Skin, {0, 1.40f, 0}, {0, 1.56f, 0}, 0.05f, 0.05f, 0.2f, 0, 6, 12},
        {"chest",
         Chest,
         M::Shirt,
         {0, 1.16f, 0},
         {0, 1.47f, 0},
         0.18f,
         0.11f,
         0.45f,
         -0.1f,
         10,
         20},
        {"abdomen", Abdomen, M::Shirt, {0, 1.0f, 0}, {0, 1.22f, 0}, 0.14f, 0.10f, 0.35f, 0, 8, 20},
        {"hip", Hip, M::Trousers, {0, 0.84f, 0}, {0, 1.05f, 0}, 0.16f, 0.11f, 0.4f, 0.05f, 8, 20},
        {"lUpperArm", LShldr, M::Shirt, kLShoulder - ld * 0.03f, kLElbow + ld * 0.02f, 0.052f,
         0.055f, 0.2f, 0.1f, 8, 12},
        {"lForeArm", LForeArm, M::Skin, kLElbow, kLWrist + ld * 0.01f, 0.042f, 0.042f, 0.3f, 0.15f,
         8, 12},
        {"lHand", LHand, M::Skin, kLWrist, kLWrist + ld * 0.17f, 0.02f, 0.045f, 0.6f, 0, 6, 10},
        {"rUpperArm", RShldr, M::Shirt, mirror(kLShoulder) - rd * 0.03f,
         mirror(kLElbow) + rd * 0.02f, 0.052f, 0.055f, 0.2f, 0.1f, 8, 12},
        {"rForeArm", RForeArm, M::Skin, mirror(kLElbow), mirror(kLWrist) + rd * 0.01f, 0.042f,
         0.042f, 0.3f, 0.15f, 8, 12},
        {"rHand", RHand, M::Skin, mirror(kLWrist), mirror(kLWrist) + rd * 0.17f, 0.02f, 0.045f,
         0.6f, 0, 6, 10},
        {"lThigh",
         LThigh,
         M::Trousers,
         {0.09f, 0.95f, 0},
         {0.10f, 0.48f, 0},
         0.08f,
         0.085f,
         0.3f,
         0.15f,
         10,
         12},
        {"lShin",
         LShin,
         M::Trousers,
         {0.10f, 0.52f, 0},
         {0.10f, 0.07f, 0},
         0.056f,
         0.058f,
         0.25f,
         0.15f,
         10,
         12},
        {"lFoot",
         LFoot,
         M::Skin,
         {0.10f, 0.04f, -0.05f},
         {0.10f, 0.04f, 0.17f},
         0.045f,
         0.035f,
         0.6f,
         0,
         6,
         10},
        {"rThigh",
         RThigh,
         M::Trousers,
         {-0.09f, 0.95f, 0},
         {-0.10f, 0.48f, 0},
         0.08f,
         0.085f,
         0.3f,
         0.15f,
         10,
         12},
        {"rShin",
         RShin,
         M::Trousers,
         {-0.10f, 0.52f, 0},
         {-0.10f, 0.07f, 0},
         0.056f,
         0.058f,
         0.25f,
         0.15f,
         10,
         12},
        {"rFoot",
         RFoot,
         M::Skin,
         {-0.10f, 0.04f, -0.05f},
         {-0.10f, 0.04f, 0.17f},
         0.045f,
         0.035f,
         0.6f,
         0,
         6,
         10},
    };
    return p;
}

// Where each vertex came from, so morphs can shape parts by their own coordinates.
struct VertexInfo {
    int part = 0;
    float t = 0.0f;   // along the part's axis, 0 at a, 1 at b
    RkVec3 axisPoint; // the point on the axis the vertex rings around
    RkVec3 radial;    // vertex minus axisPoint
};

struct MorphDef {
    const char* name;
    const char* region;
    QStringList parts;
    std::function<RkVec3(const VertexInfo&, const PartDef&)> offset;
};

RkVec3 axisOf(const PartDef& p)
{
    return (p.b - p.a).normalized();
}

float side(const PartDef& p)
{
    return p.a.x + p.b.x >= 0.0f ? 1.0f : -1.0f;
}

QVector<MorphDef> morphDefs()
{
    const RkVec3 headCentre(0.0f, 1.63f, 0.0f);
    auto scaleAbout = [](const RkVec3& c, float s) {
        return [c, s](const VertexInfo& v, const PartDef&) {
            return (v.axisPoint + v.radial - c) * (s - 1.0f);
        };
    };
    auto swell = [](float s, bool middle) {
        return [s, middle](const VertexInfo& v, const PartDef&) {
            return v.radial * (s * (middle ? std::sin(kPi * v.t) : 1.0f));
        };
    };
    const QStringList wholeHead = {"head", "lEye", "rEye", "nose", "lEar", "rEar"};
    QVector<MorphDef> m = {
        // Head
        {"Head Size", "Head", wholeHead, scaleAbout(headCentre, 1.2f)},
        {"Head Long",
         "Head",
         {"head"},
         [](const VertexInfo& v, const PartDef&) { return RkVec3(0, 0.06f * v.t * v.t, 0); }},
        {"Head Wide",
         "Head",
         {"head"},
         [](const VertexInfo& v, const PartDef&) { return RkVec3(v.radial.x * 0.25f, 0, 0); }},
        {"Head Flat",
         "Head",
         {"head"},
         [](const VertexInfo& v, const PartDef&) { return RkVec3(0, 0, -v.radial.z * 0.22f); }},
        // Face
        {"Eyes Big", "Face", {"lEye", "rEye"}, swell(0.6f, false)},
        {"Eyes Apart",
         "Face",
         {"lEye", "rEye"},
         [](const VertexInfo&, const PartDef& p) { return RkVec3(side(p) * 0.012f, 0, 0); }},
        {"Nose Long",
         "Face",
         {"nose"},
         [](const VertexInfo& v, const PartDef& p) { return axisOf(p) * (0.035f * v.t); }},
        {"Nose Wide",
         "Face",
         {"nose"},
         [](const VertexInfo& v, const PartDef&) { return RkVec3(v.radial.x * 0.8f, 0, 0); }},
        {"Jaw Wide",
         "Face",
         {"head"},
         [](const VertexInfo& v, const PartDef&) {
             const float low = std::max(0.0f, 0.55f - v.t) / 0.55f;
             return RkVec3(v.radial.x * 0.45f * low, 0, v.radial.z > 0 ? 0.01f * low : 0);
         }},
        {"Cheeks Full",
         "Face",
         {"head"},
         [](const VertexInfo& v, const PartDef&) {
             const float band = std::max(0.0f, 1.0f - std::fabs(v.t - 0.45f) / 0.2f);
             const float front = std::max(0.0f, v.radial.normalized().z);
             return v.radial.normalized() * (0.02f * band * front);
         }},
        // Ears
        {"Ears Elf",
         "Ears",
         {"lEar", "rEar"},
         [](const VertexInfo& v, const PartDef&) {
             const float up = std::max(0.0f, v.t - 0.4f) / 0.6f;
             return RkVec3(0, 0.05f * up * up, -0.02f * up);
         }},
        {"Ears Big",
         "Ears",
         {"lEar", "rEar"},
         [](const VertexInfo& v, const PartDef& p) {
             const RkVec3 c = (p.a + p.b) * 0.5f;
             return (v.axisPoint + v.radial - c) * 0.6f;
         }},
        {"Ears Out",
         "Ears",
         {"lEar", "rEar"},
         [](const VertexInfo& v, const PartDef& p) {
             return RkVec3(side(p) * 0.03f * v.t, 0, 0.01f * v.t);
         }},
        // Body
        {"Body Heavy", "Body", {"chest", "abdomen", "hip"}, swell(0.25f, false)},
        {"Chest Broad",
         "Body",
         {"chest"},
         [](const VertexInfo& v, const PartDef&) { return RkVec3(v.radial.x * 0.3f, 0, 0); }},
        {"Waist Thin", "Body", {"abdomen"}, swell(-0.22f, true)},
        {"Belly Out",
         "Body",
         {"abdomen"},
         [](const VertexInfo& v, const PartDef&) {
             return RkVec3(0, 0, std::max(0.0f, v.radial.z) * 0.8f * std::sin(kPi * v.t));
         }},
        {"Hips Wide",
         "Body",
         {"hip"},
         [](const VertexInfo& v, const PartDef&) { return RkVec3(v.radial.x * 0.35f, 0, 0); }},
        // Arms
        {"Arms Muscular", "Arms", {"lUpperArm", "rUpperArm"}, swell(0.45f, true)},
        {"Forearms Thick", "Arms", {"lForeArm", "rForeArm"}, swell(0.35f, true)},
        {"Hands Big",
         "Arms",
         {"lHand", "rHand"},
         [](const VertexInfo& v, const PartDef& p) {
             return (v.axisPoint + v.radial - p.a) * 0.35f;
         }},
        // Legs
        {"Thighs Thick", "Legs", {"lThigh", "rThigh"}, swell(0.35f, true)},
        {"Calves Thick",
         "Legs",
         {"lShin", "rShin"},
         [](const VertexInfo& v, const PartDef&) {
             const float calf = std::max(0.0f, std::sin(kPi * std::min(1.0f, v.t * 1.6f)));
             return v.radial * (0.45f * calf);
         }},
        {"Feet Big",
         "Legs",
         {"lFoot", "rFoot"},
         [](const VertexInfo& v, const PartDef& p) {
             const RkVec3 heel = p.a + RkVec3(0, -0.04f, 0);
             return (v.axisPoint + v.radial - heel) * 0.25f;
         }},
        {"Legs Bowed",
         "Legs",
         {"lThigh", "rThigh", "lShin", "rShin"},
         [](const VertexInfo& v, const PartDef& p) {
             // Knee outwards: thighs bend out towards their lower end, shins from their top.
             const bool thigh = QByteArray(p.name).contains("Thigh");
             const float k = thigh ? v.t : 1.0f - v.t;
             return RkVec3(side(p) * 0.05f * std::sin(kPi * 0.5f * k), 0, 0);
         }},
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

    // UV islands: one cell of a 5 by 5 atlas per part, with a margin between cells.
    const int cells = 5;
    const float cell = 1.0f / cells, margin = 0.012f;

    for (int pi = 0; pi < parts.size(); ++pi) {
        const PartDef& p = parts[pi];
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
            d->vertexBones.append(p.bone);
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
        auto uvAt = [&](int r, int j) {
            return mesh.addUV(u0 + span * j / p.segs, v0 + span * r / p.rings);
        };
        QVector<int> gridUV;
        for (int r = 1; r < p.rings; ++r) {
            for (int j = 0; j <= p.segs; ++j)
                gridUV.append(uvAt(r, j));
        }
        auto vtx = [&](int r, int j) { return ring[(r - 1) * p.segs + (j % p.segs)]; };
        auto uvi = [&](int r, int j) { return gridUV[(r - 1) * (p.segs + 1) + j]; };

        for (int j = 0; j < p.segs; ++j) {
            RkTriFacet tri;
            tri.material = quint8(p.material);
            const int pole = mesh.addUV(u0 + span * (j + 0.5f) / p.segs, v0);
            tri.vertices[0] = bottom;
            tri.vertices[1] = vtx(1, j + 1);
            tri.vertices[2] = vtx(1, j);
            tri.uvs[0] = pole;
            tri.uvs[1] = uvi(1, j + 1);
            tri.uvs[2] = uvi(1, j);
            mesh.addTri(tri);

            const int topPole = mesh.addUV(u0 + span * (j + 0.5f) / p.segs, v0 + span);
            const int lr = p.rings - 1;
            tri.vertices[0] = top;
            tri.vertices[1] = vtx(lr, j);
            tri.vertices[2] = vtx(lr, j + 1);
            tri.uvs[0] = topPole;
            tri.uvs[1] = uvi(lr, j);
            tri.uvs[2] = uvi(lr, j + 1);
            mesh.addTri(tri);
        }
        for (int r = 1; r < p.rings - 1; ++r) {
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
            if (!def.parts.contains(QLatin1String(p.name)))
                continue;
            const RkVec3 off = def.offset(info[v], p);
            if (off.lengthSquared() == 0.0f)
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
    RkMap* uvs = new RkMap(RkMap::Point2D);
    const RkMap* src = d->mesh->getUVs();
    uvs->setValues(
        QVector<float>(src->getValuesPtr(), src->getValuesPtr() + 2 * src->getNumValues()));
    copy->setUVs(uvs);
    for (int i = 0; i < d->mesh->getNumTris(); ++i)
        copy->addTri(d->mesh->getTrisPtr()[i]);
    for (int i = 0; i < d->mesh->getNumQuads(); ++i)
        copy->addQuad(d->mesh->getQuadsPtr()[i]);
    return copy;
}

std::unique_ptr<RkSubDMesh> RkDemoMesh::createPropMesh()
{
    // A cube cage of 3 by 3 patches per face, pulled half way towards a sphere so the prop reads
    // as a rounded box; each face is its own UV island in a cross layout.
    auto mesh = std::make_unique<RkSubDMesh>();
    const int n = 3;
    const RkVec3 centre(0.62f, 0.22f, 0.15f);
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
    QHash<QString, int> shared; // corner positions shared by neighbouring faces
    for (int f = 0; f < 6; ++f) {
        const Face& face = faces[f];
        int vid[n + 1][n + 1];
        int uid[n + 1][n + 1];
        for (int i = 0; i <= n; ++i) {
            for (int j = 0; j <= n; ++j) {
                const float a = -1.0f + 2.0f * i / n, b = -1.0f + 2.0f * j / n;
                const RkVec3 cube = face.normal + face.du * a + face.dv * b;
                const QString key = QStringLiteral("%1,%2,%3")
                                        .arg(qRound(cube.x * 3))
                                        .arg(qRound(cube.y * 3))
                                        .arg(qRound(cube.z * 3));
                auto it = shared.constFind(key);
                if (it == shared.constEnd()) {
                    const RkVec3 sphere = cube.normalized() * 1.2f;
                    const RkVec3 pos = centre + (cube * 0.5f + sphere * 0.5f) * half;
                    it = shared.insert(key, mesh->addVertex(pos));
                }
                vid[i][j] = it.value();
                uid[i][j] = mesh->addUV(face.cu + inset + (island - 2 * inset) * i / n,
                                        face.cv + inset + (island - 2 * inset) * j / n);
            }
        }
        for (int i = 0; i < n; ++i) {
            for (int j = 0; j < n; ++j) {
                RkSubDPatch patch;
                patch.material = 0;
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
    return bone >= 0 && bone < NumBones ? kBones[bone].parent : -1;
}

RkVec3 RkDemoMesh::jointCentre(int bone)
{
    return bone >= 0 && bone < NumBones ? kBones[bone].centre : RkVec3();
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
