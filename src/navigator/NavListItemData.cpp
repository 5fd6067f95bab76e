#include "navigator/NavListItemData.h"

ItemKind ItemKindFromText(const QString& type) {
    if (type.compare(QLatin1StringView("folder"), Qt::CaseInsensitive) == 0)
        return ItemKindFolder;
    if (type.compare(QLatin1StringView("note"), Qt::CaseInsensitive) == 0)
        return ItemKindNote;
    if (type.compare(QLatin1StringView("document"), Qt::CaseInsensitive) == 0)
        return ItemKindDocument;
    return ItemKindUnknown;
}

DocumentSubtype DocumentSubtypeFromText(const QString& subtype) {
    if (subtype.compare(QLatin1StringView("qmd"), Qt::CaseInsensitive) == 0)
        return DocumentSubtypeQmd;
    if (subtype.compare(QLatin1StringView("doc"), Qt::CaseInsensitive) == 0)
        return DocumentSubtypeDoc;
    if (subtype.compare(QLatin1StringView("pdf"), Qt::CaseInsensitive) == 0)
        return DocumentSubtypePdf;
    return DocumentSubtypeUnknown;
}

bool IsTrueText(const QString& text) {
    return text.compare(QLatin1StringView("true"), Qt::CaseInsensitive) == 0;
}

NavListItemData::NavListItemData(ItemKind kind, const QString& title, const QString& itemId,
                                 NavListItemData* parent, bool expanded, bool linked, bool open,
                                 DocumentSubtype subtype, const QString& dateCreated,
                                 const QString& dateAccessed)
    : m_kind(kind), m_title(title), m_itemId(itemId), m_dateCreated(dateCreated),
      m_dateAccessed(dateAccessed), m_parent(parent), m_expanded(expanded), m_linked(linked),
      m_open(open), m_subtype(subtype) {}

bool IsItemVisible(const NavListItemData* item, const ItemFilter& filter) {
    if (item == nullptr)
        return false;
    const bool openOk = !filter.showOpenedItemsOnly || item->IsOpen();
    switch (item->GetKind()) {
    case ItemKindFolder:
        return true;
    case ItemKindNote:
        return openOk && (filter.showNotes || filter.showAllTypes);
    case ItemKindDocument:
        switch (item->GetSubtype()) {
        case DocumentSubtypeQmd:
            return openOk && (filter.showQmd || filter.showAllTypes);
        case DocumentSubtypePdf:
            return openOk && (filter.showPdf || filter.showAllTypes);
        case DocumentSubtypeDoc:
            return openOk && (filter.showDoc || filter.showAllTypes);
        default:
            return openOk && filter.showAllTypes;
        }
    default:
        return false;
    }
}
