#include "navigator/WNavDS.h"

#include "catalog/IDataStoreService.h"
#include "common/ReleasePtr.h"
#include "common/StringTable.h"
#include "dataexchange/CRecursiveChildrenReporter.h"
#include "dataexchange/WProperties.h"
#include "libs/toolwell/Formats.h"
#include "libs/toolwell/IDataStoreHost.h"
#include "libs/toolwell/IItemLink.h"
#include "messaging/INoteToolService.h"
#include "messaging/IWindowService.h"
#include "navigator/ItemProperties.h"
#include "platform/RegularFile.h"
#include "settings/NavigatorSettings.h"

#include <QDir>
#include <QFile>
#include <QFileInfo>
#include <QSet>

#include <algorithm>
#include <cstdint>
#include <ctime>

namespace {

using namespace ItemProperties;

const QString kRoot = QStringLiteral("root");
const QString kTrue = QStringLiteral("true");
const QString kFalse = QStringLiteral("false");

// A file name from the catalog becomes part of a path: only a plain name may.
bool IsPlainFileName(const QString& name) {
    return !name.isEmpty() && !name.contains(u'/') && !name.contains(u'\\') &&
           name != QLatin1StringView(".") && name != QLatin1StringView("..");
}

QString Now() {
    QString text;
    FormatTime(&text, static_cast<std::int64_t>(std::time(nullptr)));
    return text;
}

// Paths compare as the file system does: absolute, clean, letter case significant.
QString FullPath(const QString& path) {
    return QDir::cleanPath(QFileInfo(path).absoluteFilePath());
}

QStringList Descendants(IDataStoreService* service, const QString& itemId) {
    CRecursiveChildrenReporter descendants;
    service->ReportDescendants(itemId, &descendants);
    return descendants.Items();
}

} // namespace

void WNavDS::CloseItem(NavListItemData* item) {
    if (item == nullptr)
        return;
    PropertiesPtr set(DataExchange::CreateProperties());
    set->SetProperty(QStringLiteral("open"), QStringLiteral("false"));
    UpdateItem(item->GetItemId(), set.get(), true);
}

bool WNavDS::ResolveDocumentPath(const QString& itemId, DataExchange::IProperties* properties,
                                 QString* path) {
    if (properties == nullptr || path == nullptr)
        return false;
    if (IsTrueText(Property(properties, QStringLiteral("linked")))) {
        *path = Property(properties, QStringLiteral("path"));
        return false;
    }
    QString fileName = Property(properties, QStringLiteral("filename"));
    const bool isNote =
        ItemKindFromText(Property(properties, QStringLiteral("type"))) == ItemKindNote;
    if (fileName.isEmpty() && isNote && m_noteToolService != nullptr) {
        // Notes of older catalogs name no file: theirs is the note tool's note file.
        UnicodeStringPtr sink(&fileName);
        m_noteToolService->GetNoteFileName(&sink);
    } else if (fileName.isEmpty() && !isNote) {
        // An entry of the older form keeps its whole path; the notebook copy has its name.
        fileName = QFileInfo(Property(properties, QStringLiteral("path"))).fileName();
        properties->SetProperty(QStringLiteral("path"), QStringLiteral(""));
        properties->SetProperty(QStringLiteral("filename"), fileName);
    }
    if (m_dataStoreHost == nullptr || !IsPlainFileName(fileName))
        return false;
    QString folder;
    m_dataStoreHost->GetItemFolder(&folder, itemId, false);
    if (folder.isEmpty())
        return false;
    *path = folder + u'/' + fileName;
    return true;
}

bool WNavDS::GetSelectedDocumentPath(QString* path) {
    IDataStoreService* service = GetDataStoreService();
    if (path == nullptr || service == nullptr || m_selected == nullptr ||
        m_selected->GetKind() != ItemKindDocument)
        return false;
    PropertiesPtr properties = NewProperties();
    service->GetProperties(m_selected->GetItemId(), properties.get());
    QString resolved;
    ResolveDocumentPath(m_selected->GetItemId(), properties.get(), &resolved);
    // A linked document's own path counts as well.
    if (resolved.isEmpty())
        return false;
    *path = resolved;
    return true;
}

void WNavDS::EnforceLinkedLimit() {
    NavigatorSettings* settings = NavigatorSettings::Instance();
    const int limit = settings->GetRecord() != nullptr ? settings->GetMaxLinkedDocuments() : 100;

    struct Entry {
        NavListItemData* record;
        std::int64_t accessed;
    };
    QList<Entry> linked;
    for (const auto& record : m_items) {
        if (!record || !record->IsLinked() || IsInDeletedItems(record.get()))
            continue;
        std::int64_t accessed = 0;
        ParseTime(&accessed, record->GetDateAccessed());
        linked.append({record.get(), accessed});
    }
    // Newest first; among equal times the list order holds. One always stays.
    std::stable_sort(linked.begin(), linked.end(),
                     [](const Entry& a, const Entry& b) { return a.accessed > b.accessed; });
    const qsizetype keep = std::max(limit, 1);
    IDataStoreService* service = GetDataStoreService();
    while (linked.size() > keep) {
        NavListItemData* oldest = linked.takeLast().record;
        const QString itemId = oldest->GetItemId();
        RemoveItemTree(oldest);
        if (service != nullptr)
            service->DeleteItem(itemId);
        m_changed = true;
    }
}

void WNavDS::RemoveItemTree(NavListItemData* item) {
    if (item == nullptr || IsSpecialFolder(item))
        return;
    // Every record is picked before any is freed, each once, whatever the walk reports.
    QList<NavListItemData*> doomed{item};
    QSet<const NavListItemData*> picked{item};
    if (IDataStoreService* service = GetDataStoreService()) {
        for (const QString& itemId : Descendants(service, item->GetItemId())) {
            NavListItemData* record = FindItem(itemId);
            if (record == nullptr || IsSpecialFolder(record) || picked.contains(record))
                continue;
            picked.insert(record);
            doomed.append(record);
        }
    }
    for (NavListItemData* record : std::as_const(doomed)) {
        ForgetInItemLink(record);
        RemoveRecord(record);
    }
    m_changed = true;
}

void WNavDS::ForgetInItemLink(const NavListItemData* item) {
    ReleasePtr<IItemLink> link;
    if (item->GetKind() == ItemKindNote)
        link.reset(GetNoteToolLink(m_dataStoreHost));
    else if (item->GetKind() == ItemKindDocument)
        link.reset(GetViewerLink(m_dataStoreHost));
    if (link)
        link->ForgetItem(item->GetItemId());
}

HRESULT WNavDS::AddNewItem(DataExchange::IProperties* properties, int placement,
                           IUnicodeString* idSink) {
    const QString type = Property(properties, QStringLiteral("type"));
    IDataStoreService* service = GetDataStoreService();
    if (service == nullptr)
        return E_FAIL;
    if (properties == nullptr)
        return E_INVALIDARG;

    NavListItemData* target = m_selected;
    if (placement == 0) {
        if (type == QLatin1StringView("document"))
            target = m_linkedDocuments;
        else if (TopFolderOf(m_selected) == m_deletedItems)
            target = m_notebook;
    } else if (placement == 2) {
        target = m_dropTarget;
    }

    NavListItemData* folder = target;
    if (target != nullptr && target->GetKind() != ItemKindFolder)
        folder = target->GetParent();
    QString catalogParent = kRoot;
    NavListItemData* recordParent = m_notebook;
    if (folder != nullptr && folder != m_linkedDocuments && !IsInDeletedItems(folder)) {
        catalogParent = folder == m_notebook ? kRoot : folder->GetItemId();
        recordParent = folder;
        if (folder != m_notebook) {
            WriteExpanded(folder, true);
            folder->SetExpanded(true);
        }
    }

    QString itemId;
    UnicodeStringPtr sink(&itemId);
    if (type == QLatin1StringView("note"))
        service->CreateNote(properties, &sink);
    else if (type == QLatin1StringView("folder"))
        service->CreateFolder(properties, &sink);
    else if (type == QLatin1StringView("document"))
        service->CreateDocument(properties, &sink);
    // Nothing was made (a refused or unknown type, a catalog that is not loaded): without an
    // identifier there is no item to place.
    if (itemId.isEmpty())
        return E_FAIL;

    NavListItemData* record = FindItem(itemId);
    if (record == nullptr) {
        service->MoveItem(itemId, catalogParent);
        record = AddItemFromProperties(itemId, properties, recordParent);
    } else {
        // The catalog already held this document: it is used again, and leaves Deleted Items.
        const QString now = Now();
        PropertiesPtr set = NewProperties();
        if (record->GetKind() == ItemKindDocument && record->GetParent() == m_deletedItems) {
            set->SetProperty(QStringLiteral("deleted"), kFalse);
            NavListItemData* back =
                record->IsLinked() ? m_linkedDocuments : record->GetRestoreParent();
            record->SetParent(back != nullptr ? back : m_notebook);
            record->SetRestoreParent(nullptr);
        }
        set->SetProperty(QStringLiteral("dateaccessed"), now);
        set->SetProperty(QStringLiteral("open"), kTrue);
        service->UpdateProperties(itemId, set.get());
        record->SetDateAccessed(now);
        record->SetOpen(true);
    }

    MoveItemTo(record, target);
    SelectItem(record);
    if (idSink != nullptr)
        idSink->Assign(itemId);
    m_changed = true;
    return S_OK;
}

HRESULT WNavDS::AddNewItemAndLimit(DataExchange::IProperties* properties, int placement,
                                   IUnicodeString* idSink) {
    const HRESULT result = AddNewItem(properties, placement, idSink);
    EnforceLinkedLimit();
    m_changed = true;
    return result;
}

void WNavDS::NewNote(DataExchange::IProperties* properties, IUnicodeString* idSink) {
    PropertiesPtr own;
    if (properties == nullptr) {
        own = NewProperties();
        own->SetProperty(QStringLiteral("type"), QStringLiteral("note"));
        properties = own.get();
    }

    QString font = QStringLiteral("Times New Roman");
    QString fontSize = QStringLiteral("12");
    QString backgroundColor = QStringLiteral("255,255,255");
    QString backgroundImage = QStringLiteral("");
    NavigatorSettings* settings = NavigatorSettings::Instance();
    if (settings->GetRecord() != nullptr) {
        font = settings->GetDefaultFont();
        fontSize = QString::number(settings->GetDefaultFontSize());
        backgroundColor = settings->GetDefaultBackgroundColor();
        backgroundImage = settings->GetDefaultBackgroundImage();
    }

    QString title = QStringLiteral("");
    QString fileName = QStringLiteral("");
    if (m_noteToolService != nullptr) {
        UnicodeStringPtr titleSink(&title);
        UnicodeStringPtr fileSink(&fileName);
        m_noteToolService->GetDefaultNoteTitle(&titleSink);
        m_noteToolService->GetNoteFileName(&fileSink);
    }

    const QString now = Now();
    properties->SetProperty(QStringLiteral("title"), title);
    properties->SetProperty(QStringLiteral("filename"), fileName);
    properties->SetProperty(QStringLiteral("open"), kTrue);
    properties->SetProperty(QStringLiteral("datecreated"), now);
    properties->SetProperty(QStringLiteral("dateaccessed"), now);
    properties->SetProperty(QStringLiteral("font"), font);
    properties->SetProperty(QStringLiteral("fontsize"), fontSize);
    properties->SetProperty(QStringLiteral("backgroundcolor"), backgroundColor);
    properties->SetProperty(QStringLiteral("backgroundimage"), backgroundImage);
    properties->SetProperty(QStringLiteral("size"), QStringLiteral("525,400"));
    properties->SetProperty(QStringLiteral("keepontop"), kFalse);

    QString itemId;
    UnicodeStringPtr sink(&itemId);
    if (SUCCEEDED(AddNewItem(properties, 0, &sink))) {
        if (idSink != nullptr)
            idSink->Assign(itemId);
        if (NavListItemData* record = FindItem(itemId)) {
            // The note tool gets the note's file and its properties, "itemid" among them.
            OpenRecord(record);
            if (m_noteToolService != nullptr) {
                ReleasePtr<IWindowService> window(m_noteToolService->GetWindowService(itemId));
                if (window) {
                    window->Show(Platform::ShowCommand::ShowNormal);
                    window->BringToFront();
                }
            }
        }
    }
    m_changed = true;
}

void WNavDS::NewFolder(IUnicodeString* idSink) {
    PropertiesPtr set = NewProperties();
    set->SetProperty(QStringLiteral("title"), LoadString(StringId::NewFolder));
    set->SetProperty(QStringLiteral("type"), QStringLiteral("folder"));
    // Renaming starts only on a folder that was made, never on whatever else is selected.
    if (SUCCEEDED(AddNewItem(set.get(), 0, idSink)))
        m_renamePending = true;
    m_changed = true;
}

void WNavDS::LinkDocument(const QString& path, bool activate) {
    IDataStoreService* service = GetDataStoreService();
    if (service == nullptr || path.isEmpty())
        return;

    // Only linked documents keep a path of their own; the list holds them in the order they
    // joined, as the catalog does under its root.
    const QString wanted = FullPath(path);
    NavListItemData* known = nullptr;
    for (const auto& record : m_items) {
        if (!record || record->GetKind() != ItemKindDocument || !record->IsLinked())
            continue;
        PropertiesPtr properties = NewProperties();
        service->GetProperties(record->GetItemId(), properties.get());
        const QString stored = Property(properties.get(), QStringLiteral("path"));
        if (!stored.isEmpty() && FullPath(stored) == wanted) {
            known = record.get();
            break;
        }
    }
    if (known == nullptr)
        known = NotebookDocumentAt(wanted);
    if (known != nullptr) {
        if (IsInDeletedItems(known) && known->GetRestoreParent() != nullptr) {
            // The catalog follows, so that the document still stands there after a restart.
            SetDeleted(known, kFalse);
            known->SetParent(known->GetRestoreParent());
            known->SetRestoreParent(nullptr);
            m_changed = true;
        }
        OpenItem(known, activate);
        return;
    }

    const QFileInfo file(path);
    const QString extension = file.suffix();
    if (DocumentSubtypeFromText(extension) == DocumentSubtypeUnknown)
        return;
    // A linked document is ordered by its access time; without one it would count as the
    // oldest and the limit would drop the document just opened.
    const QString now = Now();
    PropertiesPtr set = NewProperties();
    set->SetProperty(QStringLiteral("path"), path);
    set->SetProperty(QStringLiteral("title"), file.fileName());
    set->SetProperty(QStringLiteral("type"), QStringLiteral("document"));
    set->SetProperty(QStringLiteral("subtype"), extension);
    set->SetProperty(QStringLiteral("linked"), kTrue);
    set->SetProperty(QStringLiteral("datecreated"), now);
    set->SetProperty(QStringLiteral("dateaccessed"), now);
    m_selected = nullptr;
    QString itemId;
    UnicodeStringPtr sink(&itemId);
    if (FAILED(AddNewItem(set.get(), 0, &sink)))
        return;
    if (NavListItemData* record = FindItem(itemId)) {
        record->SetOpen(false);
        set->SetProperty(QStringLiteral("open"), kTrue);
        UpdateItem(itemId, set.get(), true);
    }
}

NavListItemData* WNavDS::NotebookDocumentAt(const QString& fullPath) {
    // The copy lies in the item folder, which is named after the item.
    NavListItemData* record = FindItem(QFileInfo(QFileInfo(fullPath).path()).fileName());
    IDataStoreService* service = GetDataStoreService();
    if (record == nullptr || service == nullptr || record->GetKind() != ItemKindDocument ||
        record->IsLinked())
        return nullptr;
    PropertiesPtr properties = NewProperties();
    service->GetProperties(record->GetItemId(), properties.get());
    QString copy;
    if (!ResolveDocumentPath(record->GetItemId(), properties.get(), &copy) ||
        FullPath(copy) != fullPath)
        return nullptr;
    return record;
}

void WNavDS::MoveRecordBefore(NavListItemData* item, NavListItemData* before) {
    // The item's records below it move along, so the list keeps every folder's contents after
    // the folder, in catalog order.
    QList<NavListItemData*> moving{item};
    if (IDataStoreService* service = GetDataStoreService()) {
        const QStringList below = Descendants(service, item->GetItemId());
        for (const QString& itemId : below) {
            NavListItemData* record = FindItem(itemId);
            for (const NavListItemData* step = record ? record->GetParent() : nullptr;
                 step != nullptr; step = step->GetParent()) {
                if (step == item) {
                    moving.append(record);
                    break;
                }
            }
        }
    }
    m_changeLog.StructureChanged();
    ItemList::iterator destination = m_items.end();
    if (before != nullptr) {
        const auto found = m_positions.constFind(before);
        if (found == m_positions.cend())
            return;
        destination = found.value();
    }
    for (NavListItemData* record : std::as_const(moving)) {
        const auto position = m_positions.constFind(record);
        if (position == m_positions.cend() || position.value() == destination)
            continue;
        // Splicing keeps every stored list position valid.
        m_items.splice(destination, m_items, position.value());
    }
}

void WNavDS::MoveItemTo(NavListItemData* item, NavListItemData* target) {
    if (item == nullptr) {
        m_changed = true;
        return;
    }
    // The special folders stand where they are; an identifier from outside may name one.
    if (IsSpecialFolder(item))
        return;
    IDataStoreService* service = GetDataStoreService();

    if (target == nullptr) {
        if (service != nullptr) {
            if (IsInDeletedItems(item))
                SetDeleted(item, kFalse);
            service->MoveItem(item->GetItemId(), kRoot);
        }
        item->SetRestoreParent(nullptr);
        item->SetParent(m_notebook);
        MoveRecordBefore(item, nullptr);
    } else {
        if (service == nullptr || !CanDrop(item, target))
            return;
        NavListItemData* folder = target;
        NavListItemData* sibling = nullptr;
        if (target->GetKind() != ItemKindFolder) {
            sibling = target;
            folder = target->GetParent();
        }
        if (folder == nullptr)
            return;

        if (IsInDeletedItems(folder)) {
            // Already lying directly in Deleted Items: it stays, and keeps its way back.
            if (item->GetParent() == m_deletedItems)
                return;
            SetDeleted(item, kTrue);
            item->SetRestoreParent(item->GetParent());
            item->SetParent(m_deletedItems);
        } else {
            if (IsInDeletedItems(item)) {
                SetDeleted(item, kFalse);
                item->SetRestoreParent(nullptr);
            }
            // Out of Deleted Items too the catalog takes the new place, so that the item
            // stands there after a restart.
            const QString catalogParent =
                folder == m_notebook || folder == m_linkedDocuments ? kRoot : folder->GetItemId();
            if (sibling != nullptr)
                service->MoveItemBefore(item->GetItemId(), catalogParent, sibling->GetItemId());
            else
                service->MoveItem(item->GetItemId(), catalogParent);
            MoveRecordBefore(item, sibling);
            item->SetParent(folder);
        }
    }

    if (item->IsLinked() && !IsInDeletedItems(item) && item->GetParent() != m_linkedDocuments &&
        service != nullptr)
        JoinNotebook(item);
    m_changed = true;
}

void WNavDS::JoinNotebook(NavListItemData* item) {
    IDataStoreService* service = GetDataStoreService();
    const QString itemId = item->GetItemId();
    QString folder;
    const bool haveFolder =
        m_dataStoreHost != nullptr && m_dataStoreHost->GetItemFolder(&folder, itemId, true) != 0;

    PropertiesPtr properties = NewProperties();
    service->GetProperties(itemId, properties.get());
    QString source;
    ResolveDocumentPath(itemId, properties.get(), &source);
    const QString fileName = QFileInfo(source).fileName();

    bool copied = false;
    if (haveFolder && !source.isEmpty() && IsPlainFileName(fileName)) {
        const QString copy = folder + u'/' + fileName;
        // A copy that is there already serves: copying never overwrites. Only a regular file
        // is copied; a FIFO or a device would block or never end.
        Platform::CopyRegularFile(source, copy);
        const QFileInfo copyInfo(copy);
        if (copyInfo.isFile() && !copyInfo.isSymLink()) {
            QFile::setPermissions(copy, QFile::permissions(copy) | QFileDevice::ReadOwner |
                                            QFileDevice::WriteOwner);
            copied = true;
        }
    }
    if (!copied) {
        // Without its file in the notebook the item would point at nothing: it stays a linked
        // document, with its path, where linked documents hang.
        service->MoveItem(itemId, kRoot);
        item->SetParent(m_linkedDocuments);
        MoveRecordBefore(item, nullptr);
        return;
    }

    const QString now = Now();
    PropertiesPtr set = NewProperties();
    set->SetProperty(QStringLiteral("linked"), kFalse);
    set->SetProperty(QStringLiteral("path"), QStringLiteral(""));
    set->SetProperty(QStringLiteral("filename"), fileName);
    set->SetProperty(QStringLiteral("datecreated"), now);
    set->SetProperty(QStringLiteral("dateaccessed"), now);
    UpdateItem(itemId, set.get(), true);
}

void WNavDS::MoveSelectedTo(NavListItemData* target) {
    MoveItemTo(m_selected, target);
}

void WNavDS::MoveById(const QString& itemId) {
    NavListItemData* item = FindItem(itemId);
    if (item == nullptr || item->GetKind() != ItemKindDocument || !item->IsLinked())
        return;
    MoveItemTo(item, nullptr);
}

void WNavDS::SetDeleted(NavListItemData* item, const QString& value) {
    IDataStoreService* service = GetDataStoreService();
    if (item == nullptr || service == nullptr || IsSpecialFolder(item))
        return;
    const QString itemId = item->GetItemId();
    if (value == kTrue) {
        // Nothing in the bin stays open.
        PropertiesPtr closed = NewProperties();
        closed->SetProperty(QStringLiteral("open"), kFalse);
        UpdateItem(itemId, closed.get(), true);
        for (const QString& below : Descendants(service, itemId))
            UpdateItem(below, closed.get(), true);
    }
    PropertiesPtr set = NewProperties();
    set->SetProperty(QStringLiteral("deleted"), value);
    service->UpdateProperties(itemId, set.get());
    ForgetInItemLink(item);
}

void WNavDS::DeleteSelected() {
    IDataStoreService* service = GetDataStoreService();
    NavListItemData* selected = m_selected;
    if (service == nullptr || selected == nullptr || selected == m_linkedDocuments ||
        selected == m_notebook)
        return;
    if (selected == m_deletedItems) {
        EmptyDeletedItems();
    } else if (IsInDeletedItems(selected)) {
        const QString itemId = selected->GetItemId();
        RemoveItemTree(selected);
        SelectItem(m_deletedItems);
        service->DeleteItem(itemId);
    } else {
        NavListItemData* oldParent = selected->GetParent();
        SetDeleted(selected, kTrue);
        selected->SetRestoreParent(oldParent);
        selected->SetParent(m_deletedItems);
        SelectItem(oldParent != nullptr ? oldParent : m_notebook);
    }
    m_changed = true;
}

void WNavDS::RestoreSelected() {
    NavListItemData* selected = m_selected;
    if (GetDataStoreService() == nullptr || selected == nullptr)
        return;
    if (selected == m_deletedItems) {
        RestoreAllDeleted();
    } else if (IsInDeletedItems(selected) && selected->GetRestoreParent() != nullptr) {
        // Only an item that was itself deleted knows its way back; one inside a deleted
        // folder comes back with the folder.
        SetDeleted(selected, kFalse);
        selected->SetParent(selected->GetRestoreParent());
        selected->SetRestoreParent(nullptr);
        if (selected->IsLinked())
            EnforceLinkedLimit();
    }
    m_changed = true;
}

void WNavDS::EmptyDeletedItems() {
    IDataStoreService* service = GetDataStoreService();
    if (service == nullptr)
        return;
    // Whatever lies in Deleted Items lies below an item placed there directly, in the catalog
    // too: removing those removes everything, whatever their order.
    QStringList deleted;
    for (const auto& record : m_items) {
        if (record && record->GetParent() == m_deletedItems)
            deleted.append(record->GetItemId());
    }
    for (const QString& itemId : std::as_const(deleted)) {
        // Gone already when it lay inside an item removed before it.
        NavListItemData* record = FindItem(itemId);
        if (record == nullptr || !IsInDeletedItems(record))
            continue;
        RemoveItemTree(record);
        service->DeleteItem(itemId);
    }
    m_changed = true;
}

void WNavDS::RestoreAllDeleted() {
    IDataStoreService* service = GetDataStoreService();
    if (service == nullptr)
        return;
    bool anyLinked = false;
    QList<NavListItemData*> deleted;
    for (const auto& record : m_items) {
        if (!record)
            continue;
        anyLinked = anyLinked || record->IsLinked();
        if (record->GetParent() == m_deletedItems && record->GetRestoreParent() != nullptr)
            deleted.append(record.get());
    }
    // What lies below a restored folder comes back with it and stays in the folder; an item
    // deleted on its own from a folder that was deleted later returns into that folder.
    for (NavListItemData* record : std::as_const(deleted)) {
        SetDeleted(record, kFalse);
        record->SetParent(record->GetRestoreParent());
        record->SetRestoreParent(nullptr);
    }
    if (anyLinked)
        EnforceLinkedLimit();
    m_changed = true;
}

void WNavDS::ChooseTypeFilter(TypeFilter filter) {
    if (IsTypeFilterChosen(filter))
        return;
    NavigatorSettings* settings = NavigatorSettings::Instance();
    switch (filter) {
    case TypeFilter::Notes:
        settings->SetShowNotes(true);
        break;
    case TypeFilter::Qmd:
        settings->SetShowQmd(true);
        break;
    case TypeFilter::Doc:
        settings->SetShowDoc(true);
        break;
    case TypeFilter::Pdf:
        settings->SetShowPdf(true);
        break;
    case TypeFilter::All:
        settings->SetShowAllTypes(true);
        break;
    }
    m_changed = true;
}

bool WNavDS::IsTypeFilterChosen(TypeFilter filter) const {
    NavigatorSettings* settings = NavigatorSettings::Instance();
    switch (filter) {
    case TypeFilter::Notes:
        return settings->GetShowNotes();
    case TypeFilter::Qmd:
        return settings->GetShowQmd();
    case TypeFilter::Doc:
        return settings->GetShowDoc();
    case TypeFilter::Pdf:
        return settings->GetShowPdf();
    case TypeFilter::All:
        return settings->GetShowAllTypes();
    }
    return false;
}

void WNavDS::ToggleOpenedItemsOnly() {
    NavigatorSettings* settings = NavigatorSettings::Instance();
    settings->SetShowOpenedItemsOnly(!settings->GetShowOpenedItemsOnly());
    m_changed = true;
}

bool WNavDS::IsOpenedItemsOnly() const {
    return NavigatorSettings::Instance()->GetShowOpenedItemsOnly();
}

bool WNavDS::CanRenameSelected() const {
    return m_selected != nullptr && m_selected != m_notebook &&
           m_selected->GetParent() != m_linkedDocuments;
}

bool WNavDS::CanPrintSelected() const {
    return m_selected != nullptr && m_selected->GetKind() != ItemKindFolder;
}

bool WNavDS::CanSendSelectedToWordProcessor() const {
    const NavListItemData* top = TopFolderOf(m_selected);
    return m_selected != nullptr && top != m_deletedItems && top != m_linkedDocuments;
}

bool WNavDS::CanBlogSelected() const {
    return CanSendSelectedToWordProcessor() && m_selected->GetKind() == ItemKindNote;
}
