#pragma once

#include <QImage>
#include <QList>

class RkUVSet;

// The UV layout as a picture for texture painting: the unit square fills the picture (v up), on a
// transparent background, with the same lines and colours the view draws, anti-aliased.
class RkUVExporter
{
public:
    static constexpr int MinSize = 512;
    static constexpr int MaxSize = 8192;
    static constexpr int DefaultSize = 2048;

    // A size outside MinSize..MaxSize is brought into it.
    static QImage render(const QList<RkUVSet*>& sets, int size);
    // Writes render() as PNG; the old file is replaced only by a complete new one. False with a
    // message naming the file and the reason when it cannot be written.
    static bool write(const QList<RkUVSet*>& sets, int size, const QString& path,
                      QString* error = nullptr);
};
