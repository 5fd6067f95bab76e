#pragma once

#include "catalog/NodeIndex.h"
#include "catalog/XmlDataStoreBase.h"
#include "dataexchange/IDataStoreReporter.h"
#include "dataexchange/IProperties.h"
#include "dataexchange/IStringIDReporter.h"

#include <QString>
#include <QStringList>

#include <pugixml.hpp>

#include <memory>

class IDataStoreHost;

namespace Brindle::Data::XmlAccess {

// The catalog with its item-level operations. Items are elements under "items" carrying a
// "uuid"; the organization tree under "root" places them by "child" elements carrying a
// "uuidref". Lookups by identifier go through indexes kept in step with every change, so an
// operation costs the same with a hundred items as with a hundred thousand.
class XmlDataStore : public XmlDataStoreBase {
public:
    // Organization trees may not be made deeper than this by moves, leaving room below the
    // deepest item for its properties within what a load accepts.
    static constexpr int kMaxEditDepth = kMaxDepth - 8;

    XmlDataStore(const QString& path, IDataStoreHost* host);
    ~XmlDataStore() override;

    // The empty document, the store folder and, when there is no catalog file, the empty one.
    bool Initialize() override;
    bool Close() override;
    bool LoadFrom(const QString& path) override;

    QString NewUuid() const;
    // A new item of the kind ("note", "folder", "document") placed last under the Notebook;
    // its identifier, or empty on failure.
    QString CreateItem(const QString& kind);
    pugi::xml_node FindItem(const QString& id) const;
    // The organization root for "root", else the first "child" that refers to id.
    pugi::xml_node FindOrganizationNode(const QString& id) const;
    // The item's "properties" element, made when missing; none when the item does not exist.
    pugi::xml_node GetPropertiesNode(const QString& id);
    void ClearProperties(const QString& id);
    bool RemoveProperty(const QString& id, const QString& name);
    // Appends without looking at an existing property of that name. Names that are not XML
    // element names are refused: written out, they would make the catalog unreadable.
    bool AddProperty(const QString& id, const QString& name, const QString& value);
    // Whether the item's last property is the only one of that name and holds exactly what
    // AddProperty would make of value: replacing it would rebuild the same document.
    bool IsLastProperty(const QString& id, const QString& name, const QString& value) const;
    bool ReadProperty(const QString& id, const QString& name, QString* value);
    int CopyPropertiesTo(const QString& id, DataExchange::IProperties* target);
    int GetChildren(const QString& id, QStringList* children) const;
    int ReportChildren(const QString& id, DataExchange::IStringIDReporter* reporter) const;
    // Pre-order walk of the organization subtree below id, each item once, reached through its
    // first reference only.
    int ReportDescendants(const QString& id, IDataStoreReporter* reporter) const;
    // Places id under newParent before the sibling `before` (last when `before` is empty or
    // not a child of newParent). Refused for the root, a parent inside the item's own subtree
    // and a result nested too deep.
    bool MoveItem(const QString& id, const QString& newParent, const QString& before);
    QString FindDocumentByPath(const QString& path);
    // Removes the item, its descendants, their organization nodes, elements and item folders.
    // Refused (false) for "root" and while the store is closed.
    bool DeleteItem(const QString& id);

    // Kept for the service, which folds it into its own open test; the store ignores it.
    int Suspended() const { return m_suspended; }
    void SetSuspended(int suspended) { m_suspended = suspended; }

protected:
    // Checks the depth and builds the indexes in one pass over the document.
    bool AcceptDocument(const pugi::xml_document& document) override;

private:
    void ClearIndexes();
    void IndexElement(pugi::xml_node element);
    void IndexSubtree(pugi::xml_node top);
    void UnindexSubtree(pugi::xml_node top);
    bool IsProtected(pugi::xml_node node) const;
    // The child is the first in document order that refers to its item; "root" names none.
    bool IsFirstReference(const pugi::xml_node& child) const;
    bool RemoveNode(pugi::xml_node node);
    bool MoveNode(pugi::xml_node source, pugi::xml_node newParent, pugi::xml_node before);
    void DeleteOne(const QString& id);

    int m_suspended = 0;
    IDataStoreHost* m_host;

    pugi::xml_node m_items;
    pugi::xml_node m_root;
    NodeIndex m_itemsByUuid;
    NodeIndex m_nodesByUuidref;
    // The variables must outlive the query compiled against them.
    pugi::xpath_variable_set m_variables;
    std::unique_ptr<pugi::xpath_query> m_documentByPath;
};

} // namespace Brindle::Data::XmlAccess
