#include "libs/toolwell/CItemLink.h"

#include "platform/Registry.h"

#include <QDateTime>
#include <QJsonArray>
#include <QJsonDocument>
#include <QJsonObject>

namespace {

const QString kKeyPath = QStringLiteral("SOFTWARE\\Brindle\\Quillmark Ambrel\\RecentItems");

qsizetype IndexOf(const QList<ItemLinkEntry>& entries, const QString& itemId) {
    for (qsizetype i = 0; i < entries.size(); ++i) {
        if (entries[i].itemId.compare(itemId, Qt::CaseInsensitive) == 0)
            return i;
    }
    return -1;
}

} // namespace

CItemLink::CItemLink(const QString& valueName) : m_valueName(valueName) {}

QList<ItemLinkEntry> CItemLink::Items() {
    const QByteArray text =
        Platform::Registry::UserValue(kKeyPath, m_valueName).toString().toUtf8();
    QList<ItemLinkEntry> entries;
    const QJsonArray array = QJsonDocument::fromJson(text).array();
    for (const QJsonValue& value : array) {
        const QJsonObject object = value.toObject();
        const QString itemId = object.value(QLatin1StringView("itemid")).toString();
        // A damaged entry is dropped rather than offered.
        if (itemId.isEmpty() || IndexOf(entries, itemId) >= 0)
            continue;
        entries.append({itemId, object.value(QLatin1StringView("title")).toString(),
                        object.value(QLatin1StringView("used")).toInteger()});
    }
    return entries;
}

bool CItemLink::Write(const QList<ItemLinkEntry>& entries) {
    QJsonArray array;
    for (const ItemLinkEntry& entry : entries) {
        array.append(QJsonObject{{QStringLiteral("itemid"), entry.itemId},
                                 {QStringLiteral("title"), entry.title},
                                 {QStringLiteral("used"), entry.usedAt}});
    }
    const QString text = QString::fromUtf8(QJsonDocument(array).toJson(QJsonDocument::Compact));
    return Platform::Registry::SetUserValue(kKeyPath, m_valueName, text);
}

HRESULT CItemLink::AnnounceItem(const QString& itemId, const QString& title) {
    if (itemId.isEmpty())
        return E_INVALIDARG;
    QList<ItemLinkEntry> entries = Items();
    if (const qsizetype at = IndexOf(entries, itemId); at >= 0)
        entries.removeAt(at);
    entries.prepend({itemId, title, QDateTime::currentMSecsSinceEpoch()});
    while (entries.size() > MaxEntries)
        entries.removeLast();
    return Write(entries) ? S_OK : E_FAIL;
}

HRESULT CItemLink::SetTitle(const QString& itemId, const QString& title) {
    QList<ItemLinkEntry> entries = Items();
    const qsizetype at = IndexOf(entries, itemId);
    if (itemId.isEmpty() || at < 0)
        return S_FALSE;
    entries[at].title = title;
    return Write(entries) ? S_OK : E_FAIL;
}

HRESULT CItemLink::ForgetItem(const QString& itemId) {
    QList<ItemLinkEntry> entries = Items();
    const qsizetype at = IndexOf(entries, itemId);
    if (itemId.isEmpty() || at < 0)
        return S_FALSE;
    entries.removeAt(at);
    return Write(entries) ? S_OK : E_FAIL;
}

IItemLink* GetNoteToolLink(IDataStoreHost* host) {
    return host != nullptr ? new CItemLink(QStringLiteral("Notes")) : nullptr;
}

IItemLink* GetViewerLink(IDataStoreHost* host) {
    return host != nullptr ? new CItemLink(QStringLiteral("Documents")) : nullptr;
}
