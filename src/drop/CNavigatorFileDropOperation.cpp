#include "drop/CNavigatorFileDropOperation.h"

#include <QFileInfo>
#include <QMimeData>

CNavigatorFileDropOperation::CNavigatorFileDropOperation()
    : CNavigatorOperationHandler(
          {QStringLiteral(".qmd"), QStringLiteral(".pdf"), QStringLiteral(".doc")},
          {QStringLiteral(".txt"), QStringLiteral(".jpg"), QStringLiteral(".gif"),
           QStringLiteral(".bmp"), QStringLiteral(".png")}) {}

int CNavigatorFileDropOperation::CanAccept(const QMimeData* data) {
    if (data == nullptr || !data->hasUrls())
        return 0;
    const QStringList paths = DroppedFiles(data);
    for (const QString& path : paths) {
        // A remote address has no local path and so no extension.
        if (IsSupportedExtension(ExtensionOf(path)) != 1)
            return 0;
        // A folder, pipe or device named like a file. A file that does not exist passes here
        // and is reported when it is dropped, so that the others are still taken.
        const QFileInfo info(path);
        if (info.exists() && !info.isFile())
            return 0;
    }
    return 1;
}

int CNavigatorFileDropOperation::Perform(const QMimeData* data) {
    if (data == nullptr || !data->hasUrls())
        return 0;
    const QStringList paths = DroppedFiles(data);
    const int singleFile = paths.size() < 2 ? 1 : 0;
    int result = 1;
    for (const QString& path : paths) {
        if (path.isEmpty() || DropFile(path, QFileInfo(path).fileName(), singleFile) != 1) {
            result = 0;
        }
    }
    return result;
}
