#pragma once

// Layout of a scene file, shared by the reader and the writer (not exported).
//
//   header   8 bytes magic "RKSCENE\x1a", u32 format version, u32 object count,
//            u32 body length, u32 CRC-32 of the body
//   body     one record per object: u32 record length, then guid, class name and name
//            (strings: u32 byte count + UTF-8), u32 section count and the sections
//   section  u16 id, u32 payload length, payload: typed values, each a one-byte tag and data
//
// All numbers are little-endian. Every length is checked against what holds it, so a reader
// never reads past a section, a record or the file.

#include <QByteArray>
#include <QtEndian>

#include <cstring>

namespace RkFileFormat
{

constexpr char Magic[8] = {'R', 'K', 'S', 'C', 'E', 'N', 'E', '\x1a'};
constexpr quint32 Version = 1;
constexpr int HeaderSize = 24;

enum Tag : quint8 {
    TagInt = 1,
    TagFloat = 2,
    TagDouble = 3,
    TagBool = 4,
    TagString = 5,
    TagBytes = 6,
    TagPointer = 7,
};

enum PointerKind : quint8 {
    PointerNull = 0,
    PointerObject = 1,   // target: object index
    PointerProperty = 2, // target: index of the node, then the property name
};

inline const char* tagName(quint8 tag)
{
    switch (tag) {
    case TagInt:
        return "an int";
    case TagFloat:
        return "a float";
    case TagDouble:
        return "a double";
    case TagBool:
        return "a bool";
    case TagString:
        return "a string";
    case TagBytes:
        return "a byte array";
    case TagPointer:
        return "a pointer";
    default:
        return "an unknown value";
    }
}

inline quint32 crc32(const char* data, int size)
{
    static const auto table = [] {
        struct Table {
            quint32 v[256];
        } t{};
        for (quint32 i = 0; i < 256; ++i) {
            quint32 c = i;
            for (int k = 0; k < 8; ++k)
                c = (c & 1) ? 0xEDB88320u ^ (c >> 1) : c >> 1;
            t.v[i] = c;
        }
        return t;
    }();
    quint32 crc = 0xFFFFFFFFu;
    for (int i = 0; i < size; ++i)
        crc = table.v[(crc ^ quint8(data[i])) & 0xFF] ^ (crc >> 8);
    return crc ^ 0xFFFFFFFFu;
}

template <typename T> void put(QByteArray& out, T value)
{
    char buf[sizeof(T)];
    qToLittleEndian(value, buf);
    out.append(buf, int(sizeof(T)));
}

inline void putString(QByteArray& out, const QString& s)
{
    const QByteArray utf8 = s.toUtf8();
    put<quint32>(out, quint32(utf8.size()));
    out.append(utf8);
}

template <typename T> T get(const char* p)
{
    return qFromLittleEndian<T>(p);
}

} // namespace RkFileFormat
