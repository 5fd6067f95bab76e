#include "catalog/EmptyArchive.h"

#include <QFile>
#include <QFileInfo>

namespace Brindle::Data::XmlAccess {

namespace {

// UTF-16 with byte-order mark; other programs of the product compare against these bytes.
QByteArray EmptyArchiveBytes() {
    static const char16_t* const pieces[] = {
        u"<?xml version=\"1.0\" encoding=\"UTF-16\"?>",
        u"<archive majorversion=\"1\" minorversion=\"0\">",
        u"<organization scheme=\"folders\">",
        u"<root>",
        u"</root>",
        u"</organization>",
        u"<items>",
        u"</items>",
        u"</archive>",
    };
    QString text(QChar(0xFEFF));
    for (const char16_t* piece : pieces)
        text += QString::fromUtf16(piece) + QStringLiteral("\t\t\t");
    QByteArray bytes;
    bytes.reserve(text.size() * 2);
    for (const QChar c : text) {
        bytes.append(static_cast<char>(c.unicode() & 0xFF));
        bytes.append(static_cast<char>(c.unicode() >> 8));
    }
    return bytes;
}

} // namespace

bool CreateEmptyArchive(const QString& path) {
    QFile existing(path);
    if (existing.open(QIODevice::ReadOnly))
        return true;
    // Only "nothing there" allows creating; a dangling link counts as something.
    const QFileInfo info(path);
    if (info.exists() || info.isSymLink())
        return false;
    QFile file(path);
    if (!file.open(QIODevice::WriteOnly | QIODevice::NewOnly))
        return false;
    const QByteArray bytes = EmptyArchiveBytes();
    const bool written = file.write(bytes) == bytes.size() && file.flush();
    file.close();
    if (!written || file.error() != QFileDevice::NoError) {
        file.remove(); // a half template would load as a broken catalog and block the notebook
        return false;
    }
    return true;
}

} // namespace Brindle::Data::XmlAccess
