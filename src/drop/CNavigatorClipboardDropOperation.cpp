#include "drop/CNavigatorClipboardDropOperation.h"

#include <QDir>
#include <QMimeData>
#include <QTemporaryFile>

namespace {

const QString kTextFormat = QStringLiteral("text/plain");

} // namespace

CNavigatorClipboardDropOperation::CNavigatorClipboardDropOperation()
    : CNavigatorOperationHandler({}, {QStringLiteral(".tmp")}) {}

int CNavigatorClipboardDropOperation::CanAccept(const QMimeData* data) {
    return data != nullptr && !data->data(kTextFormat).isEmpty() ? 1 : 0;
}

int CNavigatorClipboardDropOperation::Perform(const QMimeData* data) {
    if (data == nullptr)
        return 0;
    QByteArray text = data->data(kTextFormat);
    if (text.isEmpty() || text.size() >= kMaxTextBytes)
        return 0;
    const qsizetype zero = text.indexOf('\0');
    if (zero >= 0)
        text.truncate(zero);

    // The note is built from a file; its ".tmp" name lets the text's control bytes through.
    // The file goes when this ends: the note keeps its own copy of the text.
    QTemporaryFile file(QDir::tempPath() + QStringLiteral("/AmbrelXXXXXX.tmp"));
    if (!file.open() || file.write(text) != text.size() || !file.flush())
        return 0;
    return DropFile(file.fileName(), QString(), 1);
}
