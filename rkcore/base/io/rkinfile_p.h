#pragma once

#include "io/rkinfile.h"

#include <QVector>

struct RkInFile::Private {
    struct PointerRef {
        int owner = -1;
        short section = 0;
        short index = 0;
        quint8 kind = 0;
        qint32 target = -1;
        QString property;
    };

    QByteArray data;
    QString fileName;
    int version = 0;
    QString error;

    // The section being read: its id, bounds within data and the reading position.
    bool inSection = false;
    short sectionId = 0;
    int pos = 0;
    int end = 0;
    int currentObject = -1;
    QString currentClass;

    QVector<PointerRef> refs;

    QString where() const;
    bool need(RkInFile* file, int bytes);
    bool readTag(RkInFile* file, quint8 expected);
    // A u32 byte count and that many bytes, all inside the section.
    bool readBytes(RkInFile* file, QByteArray& out);
};
