#pragma once

#include "support/AmbrelTest.h"

#include <QByteArray>
#include <QFile>
#include <QString>

// The catalog of an empty notebook byte for byte: UTF-16 LE with byte-order mark, every
// piece followed by three tabs.
inline QByteArray ExpectedEmptyArchive() {
    const char* const text = "<?xml version=\"1.0\" encoding=\"UTF-16\"?>\t\t\t"
                             "<archive majorversion=\"1\" minorversion=\"0\">\t\t\t"
                             "<organization scheme=\"folders\">\t\t\t"
                             "<root>\t\t\t</root>\t\t\t</organization>\t\t\t"
                             "<items>\t\t\t</items>\t\t\t</archive>\t\t\t";
    QByteArray bytes("\xFF\xFE", 2);
    for (const char* c = text; *c != '\0'; ++c) {
        bytes.append(*c);
        bytes.append('\0');
    }
    return bytes;
}

inline QByteArray ReadBytes(const QString& path) {
    QFile file(path);
    return file.open(QIODevice::ReadOnly) ? file.readAll() : QByteArray();
}

// A catalog as a hand editor would write it: UTF-8, items and organization given as text.
inline QByteArray CatalogText(const char* organization, const char* items) {
    return QByteArray("<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n"
                      "<archive majorversion=\"1\" minorversion=\"0\">"
                      "<organization scheme=\"folders\"><root>") +
           organization + "</root></organization><items>" + items + "</items></archive>";
}
