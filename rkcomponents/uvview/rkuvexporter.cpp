#include "rkuvexporter.h"

#include "rkuvset.h"

#include <QCoreApplication>
#include <QPainter>
#include <QSaveFile>

#include <vector>

QImage RkUVExporter::render(const QList<RkUVSet*>& sets, int size)
{
    size = qBound(MinSize, size, MaxSize);
    QImage image(size, size, QImage::Format_ARGB32_Premultiplied);
    image.fill(Qt::transparent);
    QPainter painter(&image);
    painter.setRenderHint(QPainter::Antialiasing);
    // UV (0, 0) is the bottom left corner of the picture.
    painter.translate(0.0, size);
    painter.scale(size, -size);

    QPen pen(Qt::black, 2.0);
    pen.setCosmetic(true);
    pen.setJoinStyle(Qt::MiterJoin);
    painter.setPen(pen);
    painter.setBrush(Qt::NoBrush);
    painter.drawRect(QRectF(0, 0, 1, 1));

    pen.setWidthF(1.0);
    QPen red = pen;
    red.setColor(Qt::red);
    std::vector<QPointF> loop;
    for (const RkUVSet* set : sets) {
        bool selected = false;
        painter.setPen(pen);
        for (const RkUVSet::Polygon* p = set->getPolygons(); p; p = p->next) {
            if (!set->isMaterialVisible(int(p->material)))
                continue;
            if (p->isSelected() != selected) {
                selected = p->isSelected();
                painter.setPen(selected ? red : pen);
            }
            loop.clear();
            for (int c = 0; c < p->count; ++c)
                loop.emplace_back(p->corners[c]->u, p->corners[c]->v);
            painter.drawPolygon(loop.data(), int(loop.size()));
        }
        QPen dots = red;
        dots.setWidthF(3.0);
        dots.setCapStyle(Qt::SquareCap);
        painter.setPen(dots);
        for (const RkUVSet::Point* p = set->getPoints(); p; p = p->next) {
            if (p->isSelected())
                painter.drawPoint(QPointF(p->u, p->v));
        }
    }
    painter.end();
    return image;
}

bool RkUVExporter::write(const QList<RkUVSet*>& sets, int size, const QString& path, QString* error)
{
    auto fail = [&](const QString& reason) {
        if (error)
            *error = QCoreApplication::translate("RkUVExporter",
                                                 "The UV layout could not be written to %1: %2")
                         .arg(path, reason);
        return false;
    };
    QSaveFile file(path);
    if (!file.open(QIODevice::WriteOnly))
        return fail(file.errorString());
    if (!render(sets, size).save(&file, "PNG"))
        return fail(QCoreApplication::translate("RkUVExporter", "the picture was not encoded"));
    if (!file.commit())
        return fail(file.errorString());
    return true;
}
