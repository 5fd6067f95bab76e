#include "navigator/WNavDS.h"

#include "catalog/IDataStoreService.h"
#include "common/ReleasePtr.h"
#include "common/StringTable.h"
#include "dataexchange/IDataStoreReporter.h"
#include "dataexchange/WProperties.h"
#include "libs/postwick/IPostwick.h"
#include "libs/toolwell/IItemLink.h"
#include "libs/toolwell/IQmBridge.h"
#include "libs/toolwell/ItemIdentifier.h"
#include "messaging/CCloseAllWindows.h"
#include "messaging/INoteToolService.h"
#include "messaging/IViewerService.h"
#include "messaging/IWindowService.h"
#include "navigator/ItemProperties.h"
#include "platform/AppFolders.h"
#include "platform/IMessageBox.h"
#include "platform/IWaitCursor.h"

#include <QCoreApplication>
#include <QDeadlineTimer>
#include <QDir>
#include <QFileInfo>
#include <QThread>

namespace {

using namespace ItemProperties;
using namespace Qt::StringLiterals;

// The bridge asks nothing of the user when it connects, so it needs no owner window.
constexpr Platform::WindowHandle kNoOwnerWindow = 0;

PropertiesPtr CatalogProperties(const QString& itemId) {
    PropertiesPtr properties(DataExchange::CreateProperties());
    if (IDataStoreService* service = GetDataStoreService())
        service->GetProperties(itemId, properties.get());
    return properties;
}

// Every record below a folder in catalog order, depth-first, descending only into folders
// that `descend` accepts: one walk of the catalog, one index lookup per item.
class FolderWalk final : public IDataStoreReporter {
public:
    FolderWalk(const WNavDS& model, std::function<bool(const NavListItemData*)> descend)
        : m_model(model), m_descend(std::move(descend)) {}

    HRESULT ReportItem(const QString& identifier) override {
        m_last = m_model.FindItem(identifier);
        if (m_last != nullptr)
            m_records.append(m_last);
        return S_OK;
    }
    int SkipChildren() override { return m_last == nullptr || !m_descend(m_last) ? 1 : 0; }

    const QList<NavListItemData*>& Records() const { return m_records; }

private:
    const WNavDS& m_model;
    std::function<bool(const NavListItemData*)> m_descend;
    NavListItemData* m_last = nullptr;
    QList<NavListItemData*> m_records;
};

QList<NavListItemData*> Walk(const WNavDS& model, const QString& folderId,
                             std::function<bool(const NavListItemData*)> descend) {
    FolderWalk walk(model, std::move(descend));
    if (IDataStoreService* service = GetDataStoreService();
        service != nullptr && !folderId.isEmpty())
        service->ReportDescendants(folderId, &walk);
    return walk.Records();
}

std::function<IPostwick*()>& BlogServiceFactory() {
    static std::function<IPostwick*()> factory;
    return factory;
}

bool IsFolder(const NavListItemData* record) {
    return record->GetKind() == ItemKindFolder;
}

// Lets the programs' windows go, giving them up to `wait`: messages keep flowing and the
// application's idle pass runs, so that their reports of closed windows are taken in.
void WaitForWindows(const std::function<int()>& windowCount, std::chrono::milliseconds wait,
                    const std::function<void()>& idlePass) {
    const QDeadlineTimer deadline(wait);
    while (windowCount() > 0 && !deadline.hasExpired()) {
        QCoreApplication::processEvents(QEventLoop::AllEvents);
        if (idlePass)
            idlePass();
        if (windowCount() > 0)
            QThread::msleep(50);
    }
}

} // namespace

void WNavDS::OpenItem(NavListItemData* item, bool activate) {
    if (item == nullptr)
        return;
    if (IsFolder(item)) {
        const PropertiesPtr set =
            OneProperty(QStringLiteral("expanded"),
                        item->IsExpanded() ? QStringLiteral("false") : QStringLiteral("true"));
        UpdateItem(item->GetItemId(), set.get(), true);
        return;
    }
    if ((item->GetKind() != ItemKindNote && item->GetKind() != ItemKindDocument) ||
        GetDataStoreService() == nullptr)
        return;

    const QString itemId = item->GetItemId();
    const PropertiesPtr properties = CatalogProperties(itemId);
    QString path;
    ResolveDocumentPath(itemId, properties.get(), &path);
    if (path.isEmpty() || !QFileInfo::exists(path)) {
        Platform::MessageBox().Show(FormatString(StringId::FileNotFound, path),
                                    LoadString(StringId::FileNotFoundCaption),
                                    Platform::MessageBoxStyle::IconWarning);
        return;
    }

    if (!item->IsOpen()) {
        const PropertiesPtr set = OneProperty(QStringLiteral("open"), QStringLiteral("true"));
        UpdateItem(itemId, set.get(), true);
    }

    IWindowService* window = nullptr;
    if (item->GetKind() == ItemKindDocument && m_viewerService != nullptr)
        window = m_viewerService->GetWindowService(itemId);
    else if (item->GetKind() == ItemKindNote && m_noteToolService != nullptr)
        window = m_noteToolService->GetWindowService(itemId);
    if (window != nullptr) {
        window->Show(Platform::ShowCommand::Restore);
        if (activate)
            window->BringToFront();
        window->Release();
    }
}

void WNavDS::OpenSelected() {
    OpenItem(m_selected, true);
}

void WNavDS::OpenAllInFolder(const QString& folderId) {
    // Linked documents hang under the catalog's root but are not part of any folder; deleted
    // items keep their catalog place but are not opened from it, nor selected there.
    const auto skipped = [this](const NavListItemData* record) {
        return record->IsLinked() || IsInDeletedItems(record);
    };
    const QList<NavListItemData*> records =
        Walk(*this, folderId, [&skipped](const NavListItemData* record) {
            return IsFolder(record) && !skipped(record);
        });
    for (NavListItemData* record : records) {
        if (skipped(record) || IsFolder(record))
            continue;
        if (record->GetKind() != ItemKindNote && record->GetKind() != ItemKindDocument)
            continue;
        PropertiesPtr set(DataExchange::CreateProperties());
        if (!record->IsOpen())
            set->SetProperty(QStringLiteral("open"), QStringLiteral("true"));
        UpdateItem(record->GetItemId(), set.get(), true);
        SelectItem(record);
    }
}

void WNavDS::OpenAllInSelectedFolder() {
    if (m_selected == nullptr)
        return;
    const QString folderId = m_selected->GetItemId();
    OpenAllInFolder(folderId);
    if (!folderId.isEmpty())
        OpenItem(m_selected, true);
}

void WNavDS::OpenById(const QString& itemId) {
    NavListItemData* record = FindItem(itemId);
    if (record != nullptr && !IsInDeletedItems(record)) {
        SelectItem(record);
        OpenItem(record, true);
        return;
    }
    // The recently used lists offer an item the notebook no longer shows: drop it. Both lists
    // are asked, since the id alone does not tell a note from a document.
    if (ReleasePtr<IItemLink> noteLink{GetNoteToolLink(m_dataStoreHost)})
        noteLink->ForgetItem(itemId);
    if (ReleasePtr<IItemLink> viewerLink{GetViewerLink(m_dataStoreHost)})
        viewerLink->ForgetItem(itemId);
}

void WNavDS::ActivateById(const QString& itemId) {
    const NavListItemData* record = FindItem(itemId);
    if (record == nullptr)
        return;
    if (record->GetKind() == ItemKindDocument && m_viewerService != nullptr)
        m_viewerService->ActivateDocument(itemId);
    else if (record->GetKind() == ItemKindNote && m_noteToolService != nullptr)
        m_noteToolService->ActivateNote(itemId);
}

void WNavDS::CloseSelected() {
    CloseItem(m_selected);
}

void WNavDS::CloseTree(const QString& itemId) {
    NavListItemData* top = FindItem(itemId);
    if (top == nullptr)
        return;
    QList<NavListItemData*> records{top};
    records += Walk(*this, top->GetItemId(), [](const NavListItemData*) { return true; });
    for (NavListItemData* record : std::as_const(records))
        CloseItem(record);
}

void WNavDS::CloseAllInFolder(const QString& folderId) {
    const QList<NavListItemData*> records = Walk(*this, folderId, IsFolder);
    for (NavListItemData* record : records) {
        if (!IsFolder(record))
            CloseItem(record);
    }
}

void WNavDS::CloseAllInSelectedFolder() {
    if (m_selected != nullptr)
        CloseAllInFolder(m_selected->GetItemId());
}

void WNavDS::CloseAllOpen(ItemKind kind) {
    QList<NavListItemData*> open;
    for (const auto& record : m_items) {
        if (record && record->IsOpen() && record->GetKind() == kind)
            open.append(record.get());
    }
    for (NavListItemData* record : std::as_const(open))
        CloseItem(record);
    m_changed = true;
}

void WNavDS::CloseAllOpenNotes() {
    CloseAllOpen(ItemKindNote);
}

void WNavDS::CloseAllOpenDocuments() {
    CloseAllOpen(ItemKindDocument);
}

void WNavDS::PrintSelected() {
    NavListItemData* item = m_selected;
    if (item == nullptr)
        return;
    OpenItem(item, true);
    if (item->GetKind() == ItemKindDocument && m_viewerService != nullptr)
        m_viewerService->PrintDocument(item->GetItemId());
    else if (item->GetKind() == ItemKindNote && m_noteToolService != nullptr)
        m_noteToolService->PrintNote(item->GetItemId());
}

QString WNavDS::NoteFilePath(const QString& itemId) const {
    if (m_noteToolService == nullptr)
        return {};
    QString path;
    AppendUnicodeStringPtr sink(&path);
    if (FAILED(m_noteToolService->GetNoteFolder(m_dataStoreHost, itemId, &sink)) ||
        FAILED(m_noteToolService->GetNoteFileName(&sink)))
        return {};
    return path;
}

void WNavDS::SendSelectedToWordProcessor() {
    if (m_selected == nullptr || m_selected->GetItemId().isEmpty())
        return;
    const QString itemId = m_selected->GetItemId();
    ReleasePtr<IQmBridge> bridge(GetQmBridge());
    if (!bridge)
        return;
    QString target;
    UnicodeStringPtr sink(&target);
    if (bridge->ConnectToQm(kNoOwnerWindow, &sink) == S_OK)
        SendItemTo(itemId, target);
}

HRESULT WNavDS::SendItemTo(const QString& itemId, const QString& target) {
    HRESULT result = E_INVALIDARG;
    bool bridgeReached = false;
    {
        const Platform::WaitCursorScope waitCursor;
        NavListItemData* record = FindItem(itemId);
        ReleasePtr<IQmBridge> bridge(record != nullptr ? GetQmBridge() : nullptr);
        if (bridge) {
            bridgeReached = true;
            switch (record->GetKind()) {
            case ItemKindFolder: {
                QStringList paths;
                CollectNotePaths(record->GetItemId(), &paths);
                result = bridge->SendNotesToQm(paths, record->GetTitle(), target);
                break;
            }
            case ItemKindNote: {
                QStringList paths;
                if (const QString path = NoteFilePath(record->GetItemId()); !path.isEmpty())
                    paths.append(path);
                result = bridge->SendNotesToQm(paths, record->GetTitle(), target);
                break;
            }
            case ItemKindDocument: {
                const PropertiesPtr properties = CatalogProperties(record->GetItemId());
                QString path;
                const bool inNotebook =
                    ResolveDocumentPath(record->GetItemId(), properties.get(), &path);
                result = bridge->SendDocumentToQm(path, target, inNotebook);
                break;
            }
            default:
                break;
            }
        }
    }
    if (result != S_OK) {
        Platform::MessageBox().Show(
            LoadString(StringId::ActionFailed),
            bridgeReached ? LoadString(StringId::ProductName) : QStringLiteral(""),
            Platform::MessageBoxStyle::IconWarning | Platform::MessageBoxStyle::SystemModal |
                Platform::MessageBoxStyle::SetForeground);
    }
    return result;
}

void WNavDS::CollectNotePaths(const QString& folderId, QStringList* list) {
    if (list == nullptr)
        return;
    for (const NavListItemData* record : Walk(*this, folderId, IsFolder)) {
        if (record->GetKind() != ItemKindNote || !IsItemVisible(record) || IsInDeletedItems(record))
            continue;
        if (const QString path = NoteFilePath(record->GetItemId()); !path.isEmpty())
            list->append(path);
    }
}

void WNavDS::SetBlogServiceFactory(std::function<IPostwick*()> factory) {
    BlogServiceFactory() = std::move(factory);
}

void WNavDS::SetOpenBloggingSettingsHook(std::function<void()> hook) {
    m_openBloggingSettings = std::move(hook);
}

IPostwick* WNavDS::GetBlogService() {
    if (m_blogService == nullptr && !m_blogServiceTried && BlogServiceFactory()) {
        m_blogServiceTried = true;
        m_blogService = BlogServiceFactory()();
        if (m_blogService != nullptr &&
            FAILED(m_blogService->SetWorkingFolder(Platform::ApplicationDataFolder() + u'/'))) {
            m_blogService->Release();
            m_blogService = nullptr;
        }
    }
    return m_blogService;
}

void WNavDS::SendSelectedNoteToBlog() {
    if (!CanBlogSelected() || m_selected->GetItemId().isEmpty())
        return;
    const QString itemId = m_selected->GetItemId();
    const PropertiesPtr properties = CatalogProperties(itemId);
    QString path;
    ResolveDocumentPath(itemId, properties.get(), &path);
    PostToBlog(Property(properties.get(), QStringLiteral("title")), path);
}

void WNavDS::SendFileToBlog(const QString& path, const QString& title, const QString& fileName) {
    // Only a plain file name in a folder named by its whole path.
    const QFileInfo folder(path);
    if (!folder.isAbsolute() || !folder.isDir() || fileName.isEmpty() || fileName.contains(u'/') ||
        fileName == u"." || fileName == u"..")
        return;
    const QFileInfo file(QDir(path).filePath(fileName));
    if (file.isFile())
        PostToBlog(title, file.absoluteFilePath());
}

void WNavDS::PostToBlog(const QString& title, const QString& notePath) {
    IPostwick* blog = GetBlogService();
    if (blog == nullptr || title.isEmpty() || notePath.isEmpty())
        return;
    // The cursor waits with the post: it ends when the post reports, or when the library
    // drops a post it could not finish.
    auto waitCursor = std::make_shared<Platform::WaitCursorScope>();
    const HRESULT started =
        blog->PostNote(title, notePath, [waitCursor](const Postwick::PostResult& result) mutable {
            waitCursor.reset();
            Platform::MessageBox().Show(result.message, LoadString(StringId::ProductName),
                                        result.posted ? Platform::MessageBoxStyle::IconInformation
                                                      : Platform::MessageBoxStyle::IconWarning);
        });
    if (started == S_FALSE) {
        waitCursor.reset();
        if (m_openBloggingSettings) {
            m_openBloggingSettings();
        } else {
            Platform::MessageBox().Show(
                u"There is no default blog account. Add one on the Blogging page of the "
                u"settings."_s,
                LoadString(StringId::ProductName), Platform::MessageBoxStyle::IconInformation);
        }
    } else if (FAILED(started)) {
        waitCursor.reset();
        Platform::MessageBox().Show(LoadString(StringId::ActionFailed),
                                    LoadString(StringId::ProductName),
                                    Platform::MessageBoxStyle::IconWarning);
    }
}

void WNavDS::SetIdlePassHook(std::function<void()> hook) {
    m_idlePassHook = std::move(hook);
}

void WNavDS::CloseAllWindowsAndWait(std::chrono::milliseconds wait) {
    if (m_noteToolService == nullptr || m_viewerService == nullptr)
        return;
    CCloseAllWindows closeAll;
    m_noteToolService->ForEachWindow(&closeAll);
    m_viewerService->ForEachWindow(&closeAll);

    // Copies: commands run during the wait, and nothing here may depend on this object then.
    INoteToolService* noteTool = m_noteToolService;
    IViewerService* viewer = m_viewerService;
    const std::function<void()> idlePass = m_idlePassHook;
    const auto windowCount = [](auto* service) {
        return [service] {
            int count = 0;
            service->GetWindowCount(&count);
            return count;
        };
    };
    WaitForWindows(windowCount(noteTool), wait, idlePass);
    WaitForWindows(windowCount(viewer), wait, idlePass);
}

void WNavDS::OpenNewDocumentInViewer() {
    if (m_viewerService != nullptr)
        m_viewerService->OpenDocument(NewItemIdentifier(), QString());
}

void WNavDS::NewWordProcessorDocument() {
    ReleasePtr<IQmBridge> bridge(GetQmBridge());
    if (!bridge)
        return;
    QString target;
    UnicodeStringPtr sink(&target);
    if (bridge->ConnectToQm(kNoOwnerWindow, &sink) == S_OK)
        bridge->CreateDocument(0, target, 1);
}
