#include "navigator/WNavDS.h"

#include "catalog/IDataStoreService.h"
#include "common/ReleasePtr.h"
#include "dataexchange/CRecursiveChildrenReporter.h"
#include "dataexchange/WProperties.h"
#include "libs/toolwell/Formats.h"
#include "libs/toolwell/IDataStoreHost.h"
#include "libs/toolwell/IItemLink.h"
#include "settings/NavigatorSettings.h"

#include <QFileInfo>

#include <algorithm>
#include <cstdint>

namespace {

using PropertiesPtr = ReleasePtr<DataExchange::IProperties>;

QString Property(DataExchange::IProperties* properties, const QString& name) {
    QString value;
    UnicodeStringPtr sink(&value);
    if (properties == nullptr || properties->GetProperty(name, &sink) != S_OK)
        return {};
    return value;
}

// A file name from the catalog becomes part of a path: only a plain name may.
bool IsPlainFileName(const QString& name) {
    return !name.isEmpty() && !name.contains(u'/') && !name.contains(u'\\') &&
           name != QLatin1StringView(".") && name != QLatin1StringView("..");
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
    if (fileName.isEmpty() && !isNote) {
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
    if (item == nullptr || item == m_linkedDocuments || item == m_deletedItems ||
        item == m_notebook)
        return;
    QStringList itemIds{item->GetItemId()};
    if (IDataStoreService* service = GetDataStoreService()) {
        CRecursiveChildrenReporter descendants;
        service->ReportDescendants(item->GetItemId(), &descendants);
        itemIds += descendants.Items();
    }
    ReleasePtr<IItemLink> noteLink(GetNoteToolLink(m_dataStoreHost));
    ReleasePtr<IItemLink> viewerLink(GetViewerLink(m_dataStoreHost));
    for (const QString& itemId : std::as_const(itemIds)) {
        NavListItemData* record = itemId == item->GetItemId() ? item : FindItem(itemId);
        if (record == nullptr)
            continue;
        if (record->GetKind() == ItemKindNote && noteLink)
            noteLink->ForgetItem(record->GetItemId());
        else if (record->GetKind() == ItemKindDocument && viewerLink)
            viewerLink->ForgetItem(record->GetItemId());
        RemoveRecord(record);
    }
    m_changed = true;
}
