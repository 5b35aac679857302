#include "rkuvrenderer.h"

#include "rkuvset.h"

#include <qopengl.h>

RkUVRenderer::Bounds RkUVRenderer::bounds(int w, int h, float centreU, float centreV, float zoom)
{
    Bounds b;
    const double half = 0.5 / double(zoom);
    w = qMax(w, 1);
    h = qMax(h, 1);
    if (w > h) {
        const double aspect = double(w) / double(h);
        b.left = centreU - half * aspect;
        b.right = centreU + half * aspect;
        b.bottom = centreV - half;
        b.top = centreV + half;
    } else {
        const double aspect = double(h) / double(w);
        b.left = centreU - half;
        b.right = centreU + half;
        b.bottom = centreV - half * aspect;
        b.top = centreV + half * aspect;
    }
    return b;
}

void RkUVRenderer::initialize()
{
    glDisable(GL_LIGHTING);
    glDisable(GL_DEPTH_TEST);
    glClearColor(1.0f, 1.0f, 1.0f, 1.0f);
}

void RkUVRenderer::paint(const QList<RkUVSet*>& sets, int w, int h, float centreU, float centreV,
                         float zoom, Path path)
{
    // The records may change while drawing hands control back (they do not today); draw a copy.
    const QList<RkUVSet*> copy = sets;
    glClear(GL_COLOR_BUFFER_BIT | GL_DEPTH_BUFFER_BIT);
    const Bounds b = bounds(w, h, centreU, centreV, zoom);
    glMatrixMode(GL_PROJECTION);
    glLoadIdentity();
    glOrtho(b.left, b.right, b.bottom, b.top, -1.0, 1.0);
    glMatrixMode(GL_MODELVIEW);
    glLoadIdentity();

    glLineWidth(2.0f);
    glPointSize(2.0f);
    glColor4f(0.0f, 0.0f, 0.0f, 1.0f);
    const float square[4][2] = {{0, 0}, {0, 1}, {1, 1}, {1, 0}};
    glBegin(GL_LINE_LOOP);
    for (const auto& c : square)
        glVertex3f(c[0], c[1], -0.5f);
    glEnd();
    glBegin(GL_POINTS);
    for (const auto& c : square)
        glVertex3f(c[0], c[1], -0.5f);
    glEnd();

    glLineWidth(1.0f);
    for (const RkUVSet* set : copy) {
        if (path == Reference)
            drawReference(*set);
        else
            drawArrays(*set);
    }
}

void RkUVRenderer::drawReference(const RkUVSet& set)
{
    glColor3f(0.0f, 0.0f, 0.0f);
    bool selected = false;
    float z = 0.0f;
    for (const RkUVSet::Polygon* p = set.getPolygons(); p; p = p->next) {
        if (!set.isMaterialVisible(int(p->material)))
            continue;
        glBegin(GL_LINE_LOOP);
        if (p->isSelected() != selected) {
            selected = p->isSelected();
            if (selected)
                glColor3f(1.0f, 0.0f, 0.0f);
            else
                glColor3f(0.0f, 0.0f, 0.0f);
            z = selected ? 0.25f : 0.0f;
        }
        for (int c = 0; c < p->count; ++c)
            glVertex3f(p->corners[c]->u, p->corners[c]->v, z);
        glEnd();
    }
    glColor3f(1.0f, 0.0f, 0.0f);
    glPointSize(3.0f);
    glBegin(GL_POINTS);
    for (const RkUVSet::Point* p = set.getPoints(); p; p = p->next) {
        if (p->isSelected())
            glVertex3f(p->u, p->v, 0.5f);
    }
    glEnd();
}

void RkUVRenderer::drawArrays(const RkUVSet& set)
{
    const RkUVSet::Packed& packed = set.getPacked();
    // Without the depth test the depth values of the reference change no pixel: all at z = 0.
    glEnableClientState(GL_VERTEX_ARRAY);
    glVertexPointer(2, GL_FLOAT, 0, packed.positions.data());
    for (const RkUVSet::Packed::Run& run : packed.runs) {
        if (run.selected)
            glColor3f(1.0f, 0.0f, 0.0f);
        else
            glColor3f(0.0f, 0.0f, 0.0f);
        glDrawElements(GL_LINES, run.count, GL_UNSIGNED_INT, packed.lineIndices.data() + run.first);
    }
    glColor3f(1.0f, 0.0f, 0.0f);
    glPointSize(3.0f);
    if (!packed.selectedPoints.empty())
        glDrawElements(GL_POINTS, GLsizei(packed.selectedPoints.size()), GL_UNSIGNED_INT,
                       packed.selectedPoints.data());
    glDisableClientState(GL_VERTEX_ARRAY);
}
