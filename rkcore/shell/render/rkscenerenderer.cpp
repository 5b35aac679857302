#include "render/rkscenerenderer.h"

#include "geometry/rkgeometry.h"
#include "geometry/rkmap.h"

#include <QHash>
#include <QSet>

#include <GL/gl.h>

#include <algorithm>
#include <cmath>
#include <limits>

namespace
{

const RkVec3* positionsOf(const RkSceneRenderer::Item& item)
{
    if (item.positions && item.positions->size() == item.geometry->getNumVertices())
        return item.positions->constData();
    return item.geometry->getVerticesPtr();
}

// Triangle indices of a geometry grouped by material, kept while the geometry's revision stays
// the same.
struct TriangleCache {
    quint64 revision = 0;
    QVector<int> materials;          // material of each group
    QVector<QVector<GLuint>> groups; // triangle corner indices of each group
    QVector<QVector<GLuint>> uvs;    // the corners' UV indices, in step with groups
};

void buildTriangles(const RkGeometry* g, TriangleCache& cache)
{
    cache.revision = g->getRevision();
    cache.materials.clear();
    cache.groups.clear();
    cache.uvs.clear();
    int slot[256];
    std::fill(std::begin(slot), std::end(slot), -1);
    for (int f = 0, n = g->getNumFacets(); f < n; ++f) {
        const int m = g->getFacetMaterial(f) & 0xff;
        if (slot[m] < 0) {
            slot[m] = cache.groups.size();
            cache.materials.append(m);
            cache.groups.append(QVector<GLuint>());
            cache.uvs.append(QVector<GLuint>());
        }
        QVector<GLuint>& out = cache.groups[slot[m]];
        const int* v = g->getFacetVertices(f);
        out << GLuint(v[0]) << GLuint(v[1]) << GLuint(v[2]);
        if (g->getFacetSize(f) == 4)
            out << GLuint(v[0]) << GLuint(v[2]) << GLuint(v[3]);
        QVector<GLuint>& uv = cache.uvs[slot[m]];
        const int* t = g->getFacetUVs(f);
        uv << GLuint(t[0]) << GLuint(t[1]) << GLuint(t[2]);
        if (g->getFacetSize(f) == 4)
            uv << GLuint(t[0]) << GLuint(t[2]) << GLuint(t[3]);
    }
}

void computeNormals(const RkGeometry* g, const RkVec3* p, QVector<RkVec3>& normals)
{
    normals.fill(RkVec3(), g->getNumVertices());
    RkVec3* n = normals.data();
    for (int f = 0, nf = g->getNumFacets(); f < nf; ++f) {
        const int* v = g->getFacetVertices(f);
        RkVec3 fn;
        if (g->getFacetSize(f) == 4)
            fn = (p[v[2]] - p[v[0]]).cross(p[v[3]] - p[v[1]]);
        else
            fn = (p[v[1]] - p[v[0]]).cross(p[v[2]] - p[v[0]]);
        for (int c = 0, nc = g->getFacetSize(f); c < nc; ++c)
            n[v[c]] += fn;
    }
    for (RkVec3& v : normals)
        v.normalize();
}

// Möller-Trumbore; the distance along dir to the hit, or a negative value.
float intersect(const RkVec3& o, const RkVec3& dir, const RkVec3& a, const RkVec3& b,
                const RkVec3& c)
{
    const RkVec3 e1 = b - a, e2 = c - a;
    const RkVec3 pv = dir.cross(e2);
    const float det = e1.dot(pv);
    if (std::fabs(det) < 1e-12f)
        return -1.0f;
    const float inv = 1.0f / det;
    const RkVec3 tv = o - a;
    const float u = tv.dot(pv) * inv;
    if (u < 0.0f || u > 1.0f)
        return -1.0f;
    const RkVec3 qv = tv.cross(e1);
    const float v = dir.dot(qv) * inv;
    if (v < 0.0f || u + v > 1.0f)
        return -1.0f;
    return e2.dot(qv) * inv;
}

void colourOf(const QColor& c, GLfloat out[4])
{
    out[0] = GLfloat(c.redF());
    out[1] = GLfloat(c.greenF());
    out[2] = GLfloat(c.blueF());
    out[3] = GLfloat(c.alphaF());
}

} // namespace

struct RkSceneRenderer::Private {
    QHash<const RkGeometry*, TriangleCache> triangles;
    QVector<RkVec3> normals;
    // Texture objects of the current context by image, and those used by the current draw.
    QHash<qint64, GLuint> textures;
    QSet<qint64> texturesUsed;

    GLuint textureFor(const QImage& image);
};

GLuint RkSceneRenderer::Private::textureFor(const QImage& image)
{
    const qint64 key = image.cacheKey();
    texturesUsed.insert(key);
    const auto it = textures.constFind(key);
    if (it != textures.constEnd())
        return *it;
    GLint limit = 0;
    glGetIntegerv(GL_MAX_TEXTURE_SIZE, &limit);
    limit = std::max(limit, 64);
    QImage pixels = image;
    if (pixels.width() > limit || pixels.height() > limit)
        pixels = pixels.scaled(limit, limit, Qt::KeepAspectRatio, Qt::SmoothTransformation);
    // UV (0, 0) is the picture's lower left corner, which OpenGL keeps in its first row.
    pixels = pixels.convertToFormat(QImage::Format_RGBA8888).mirrored();
    GLuint id = 0;
    glGenTextures(1, &id);
    glBindTexture(GL_TEXTURE_2D, id);
    glPixelStorei(GL_UNPACK_ALIGNMENT, 4);
    glTexParameteri(GL_TEXTURE_2D, GL_TEXTURE_MIN_FILTER, GL_LINEAR);
    glTexParameteri(GL_TEXTURE_2D, GL_TEXTURE_MAG_FILTER, GL_LINEAR);
    glTexParameteri(GL_TEXTURE_2D, GL_TEXTURE_WRAP_S, GL_REPEAT);
    glTexParameteri(GL_TEXTURE_2D, GL_TEXTURE_WRAP_T, GL_REPEAT);
    glTexImage2D(GL_TEXTURE_2D, 0, GL_RGBA, pixels.width(), pixels.height(), 0, GL_RGBA,
                 GL_UNSIGNED_BYTE, pixels.constBits());
    textures.insert(key, id);
    return id;
}

RkVec3 RkSceneRenderer::Camera::eye() const
{
    const float d2r = float(M_PI / 180.0);
    const float cp = std::cos(pitch * d2r), sp = std::sin(pitch * d2r);
    const float cy = std::cos(yaw * d2r), sy = std::sin(yaw * d2r);
    return target + RkVec3(sy * cp, sp, cy * cp) * distance;
}

QMatrix4x4 RkSceneRenderer::Camera::view() const
{
    QMatrix4x4 m;
    const RkVec3 e = eye();
    m.lookAt(QVector3D(e.x, e.y, e.z), QVector3D(target.x, target.y, target.z), QVector3D(0, 1, 0));
    return m;
}

QMatrix4x4 RkSceneRenderer::Camera::projection(float aspect) const
{
    QMatrix4x4 m;
    const float dist = std::max(distance, 1e-3f);
    m.perspective(fovY, aspect > 0.0f ? aspect : 1.0f, dist * 0.01f, dist * 100.0f);
    return m;
}

RkSceneRenderer::RkSceneRenderer() : d(std::make_unique<Private>()) {}

RkSceneRenderer::~RkSceneRenderer() = default;

void RkSceneRenderer::draw(const QVector<Item>& items, const Camera& camera, int w, int h,
                           const QColor& background, Options options)
{
    w = std::max(w, 1);
    h = std::max(h, 1);
    glViewport(0, 0, w, h);
    glClearColor(GLfloat(background.redF()), GLfloat(background.greenF()),
                 GLfloat(background.blueF()), GLfloat(background.alphaF()));
    glClearDepth(1.0);
    glClear(GL_COLOR_BUFFER_BIT | GL_DEPTH_BUFFER_BIT);

    glMatrixMode(GL_PROJECTION);
    glLoadMatrixf(camera.projection(float(w) / float(h)).constData());
    glMatrixMode(GL_MODELVIEW);
    glLoadIdentity();

    // Lights are placed in eye space so the figure is lit from the viewer's side whatever the
    // orbit.
    const GLfloat key[4] = {-0.4f, 0.6f, 1.0f, 0.0f};
    const GLfloat fill[4] = {0.6f, -0.2f, 0.5f, 0.0f};
    const GLfloat keyDiffuse[4] = {0.85f, 0.85f, 0.82f, 1.0f};
    const GLfloat fillDiffuse[4] = {0.25f, 0.27f, 0.32f, 1.0f};
    const GLfloat ambient[4] = {0.22f, 0.22f, 0.24f, 1.0f};
    const GLfloat none[4] = {0.0f, 0.0f, 0.0f, 1.0f};
    glEnable(GL_LIGHTING);
    glEnable(GL_LIGHT0);
    glEnable(GL_LIGHT1);
    glLightfv(GL_LIGHT0, GL_POSITION, key);
    glLightfv(GL_LIGHT0, GL_DIFFUSE, keyDiffuse);
    glLightfv(GL_LIGHT0, GL_SPECULAR, keyDiffuse);
    glLightfv(GL_LIGHT0, GL_AMBIENT, none);
    glLightfv(GL_LIGHT1, GL_POSITION, fill);
    glLightfv(GL_LIGHT1, GL_DIFFUSE, fillDiffuse);
    glLightfv(GL_LIGHT1, GL_SPECULAR, none);
    glLightfv(GL_LIGHT1, GL_AMBIENT, none);
    glLightModelfv(GL_LIGHT_MODEL_AMBIENT, ambient);
    glLightModeli(GL_LIGHT_MODEL_TWO_SIDE, GL_TRUE);
    glLoadMatrixf(camera.view().constData());

    glEnable(GL_DEPTH_TEST);
    glDepthFunc(GL_LEQUAL);
    glShadeModel(GL_SMOOTH);
    glEnable(GL_NORMALIZE);
    glDisable(GL_CULL_FACE);
    glDisable(GL_TEXTURE_2D);
    glDisable(GL_BLEND);

    if (options & DrawGround) {
        glDisable(GL_LIGHTING);
        glColor4f(0.45f, 0.47f, 0.52f, 1.0f);
        glBegin(GL_LINES);
        for (int i = -10; i <= 10; ++i) {
            const float s = float(i) * 0.2f;
            glVertex3f(s, 0.0f, -2.0f);
            glVertex3f(s, 0.0f, 2.0f);
            glVertex3f(-2.0f, 0.0f, s);
            glVertex3f(2.0f, 0.0f, s);
        }
        glEnd();
        glEnable(GL_LIGHTING);
    }

    const GLfloat shine[4] = {0.12f, 0.12f, 0.12f, 1.0f};
    glMaterialfv(GL_FRONT_AND_BACK, GL_SPECULAR, shine);
    glMaterialf(GL_FRONT_AND_BACK, GL_SHININESS, 24.0f);

    glEnableClientState(GL_VERTEX_ARRAY);
    glEnableClientState(GL_NORMAL_ARRAY);
    for (const Item& item : items) {
        const RkGeometry* g = item.geometry;
        if (!g || g->getNumVertices() == 0 || g->getNumFacets() == 0)
            continue;
        TriangleCache& cache = d->triangles[g];
        if (cache.revision != g->getRevision())
            buildTriangles(g, cache);
        const RkVec3* p = positionsOf(item);
        computeNormals(g, p, d->normals);
        glVertexPointer(3, GL_FLOAT, sizeof(RkVec3), p);
        glNormalPointer(GL_FLOAT, sizeof(RkVec3), d->normals.constData());
        for (int i = 0; i < cache.groups.size(); ++i) {
            const int m = cache.materials[i];
            QColor c =
                m < item.materialColours.size() ? item.materialColours[m] : QColor(180, 180, 180);
            if (item.highlighted && (options & DrawHighlight))
                c = QColor::fromRgbF(c.redF() * 0.7 + 0.3, c.greenF() * 0.7 + 0.2, c.blueF() * 0.7);
            GLfloat diffuse[4];
            colourOf(c, diffuse);
            glMaterialfv(GL_FRONT_AND_BACK, GL_AMBIENT_AND_DIFFUSE, diffuse);
            const QImage texture =
                m < item.materialTextures.size() ? item.materialTextures[m] : QImage();
            const RkMap* uvMap = g->getUVs();
            if (texture.isNull() || uvMap->getType() != RkMap::Point2D) {
                glDrawElements(GL_TRIANGLES, cache.groups[i].size(), GL_UNSIGNED_INT,
                               cache.groups[i].constData());
                continue;
            }
            // UVs are per corner, so textured facets are sent corner by corner.
            glEnable(GL_TEXTURE_2D);
            glBindTexture(GL_TEXTURE_2D, d->textureFor(texture));
            glTexEnvi(GL_TEXTURE_ENV, GL_TEXTURE_ENV_MODE, GL_MODULATE);
            const RkPnt2* uv = uvMap->getPnt2ArrayPtr();
            const RkVec3* normal = d->normals.constData();
            const QVector<GLuint>& corners = cache.groups[i];
            const QVector<GLuint>& uvIndex = cache.uvs[i];
            glBegin(GL_TRIANGLES);
            for (int k = 0; k < corners.size(); ++k) {
                const RkVec3& n = normal[corners[k]];
                const RkVec3& v = p[corners[k]];
                glNormal3f(n.x, n.y, n.z);
                glTexCoord2f(uv[uvIndex[k]].x, uv[uvIndex[k]].y);
                glVertex3f(v.x, v.y, v.z);
            }
            glEnd();
            glDisable(GL_TEXTURE_2D);
        }
        if (item.highlighted && (options & DrawHighlight)) {
            // An outline of the cage over the shaded surface marks the selected node.
            glDisable(GL_LIGHTING);
            glDisableClientState(GL_NORMAL_ARRAY);
            glColor4f(1.0f, 0.62f, 0.1f, 1.0f);
            glPolygonMode(GL_FRONT_AND_BACK, GL_LINE);
            glEnable(GL_POLYGON_OFFSET_LINE);
            glPolygonOffset(-1.0f, -1.0f);
            for (const QVector<GLuint>& group : cache.groups)
                glDrawElements(GL_TRIANGLES, group.size(), GL_UNSIGNED_INT, group.constData());
            glDisable(GL_POLYGON_OFFSET_LINE);
            glPolygonMode(GL_FRONT_AND_BACK, GL_FILL);
            glEnableClientState(GL_NORMAL_ARRAY);
            glEnable(GL_LIGHTING);
        }
    }
    glDisableClientState(GL_NORMAL_ARRAY);
    glDisableClientState(GL_VERTEX_ARRAY);

    // Textures of images no longer drawn go; the context is current here.
    for (auto it = d->textures.begin(); it != d->textures.end();) {
        if (d->texturesUsed.contains(it.key())) {
            ++it;
            continue;
        }
        glDeleteTextures(1, &it.value());
        it = d->textures.erase(it);
    }
    d->texturesUsed.clear();

    // Forget geometries that were not drawn this time (they may have been deleted).
    for (auto it = d->triangles.begin(); it != d->triangles.end();) {
        const bool drawn = std::any_of(items.begin(), items.end(),
                                       [&](const Item& i) { return i.geometry == it.key(); });
        it = drawn ? std::next(it) : d->triangles.erase(it);
    }
}

int RkSceneRenderer::pick(const QVector<Item>& items, const Camera& camera, int w, int h, int x,
                          int y)
{
    if (w <= 0 || h <= 0)
        return -1;
    const QMatrix4x4 inv = (camera.projection(float(w) / float(h)) * camera.view()).inverted();
    const float nx = 2.0f * (float(x) + 0.5f) / float(w) - 1.0f;
    const float ny = 1.0f - 2.0f * (float(y) + 0.5f) / float(h);
    const QVector3D nearP = inv.map(QVector3D(nx, ny, -1.0f));
    const QVector3D farP = inv.map(QVector3D(nx, ny, 1.0f));
    const RkVec3 origin(nearP.x(), nearP.y(), nearP.z());
    const RkVec3 dir = RkVec3(farP.x(), farP.y(), farP.z()) - origin;

    int best = -1;
    float bestT = std::numeric_limits<float>::max();
    for (int i = 0; i < items.size(); ++i) {
        const RkGeometry* g = items[i].geometry;
        if (!g)
            continue;
        const RkVec3* p = positionsOf(items[i]);
        for (int f = 0, nf = g->getNumFacets(); f < nf; ++f) {
            const int* v = g->getFacetVertices(f);
            float t = intersect(origin, dir, p[v[0]], p[v[1]], p[v[2]]);
            if (g->getFacetSize(f) == 4) {
                const float t2 = intersect(origin, dir, p[v[0]], p[v[2]], p[v[3]]);
                if (t2 >= 0.0f && (t < 0.0f || t2 < t))
                    t = t2;
            }
            if (t >= 0.0f && t < bestT) {
                bestT = t;
                best = i;
            }
        }
    }
    return best;
}

bool RkSceneRenderer::bounds(const QVector<Item>& items, RkVec3& min, RkVec3& max)
{
    bool any = false;
    for (const Item& item : items) {
        if (!item.geometry || item.geometry->getNumVertices() == 0)
            continue;
        const RkVec3* p = positionsOf(item);
        for (int i = 0, n = item.geometry->getNumVertices(); i < n; ++i) {
            if (!any) {
                min = max = p[i];
                any = true;
                continue;
            }
            min = RkVec3(std::min(min.x, p[i].x), std::min(min.y, p[i].y), std::min(min.z, p[i].z));
            max = RkVec3(std::max(max.x, p[i].x), std::max(max.y, p[i].y), std::max(max.z, p[i].z));
        }
    }
    return any;
}
