#pragma once

#include "io/rkoutfile.h"

#include <QByteArray>

#include <functional>

class RkBase;

struct RkOutFile::Private {
    QByteArray sections;
    quint32 sectionCount = 0;
    bool inSection = false;
    int lengthPos = -1;
    QString error;
    QString fileName;
    // Turns an object into a stored reference (kind, target, property name); false fails the
    // file with the error it set.
    std::function<bool(const RkBase*, quint8&, qint32&, QString&)> resolve;
};
