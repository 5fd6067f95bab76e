#include "navigator/WNavDS.h"

#include "libs/postwick/IPostwick.h"

#include "app/ApplicationInfo.h"
#include "catalog/IDataStoreService.h"
#include "common/ReleasePtr.h"
#include "common/StringTable.h"
#include "dataexchange/CBasicStringIDReporter.h"
#include "dataexchange/IPropertyReporter.h"
#include "dataexchange/PipeDelimitedStringReporter.h"
#include "dataexchange/WProperties.h"
#include "libs/toolwell/IDataStoreHost.h"
#include "libs/toolwell/IItemLink.h"
#include "libs/toolwell/IItemWindowHub.h"
#include "messaging/CNoteToolService.h"
#include "messaging/CViewerService.h"
#include "messaging/PropertiesToMap.h"
#include "navigator/ItemProperties.h"
#include "settings/NavigatorSettings.h"

#include <algorithm>
#include <utility>

namespace {

WNavDS* g_instance = nullptr;

const QString kRoot = QStringLiteral("root");

using namespace ItemProperties;

QString Folded(const QString& itemId) {
    return itemId.toCaseFolded();
}

// A copy of the set without the named property.
PropertiesPtr Without(DataExchange::IProperties* properties, const QString& name) {
    class Copy final : public DataExchange::IPropertyReporter {
    public:
        Copy(DataExchange::IProperties* target, const QString& skipped)
            : m_target(target), m_skipped(skipped) {}
        HRESULT ReportProperty(const QString& pairName, const QString& value) override {
            return pairName == m_skipped ? S_OK : m_target->SetProperty(pairName, value);
        }

    private:
        DataExchange::IProperties* m_target;
        const QString& m_skipped;
    };
    PropertiesPtr copy = NewProperties();
    Copy reporter(copy.get(), name);
    properties->ReportProperties(&reporter);
    return copy;
}

// "root" names the Notebook, never an item.
bool IsRoot(const QString& itemId) {
    return itemId.compare(kRoot, Qt::CaseInsensitive) == 0;
}

} // namespace

WNavDS* WNavDS::Instance() {
    if (g_instance == nullptr)
        g_instance = new WNavDS();
    return g_instance;
}

void WNavDS::DestroyInstance() {
    delete g_instance;
    g_instance = nullptr;
}

WNavDS::~WNavDS() {
    Clear();
    if (m_blogService != nullptr)
        m_blogService->Release();
    if (m_noteToolService != nullptr)
        m_noteToolService->Release();
    if (m_viewerService != nullptr)
        m_viewerService->Release();
    if (m_dataStoreHost != nullptr)
        m_dataStoreHost->Release();
}

void WNavDS::SetDataStoreHost(IDataStoreHost* host) {
    if (host == nullptr)
        return;
    host->AddRef();
    if (m_dataStoreHost != nullptr)
        m_dataStoreHost->Release();
    m_dataStoreHost = host;
}

void WNavDS::Initialize() {
    if (m_noteToolService != nullptr)
        return;
    m_noteToolService = CNoteToolService::GetInstance();
    m_viewerService = CViewerService::GetInstance();

    // The settings hold the application's info from start-up; without it the running
    // program's own folders serve.
    Brindle::Application::IApplicationInfo* info =
        NavigatorSettings::Instance()->GetApplicationInfo();
    ReleasePtr<Brindle::Application::IApplicationInfo> ownInfo;
    if (info == nullptr) {
        ownInfo.reset(CreateApplicationInfo());
        info = ownInfo.get();
    }
    QString programFolder;
    QString languageFolder;
    UnicodeStringPtr programSink(&programFolder);
    UnicodeStringPtr languageSink(&languageFolder);
    info->GetProgramFolder(&programSink);
    info->GetLanguageFolder(&languageSink);
    m_noteToolService->SetProgramFolder(programFolder);
    m_noteToolService->SetLanguageFolder(languageFolder);
    m_viewerService->SetProgramFolder(programFolder);
    m_viewerService->SetLanguageFolder(languageFolder);

    Load();
}

NavListItemData* WNavDS::AppendRecord(std::unique_ptr<NavListItemData> record) {
    NavListItemData* raw = record.get();
    raw->SetChangeLog(&m_changeLog);
    m_changeLog.StructureChanged();
    m_items.push_back(std::move(record));
    m_positions.insert(raw, std::prev(m_items.end()));
    m_index[Folded(raw->GetItemId())].append(raw);
    return raw;
}

void WNavDS::RemoveRecord(NavListItemData* record) {
    const auto position = m_positions.constFind(record);
    if (position == m_positions.cend())
        return;
    const QString key = Folded(record->GetItemId());
    QList<NavListItemData*>& sameId = m_index[key];
    sameId.removeOne(record);
    if (sameId.isEmpty())
        m_index.remove(key);
    if (m_selected == record)
        m_selected = nullptr;
    if (m_dropTarget == record)
        m_dropTarget = nullptr;
    m_changeLog.StructureChanged();
    const ItemList::iterator at = position.value();
    m_positions.erase(position);
    m_items.erase(at);
}

void WNavDS::Load() {
    if (!m_items.empty())
        Clear();

    m_linkedDocuments = AppendRecord(std::make_unique<NavListItemData>(
        ItemKindFolder, LoadString(StringId::LinkedDocumentsTitle),
        LoadString(StringId::LinkedDocumentsTitle), nullptr, false, false, false,
        DocumentSubtypeUnknown, QString(), QString()));
    m_deletedItems = AppendRecord(std::make_unique<NavListItemData>(
        ItemKindFolder, LoadString(StringId::DeletedItemsTitle),
        LoadString(StringId::DeletedItemsTitle), nullptr, false, false, false,
        DocumentSubtypeUnknown, QString(), QString()));
    m_notebook = AppendRecord(std::make_unique<NavListItemData>(
        ItemKindFolder, LoadString(StringId::NotebookTitle), kRoot, nullptr, true, false, false,
        DocumentSubtypeUnknown, QString(), QString()));

    LoadSubtree(kRoot, nullptr);

    // Items that an earlier run left recorded as open are closed: no program shows them now.
    QList<NavListItemData*> openDocuments;
    QList<NavListItemData*> openNotes;
    for (const auto& record : m_items) {
        if (record && record->IsOpen() && record->GetKind() == ItemKindDocument)
            openDocuments.append(record.get());
        else if (record && record->IsOpen() && record->GetKind() == ItemKindNote)
            openNotes.append(record.get());
    }
    for (NavListItemData* record : std::as_const(openDocuments))
        CloseItem(record);
    for (NavListItemData* record : std::as_const(openNotes))
        CloseItem(record);

    SelectItem(m_notebook);
    m_changed = true;
}

void WNavDS::LoadSubtree(const QString& itemId, NavListItemData* parent) {
    IDataStoreService* service = GetDataStoreService();
    if (service == nullptr)
        return;
    // Depth-first without recursion, children in catalog order: a deep catalog cannot
    // exhaust the stack.
    struct Pending {
        QString itemId;
        NavListItemData* parent;
    };
    QList<Pending> stack;
    const auto pushChildren = [service, &stack](const QString& id, NavListItemData* record) {
        DataExchange::CBasicStringIDReporter children;
        service->ReportChildren(id, &children);
        const QStringList& ids = children.StringIDs();
        for (auto child = ids.crbegin(); child != ids.crend(); ++child)
            stack.append({*child, record});
    };
    if (IsRoot(itemId))
        pushChildren(kRoot, nullptr);
    else
        stack.append({itemId, parent});
    while (!stack.isEmpty()) {
        const Pending pending = stack.takeLast();
        // An item stands in one place: a later reference to it (a second one, or one inside
        // the item itself) is passed over, which also ends any cycle. The catalog keeps it.
        if (IsRoot(pending.itemId) || HasRecord(pending.itemId))
            continue;
        PropertiesPtr properties = NewProperties();
        service->GetProperties(pending.itemId, properties.get());
        NavListItemData* record =
            AddItemFromProperties(pending.itemId, properties.get(), pending.parent);
        pushChildren(pending.itemId, record);
    }
}

bool WNavDS::HasRecord(const QString& itemId) const {
    const auto found = m_index.constFind(Folded(itemId));
    return found != m_index.cend() &&
           std::any_of(found->cbegin(), found->cend(), [&itemId](const NavListItemData* record) {
               return record->GetItemId() == itemId;
           });
}

NavListItemData* WNavDS::AddItemFromProperties(const QString& itemId,
                                               DataExchange::IProperties* properties,
                                               NavListItemData* parent) {
    const ItemKind kind = ItemKindFromText(Property(properties, QStringLiteral("type")));
    const DocumentSubtype subtype =
        DocumentSubtypeFromText(Property(properties, QStringLiteral("subtype")));
    if (parent == nullptr)
        parent = m_notebook;
    const bool expanded =
        kind == ItemKindFolder && IsTrueText(Property(properties, QStringLiteral("expanded")));
    const bool open = IsTrueText(Property(properties, QStringLiteral("open")));
    // Only documents are linked: anything else under Linked Documents would fall to its limit.
    const bool linked =
        kind == ItemKindDocument && IsTrueText(Property(properties, QStringLiteral("linked")));
    const bool deleted = IsTrueText(Property(properties, QStringLiteral("deleted")));

    NavListItemData* placedUnder = parent;
    NavListItemData* restoreParent = nullptr;
    if (deleted) {
        placedUnder = m_deletedItems;
        restoreParent = linked ? m_linkedDocuments : parent;
    } else if (linked) {
        placedUnder = m_linkedDocuments;
    }

    auto record = std::make_unique<NavListItemData>(
        kind, Property(properties, QStringLiteral("title")), itemId, placedUnder, expanded, linked,
        open, subtype, Property(properties, QStringLiteral("datecreated")),
        Property(properties, QStringLiteral("dateaccessed")));
    record->SetRestoreParent(restoreParent);
    m_changed = true;
    return AppendRecord(std::move(record));
}

NavListItemData* WNavDS::FindItem(const QString& itemId) const {
    if (itemId.isNull())
        return nullptr;
    const auto found = m_index.constFind(Folded(itemId));
    if (found == m_index.cend() || found->isEmpty())
        return nullptr;
    const QList<NavListItemData*>& candidates = found.value();
    if (candidates.size() == 1)
        return candidates.first();
    // Ids that differ only in letter case: the first in list order answers.
    for (const auto& record : m_items) {
        if (candidates.contains(record.get()))
            return record.get();
    }
    return nullptr;
}

bool WNavDS::SettingsAvailable() const {
    return GetDataStoreService() != nullptr &&
           NavigatorSettings::Instance()->GetRecord() != nullptr;
}

bool WNavDS::IsSpecialFolder(const NavListItemData* item) const {
    return item != nullptr &&
           (item == m_linkedDocuments || item == m_deletedItems || item == m_notebook);
}

void WNavDS::WriteExpanded(NavListItemData* folder, bool expanded) {
    // The special folders have no item of their own in the catalog.
    if (IsSpecialFolder(folder))
        return;
    IDataStoreService* service = GetDataStoreService();
    if (service == nullptr)
        return;
    PropertiesPtr set = NewProperties();
    set->SetProperty(QStringLiteral("expanded"),
                     expanded ? QStringLiteral("true") : QStringLiteral("false"));
    service->UpdateProperties(folder->GetItemId(), set.get());
}

void WNavDS::ExpandAncestors(NavListItemData* item) {
    for (NavListItemData* ancestor = item->GetParent(); ancestor != nullptr;
         ancestor = ancestor->GetParent()) {
        WriteExpanded(ancestor, true);
        ancestor->SetExpanded(true);
    }
}

void WNavDS::SelectItem(NavListItemData* item) {
    if (!SettingsAvailable())
        return;
    if (item == nullptr) {
        m_changed = true;
        return;
    }
    m_selected = item;
    NavigatorSettings* settings = NavigatorSettings::Instance();
    settings->SetLastSelectedItemId(item->GetItemId());
    ExpandAncestors(item);
    settings->MarkDirty();
    m_changed = true;
}

void WNavDS::SelectById(const QString& itemId) {
    SelectItem(FindItem(itemId));
}

void WNavDS::SetDropTarget(NavListItemData* item) {
    if (!SettingsAvailable())
        return;
    if (item == nullptr) {
        m_changed = true;
        return;
    }
    m_dropTarget = item;
    NavigatorSettings* settings = NavigatorSettings::Instance();
    settings->SetLastSelectedItemId(item->GetItemId());
    ExpandAncestors(item);
    settings->MarkDirty();
    m_changed = true;
}

void WNavDS::SetDropTargetById(const QString& itemId) {
    SetDropTarget(FindItem(itemId));
}

void WNavDS::SetExpanded(NavListItemData* item, bool expanded) {
    if (item == nullptr || item->GetKind() != ItemKindFolder || !SettingsAvailable())
        return;
    WriteExpanded(item, expanded);
    item->SetExpanded(expanded);
    m_changed = true;
}

void WNavDS::OpenRecord(NavListItemData* item) {
    IDataStoreService* service = GetDataStoreService();
    PropertiesPtr properties = NewProperties();
    service->GetProperties(item->GetItemId(), properties.get());
    if (item->GetKind() == ItemKindNote && m_noteToolService != nullptr) {
        properties->SetProperty(QStringLiteral("itemid"), item->GetItemId());
        QString notePath;
        AppendUnicodeStringPtr pathSink(&notePath);
        if (FAILED(
                m_noteToolService->GetNoteFolder(m_dataStoreHost, item->GetItemId(), &pathSink)) ||
            FAILED(m_noteToolService->GetNoteFileName(&pathSink)))
            return;
        DataExchange::PipeDelimitedStringReporter text;
        properties->ReportProperties(&text);
        QString propertyText;
        UnicodeStringPtr textSink(&propertyText);
        text.GetString(&textSink);
        m_noteToolService->SetEventTarget(this);
        m_noteToolService->OpenNote(notePath, propertyText);
    } else if (item->GetKind() == ItemKindDocument && m_viewerService != nullptr) {
        QString path;
        ResolveDocumentPath(item->GetItemId(), properties.get(), &path);
        if (!path.isEmpty())
            m_viewerService->OpenDocument(item->GetItemId(), path);
    }
}

void WNavDS::UpdateItem(const QString& itemId, DataExchange::IProperties* properties, bool notify) {
    IDataStoreService* service = GetDataStoreService();
    NavListItemData* item = FindItem(itemId);
    if (service == nullptr || item == nullptr || properties == nullptr)
        return;
    // Only documents are linked: a folder or note so marked would hang under Linked Documents
    // and fall to its limit with everything below it.
    PropertiesPtr unlinked;
    if (item->GetKind() != ItemKindDocument &&
        !Property(properties, QStringLiteral("linked")).isNull()) {
        unlinked = Without(properties, QStringLiteral("linked"));
        properties = unlinked.get();
    }
    service->UpdateProperties(itemId, properties);

    const bool wasOpen = item->IsOpen();
    if (notify && wasOpen) {
        if (IItemWindowHub* hub = GetItemWindowHub()) {
            if (item->GetKind() == ItemKindNote)
                hub->UpdateNoteProperties(itemId, PropertiesToMap(properties));
            else if (item->GetKind() == ItemKindDocument)
                hub->UpdateDocumentProperties(itemId, PropertiesToMap(properties));
        }
    }

    auto itemLink = [this, item]() -> ReleasePtr<IItemLink> {
        if (item->GetKind() == ItemKindNote)
            return ReleasePtr<IItemLink>(GetNoteToolLink(m_dataStoreHost));
        if (item->GetKind() == ItemKindDocument)
            return ReleasePtr<IItemLink>(GetViewerLink(m_dataStoreHost));
        return nullptr;
    };

    const QString title = Property(properties, QStringLiteral("title"));
    if (!title.isNull() && title.compare(item->GetTitle(), Qt::CaseInsensitive) != 0) {
        item->SetTitle(title);
        if (ReleasePtr<IItemLink> link = itemLink())
            link->SetTitle(item->GetItemId(), title);
    }

    const QString open = Property(properties, QStringLiteral("open"));
    if (open.compare(QLatin1StringView("false"), Qt::CaseInsensitive) == 0) {
        // Also under Deleted Items: the record must not stay open once the catalog says
        // closed.
        item->SetOpen(false);
    } else if (IsTrueText(open) && !IsInDeletedItems(item)) {
        item->SetOpen(true);
        if (!wasOpen)
            OpenRecord(item);
        if (ReleasePtr<IItemLink> link = itemLink())
            link->AnnounceItem(item->GetItemId(), item->GetTitle());
    }

    const QString expanded = Property(properties, QStringLiteral("expanded"));
    if (!expanded.isNull())
        item->SetExpanded(IsTrueText(expanded));

    const QString dateCreated = Property(properties, QStringLiteral("datecreated"));
    if (!dateCreated.isNull())
        item->SetDateCreated(dateCreated);
    const QString dateAccessed = Property(properties, QStringLiteral("dateaccessed"));
    if (!dateAccessed.isNull())
        item->SetDateAccessed(dateAccessed);

    m_changed = true;

    // Last: the limit may free this very record, so nothing touches it afterwards.
    const QString linked = Property(properties, QStringLiteral("linked"));
    if (!linked.isNull()) {
        item->SetLinked(IsTrueText(linked));
        if (item->IsLinked())
            EnforceLinkedLimit();
    }
}

void WNavDS::UpdateItemFromOutside(const QString& itemId, DataExchange::IProperties* properties) {
    // The special folders are the navigator's own. What is linked only linking a file and
    // saving it to the Notebook decide: a notebook document made linked would lose its only
    // copy to the limit, a linked one made otherwise would point at a copy that is not there.
    if (properties == nullptr || IsSpecialFolder(FindItem(itemId)))
        return;
    const PropertiesPtr kept = Without(properties, QStringLiteral("linked"));
    UpdateItem(itemId, kept.get(), false);
}

void WNavDS::OnWindowEvent(const QString& itemId) {
    SelectById(itemId);
}

void WNavDS::Clear() {
    IItemWindowHub* hub = GetItemWindowHub();
    for (const auto& record : m_items) {
        if (!record || !record->IsOpen() || hub == nullptr)
            continue;
        const QMap<QString, QString> closed{{QStringLiteral("open"), QStringLiteral("false")}};
        if (record->GetKind() == ItemKindDocument)
            hub->UpdateDocumentProperties(record->GetItemId(), closed);
        else if (record->GetKind() == ItemKindNote)
            hub->UpdateNoteProperties(record->GetItemId(), closed);
    }
    m_selected = nullptr;
    m_dropTarget = nullptr;
    m_deletedItems = nullptr;
    m_linkedDocuments = nullptr;
    m_notebook = nullptr;
    m_changeLog.StructureChanged();
    m_positions.clear();
    m_index.clear();
    m_items.clear();
    m_changed = true;
}

NavListItemData* WNavDS::ForEachVisible(Position& position) const {
    while (position != m_items.cend()) {
        NavListItemData* record = (position++)->get();
        if (IsItemVisible(record))
            return record;
    }
    return nullptr;
}

bool WNavDS::IsInDeletedItems(const NavListItemData* item) const {
    for (; item != nullptr; item = item->GetParent()) {
        if (item == m_deletedItems)
            return true;
    }
    return false;
}

NavListItemData* WNavDS::TopFolderOf(const NavListItemData* item) const {
    for (; item != nullptr; item = item->GetParent()) {
        if (IsSpecialFolder(item))
            return const_cast<NavListItemData*>(item);
    }
    return nullptr;
}

bool WNavDS::IsLinkedDocumentSelected() const {
    return m_selected != nullptr && m_linkedDocuments != nullptr &&
           m_selected->GetParent() == m_linkedDocuments;
}

bool WNavDS::IsSelectedOpen() const {
    return m_selected != nullptr && m_selected->IsOpen();
}

bool WNavDS::IsSelectedInDeletedItems() const {
    return IsInDeletedItems(m_selected);
}

bool WNavDS::CanEditSelected() const {
    return m_selected != nullptr && m_selected != m_linkedDocuments && m_selected != m_notebook;
}

bool WNavDS::CanDrop(const NavListItemData* item, const NavListItemData* target) const {
    if (item == nullptr || target == nullptr || IsSpecialFolder(item) ||
        target == m_linkedDocuments)
        return false;
    for (const NavListItemData* step = target; step != nullptr; step = step->GetParent()) {
        if (step == item)
            return false;
        if (step == m_linkedDocuments)
            return item->GetKind() == ItemKindDocument && item->IsLinked();
    }
    return true;
}

bool WNavDS::IsDropTargetFolder() const {
    return m_dropTarget != nullptr && m_dropTarget->GetKind() == ItemKindFolder;
}

bool WNavDS::DropTargetAccepts(bool toNotebookOnly) const {
    const NavListItemData* top = TopFolderOf(m_dropTarget);
    if (top == nullptr)
        return false;
    return toNotebookOnly ? top == m_notebook : top != m_linkedDocuments;
}

ItemFilter WNavDS::CurrentFilter() const {
    ItemFilter filter;
    NavigatorSettings* settings = NavigatorSettings::Instance();
    if (settings->GetRecord() != nullptr) {
        filter.showNotes = settings->GetShowNotes();
        filter.showQmd = settings->GetShowQmd();
        filter.showDoc = settings->GetShowDoc();
        filter.showPdf = settings->GetShowPdf();
        filter.showAllTypes = settings->GetShowAllTypes();
        filter.showOpenedItemsOnly = settings->GetShowOpenedItemsOnly();
    }
    return filter;
}

bool WNavDS::IsItemVisible(const NavListItemData* item) const {
    return ::IsItemVisible(item, CurrentFilter());
}

int WNavDS::ImageIndexOf(const NavListItemData* item) const {
    if (item == nullptr)
        return 4;
    const bool expanded = item->IsExpanded();
    if (item == m_linkedDocuments)
        return expanded ? 1 : 0;
    if (item == m_deletedItems)
        return expanded ? 3 : 2;
    if (item == m_notebook)
        return expanded ? 18 : 17;
    const bool deleted = IsInDeletedItems(item);
    switch (item->GetKind()) {
    case ItemKindFolder:
        if (deleted)
            return expanded ? 7 : 6;
        return expanded ? 5 : 4;
    case ItemKindDocument:
        if (item->IsOpen())
            return item->IsLinked() ? 12 : 9;
        if (item->IsLinked())
            return deleted ? 13 : 11;
        return deleted ? 10 : 8;
    case ItemKindNote:
        if (item->IsOpen())
            return 15;
        return deleted ? 16 : 14;
    default:
        return 4;
    }
}
