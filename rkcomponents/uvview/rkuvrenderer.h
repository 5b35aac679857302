#pragma once

#include <QList>

class RkUVSet;

// Draws UV records into the current GL context: the unit square with its corners, then each
// record's visible facets as black loops (selected ones red) and its selected points in red. The
// depth test stays off, so later drawing lies on top of earlier drawing.
//
// Two ways that give the same pixels: Reference issues one immediate-mode call per corner while
// walking the records' lists; Arrays sends each record's packed arrays in one call per run of
// facets of one selected state.
class RkUVRenderer
{
public:
    enum Path { Reference, Arrays };

    // The part of the UV plane a w by h picture shows: the shorter side spans 1/zoom units about
    // the centre, the longer one as much more as the picture is longer.
    struct Bounds {
        double left = 0.0;
        double right = 1.0;
        double bottom = 0.0;
        double top = 1.0;
    };
    static Bounds bounds(int w, int h, float centreU, float centreV, float zoom);

    // Sets the state a white, cleared picture needs (lighting off, white clear colour).
    static void initialize();
    // Clears and draws the whole picture for a w by h viewport.
    static void paint(const QList<RkUVSet*>& sets, int w, int h, float centreU, float centreV,
                      float zoom, Path path = Arrays);

    static void drawReference(const RkUVSet& set);
    static void drawArrays(const RkUVSet& set);
};
