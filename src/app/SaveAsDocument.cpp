#include "app/SaveAsDocument.h"

#include <QFile>
#include <QFileInfo>
#include <QSaveFile>

SaveAsDocument::FileType SaveAsDocument::Describe(const QString& path) {
    FileType type;
    const qsizetype separator = path.lastIndexOf(u'/');
    if (separator >= 0)
        type.fileName = path.mid(separator + 1);
    const qsizetype dot = type.fileName.lastIndexOf(u'.');
    type.extension = dot >= 0 ? type.fileName.mid(dot + 1) : QStringLiteral("*");
    // Letter case as written: "Doc" is no known type.
    if (type.extension == u"DOC" || type.extension == u"doc")
        type.typeText = QStringLiteral("Microsoft Word Document");
    else if (type.extension == u"PDF" || type.extension == u"pdf")
        type.typeText = QStringLiteral("PDF Document");
    else if (type.extension == u"QMD" || type.extension == u"qmd")
        type.typeText = QStringLiteral("Quillmark Document");
    type.nameFilter = type.typeText + QStringLiteral(" (*.") + type.extension + u')';
    if (type.extension != u"*")
        type.defaultSuffix = type.extension;
    return type;
}

bool SaveAsDocument::Copy(const QString& source, const QString& target) {
    const QFileInfo from(source);
    const QFileInfo to(target);
    if (!from.isFile())
        return false;
    if (to.exists() && from.canonicalFilePath() == to.canonicalFilePath())
        return true;
    QFile in(source);
    if (!in.open(QIODevice::ReadOnly))
        return false;
    QSaveFile out(target);
    if (!out.open(QIODevice::WriteOnly))
        return false;
    while (!in.atEnd()) {
        const QByteArray chunk = in.read(1 << 16);
        if (chunk.isEmpty() || out.write(chunk) != chunk.size()) {
            out.cancelWriting();
            break;
        }
    }
    return out.commit();
}
