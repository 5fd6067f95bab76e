#include "notes/CImageFileNoteConstructor.h"

#include "platform/RegularFile.h"

#include <QDir>
#include <QFileInfo>

CImageFileNoteConstructor::CImageFileNoteConstructor(const QString& source)
    : CBasicNoteConstructor(source) {}

int CImageFileNoteConstructor::CanConstruct(const QString& source) {
    return QFileInfo::exists(source) ? 1 : 0;
}

int CImageFileNoteConstructor::BuildContent(QString* content, const QString& noteFilePath,
                                            const QString&) {
    if (content == nullptr || Source().isEmpty())
        return 0;
    const QString fileName = SourceFileName();
    const QString name = EscapeAttribute(fileName);
    const QString tag = QLatin1StringView("<img src=\"") + name + QLatin1StringView("\" alt=\"") +
                        name + QLatin1StringView("\">");

    // A picture of the same name already beside the note is never replaced.
    const QString target = QFileInfo(noteFilePath).dir().filePath(fileName);
    if (!Platform::CopyRegularFile(Source(), target))
        return 0;
    *content = tag;
    return 1;
}
