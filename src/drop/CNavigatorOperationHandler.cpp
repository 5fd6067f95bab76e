#include "drop/CNavigatorOperationHandler.h"

#include "common/ReleasePtr.h"
#include "common/StringTable.h"
#include "dataexchange/WProperties.h"
#include "navigator/WNavDS.h"
#include "notes/CBasicNoteConstructor.h"
#include "notes/NoteConstructorRegistry.h"
#include "platform/IMessageBox.h"

#include <QFileInfo>
#include <QMimeData>
#include <QUrl>

namespace {

// Everything else (a missing file, a folder, a pipe, a device) could hang the reader or link
// to nothing; the user hears about it as about any file that cannot be read.
bool IsReadableRegularFile(const QString& path) {
    const QFileInfo info(path);
    if (info.isFile())
        return true;
    Platform::MessageBox().Show(FormatString(StringId::FileNotReadable, info.fileName()),
                                LoadString(StringId::ProductName), Platform::MessageBoxStyle::Ok);
    return false;
}

} // namespace

CNavigatorOperationHandler::CNavigatorOperationHandler(const QStringList& linkedDocumentExtensions,
                                                       const QStringList& noteExtensions)
    : m_linkedDocumentExtensions(linkedDocumentExtensions.cbegin(),
                                 linkedDocumentExtensions.cend()),
      m_noteExtensions(noteExtensions.cbegin(), noteExtensions.cend()) {}

QStringList CNavigatorOperationHandler::DroppedFiles(const QMimeData* data) {
    QStringList paths;
    if (data == nullptr)
        return paths;
    const QList<QUrl> urls = data->urls();
    for (const QUrl& url : urls)
        paths.append(url.isLocalFile() ? url.toLocalFile() : QString());
    return paths;
}

QString CNavigatorOperationHandler::ExtensionOf(const QString& path) {
    const QString fileName = QFileInfo(path).fileName();
    const qsizetype dot = fileName.lastIndexOf(u'.');
    return dot < 0 ? QString() : fileName.sliced(dot);
}

int CNavigatorOperationHandler::IsLinkedDocumentExtension(const QString& extension) {
    return m_linkedDocumentExtensions.contains(extension.toLower()) ? 1 : 0;
}

int CNavigatorOperationHandler::IsNoteExtension(const QString& extension) {
    return m_noteExtensions.contains(extension.toLower()) ? 1 : 0;
}

int CNavigatorOperationHandler::AreAllLinkedDocuments(const QMimeData* data) {
    if (data == nullptr)
        return 1;
    if (!data->hasUrls())
        return 0;
    const QStringList paths = DroppedFiles(data);
    for (const QString& path : paths) {
        if (IsLinkedDocumentExtension(ExtensionOf(path)) != 1)
            return 0;
    }
    return 1;
}

int CNavigatorOperationHandler::IsSupportedExtension(const QString& extension) {
    return IsLinkedDocumentExtension(extension) == 1 || IsNoteExtension(extension) == 1 ? 1 : 0;
}

int CNavigatorOperationHandler::DropFile(const QString& path, const QString& fileName,
                                         int singleFile) {
    const QString extension = ExtensionOf(path);
    if (IsSupportedExtension(extension) != 1)
        return 0;
    if (!IsReadableRegularFile(path))
        return 0;
    if (IsLinkedDocumentExtension(extension) == 1)
        return AddLinkedDocument(path, 0);
    return MakeNoteFromFile(path, fileName, singleFile);
}

int CNavigatorOperationHandler::AddLinkedDocument(const QString& path, int open) {
    ReleasePtr<DataExchange::IProperties> set(DataExchange::CreateProperties());
    if (!set)
        return 0;
    const QString extension = ExtensionOf(path);
    set->SetProperty(QStringLiteral("type"), QStringLiteral("document"));
    // The subtype keeps the file name's letter case; the extension test ignores it.
    set->SetProperty(QStringLiteral("subtype"), extension.mid(1));
    set->SetProperty(QStringLiteral("linked"), QStringLiteral("true"));
    set->SetProperty(QStringLiteral("path"), path);
    set->SetProperty(QStringLiteral("title"), QFileInfo(path).fileName());
    WNavDS* model = WNavDS::Instance();
    if (model->AddNewItemAndLimit(set.get(), 2, nullptr) != S_OK)
        return 0;
    if (open == 1)
        model->LinkDocument(path, true);
    return 1;
}

int CNavigatorOperationHandler::MakeNoteFromFile(const QString& path, const QString& title, int) {
    ReleasePtr<CBasicNoteConstructor> constructor(CreateNoteConstructor(path));
    if (!constructor)
        return 0;
    return WNavDS::Instance()->AddNoteFromConstructor(title, constructor.get(), 0, 2, nullptr) ==
                   S_OK
               ? 1
               : 0;
}
