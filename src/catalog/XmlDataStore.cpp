#include "catalog/XmlDataStore.h"

#include "catalog/EmptyArchive.h"
#include "dataexchange/CRecursiveChildrenReporter.h"
#include "libs/toolwell/IDataStoreHost.h"
#include "libs/toolwell/ItemIdentifier.h"
#include "platform/RegularFile.h"

#include <QDir>
#include <QFileInfo>

#include <algorithm>
#include <cstring>
#include <string_view>
#include <vector>

namespace Brindle::Data::XmlAccess {

namespace {

const char* const kRoot = "root";

bool IsElementNamed(const pugi::xml_node& node, const char* name) {
    return node.type() == pugi::node_element && std::strcmp(node.name(), name) == 0;
}

pugi::xml_node FirstChildElement(const pugi::xml_node& parent, const char* name) {
    for (pugi::xml_node child = parent.first_child(); child; child = child.next_sibling()) {
        if (IsElementNamed(child, name))
            return child;
    }
    return {};
}

// The organization children that name an item; "child" elements without "uuidref" are skipped.
pugi::xml_node NextReference(pugi::xml_node node) {
    for (; node; node = node.next_sibling()) {
        if (IsElementNamed(node, "child") && node.attribute("uuidref"))
            return node;
    }
    return {};
}

pugi::xml_node FirstReference(const pugi::xml_node& parent) {
    return NextReference(parent.first_child());
}

// The next node of a pre-order walk that stays inside top.
pugi::xml_node NextInSubtree(pugi::xml_node node, const pugi::xml_node& top) {
    if (node.first_child())
        return node.first_child();
    while (node != top) {
        if (node.next_sibling())
            return node.next_sibling();
        node = node.parent();
    }
    return {};
}

// The text of an element as XPath sees it: all text below it, in order, after the leading
// text that a loaded element keeps itself.
QString StringValue(const pugi::xml_node& element) {
    const pugi::xml_node first = element.first_child();
    if (!first)
        return QString::fromUtf8(element.value());
    if (*element.value() == 0 && !first.next_sibling() &&
        (first.type() == pugi::node_pcdata || first.type() == pugi::node_cdata))
        return QString::fromUtf8(first.value());
    QByteArray text(element.value());
    for (pugi::xml_node n = first; n; n = NextInSubtree(n, element)) {
        if (n.type() == pugi::node_pcdata || n.type() == pugi::node_cdata)
            text += n.value();
    }
    return QString::fromUtf8(text);
}

int DepthOf(pugi::xml_node node) {
    int depth = 0;
    for (node = node.parent(); node; node = node.parent())
        ++depth;
    return depth;
}

// Levels in the subtree, the top counted as one.
int HeightOf(const pugi::xml_node& top) {
    int depth = 1;
    int height = 1;
    pugi::xml_node n = top;
    for (;;) {
        if (n.first_child()) {
            n = n.first_child();
            height = std::max(height, ++depth);
            continue;
        }
        while (n != top && !n.next_sibling()) {
            n = n.parent();
            --depth;
        }
        if (n == top)
            return height;
        n = n.next_sibling();
    }
}

bool IsNameStart(char32_t c) {
    return c == u':' || (c >= u'A' && c <= u'Z') || c == u'_' || (c >= u'a' && c <= u'z') ||
           (c >= 0xC0 && c <= 0xD6) || (c >= 0xD8 && c <= 0xF6) || (c >= 0xF8 && c <= 0x2FF) ||
           (c >= 0x370 && c <= 0x37D) || (c >= 0x37F && c <= 0x1FFF) ||
           (c >= 0x200C && c <= 0x200D) || (c >= 0x2070 && c <= 0x218F) ||
           (c >= 0x2C00 && c <= 0x2FEF) || (c >= 0x3001 && c <= 0xD7FF) ||
           (c >= 0xF900 && c <= 0xFDCF) || (c >= 0xFDF0 && c <= 0xFFFD) ||
           (c >= 0x10000 && c <= 0xEFFFF);
}

bool IsNameChar(char32_t c) {
    return IsNameStart(c) || c == u'-' || c == u'.' || (c >= u'0' && c <= u'9') || c == 0xB7 ||
           (c >= 0x300 && c <= 0x36F) || (c >= 0x203F && c <= 0x2040);
}

bool IsXmlName(const QString& name) {
    const QList<uint> codePoints = name.toUcs4();
    if (codePoints.isEmpty() || !IsNameStart(codePoints.front()))
        return false;
    return std::all_of(codePoints.begin() + 1, codePoints.end(),
                       [](uint c) { return IsNameChar(c); });
}

bool IsWhitespaceOnly(const QString& text) {
    for (const QChar c : text) {
        if (c != u' ' && c != u'\t' && c != u'\n' && c != u'\r')
            return false;
    }
    return true;
}

} // namespace

XmlDataStore::XmlDataStore(const QString& path, IDataStoreHost* host)
    : XmlDataStoreBase(path), m_host(host) {
    if (m_host != nullptr)
        m_host->AddRef();
    m_variables.add("path", pugi::xpath_type_string);
    m_documentByPath =
        std::make_unique<pugi::xpath_query>("document[properties/path=$path]/@uuid", &m_variables);
}

XmlDataStore::~XmlDataStore() {
    if (m_host != nullptr)
        m_host->Release();
}

bool XmlDataStore::Initialize() {
    const bool open = XmlDataStoreBase::Initialize();
    ClearIndexes();
    if (!open)
        return false;
    if (m_host == nullptr)
        return true;
    QString folder;
    bool exists = false;
    if (m_host->GetStoreFolder(&folder, &exists) == 0)
        return false;
    if (!exists && !QDir().mkpath(folder))
        return false;
    QString catalog;
    exists = false;
    if (m_host->GetCatalogPath(&catalog, &exists) == 0)
        return false;
    // A navigator killed in the middle of its last save may have left the new catalog under a
    // temporary name; the start-up lock makes this the only navigator that could be saving.
    Platform::RemoveLeftSaveFiles(catalog);
    return exists || CreateEmptyArchive(catalog);
}

bool XmlDataStore::Close() {
    XmlDataStoreBase::Close();
    ClearIndexes();
    return true;
}

bool XmlDataStore::LoadFrom(const QString& path) {
    if (!IsOpen() || path.isNull())
        return false; // the document stays as it is
    ClearIndexes();
    const bool loaded = XmlDataStoreBase::LoadFrom(path);
    if (!loaded)
        ClearIndexes();
    return loaded;
}

void XmlDataStore::ClearIndexes() {
    m_itemsByUuid.Clear();
    m_nodesByUuidref.Clear();
    m_items = {};
    m_root = {};
}

bool XmlDataStore::AcceptDocument(const pugi::xml_document& document) {
    ClearIndexes();
    // "/archive/items"
    m_items = document.child("archive").child("items");
    // One walk, no recursion: the depth bound, the first "//archive/organization/root" and
    // every identifier attribute.
    int depth = 0;
    pugi::xml_node node = document.first_child();
    while (node) {
        if (node.type() == pugi::node_element) {
            IndexElement(node);
            if (!m_root && std::strcmp(node.name(), kRoot) == 0 &&
                IsElementNamed(node.parent(), "organization") &&
                IsElementNamed(node.parent().parent(), "archive"))
                m_root = node;
        }
        if (node.first_child()) {
            if (++depth >= kMaxDepth)
                return false;
            node = node.first_child();
            continue;
        }
        // Text kept in its element counts as the level below it, as a text node would.
        if (*node.value() != 0 && node.type() == pugi::node_element && depth + 1 >= kMaxDepth)
            return false;
        while (node && !node.next_sibling()) {
            node = node.parent();
            --depth;
        }
        if (node)
            node = node.next_sibling();
    }
    return true;
}

void XmlDataStore::IndexElement(pugi::xml_node element) {
    const bool isChild = std::strcmp(element.name(), "child") == 0;
    for (pugi::xml_attribute a = element.first_attribute(); a; a = a.next_attribute()) {
        if (std::strcmp(a.name(), "uuid") == 0)
            m_itemsByUuid.Add(element, a);
        else if (isChild && std::strcmp(a.name(), "uuidref") == 0)
            m_nodesByUuidref.Add(element, a);
    }
}

void XmlDataStore::IndexSubtree(pugi::xml_node top) {
    for (pugi::xml_node n = top; n; n = NextInSubtree(n, top)) {
        if (n.type() == pugi::node_element)
            IndexElement(n);
    }
}

void XmlDataStore::UnindexSubtree(pugi::xml_node top) {
    for (pugi::xml_node n = top; n; n = NextInSubtree(n, top)) {
        if (n.type() != pugi::node_element)
            continue;
        const bool isChild = std::strcmp(n.name(), "child") == 0;
        for (pugi::xml_attribute a = n.first_attribute(); a; a = a.next_attribute()) {
            if (std::strcmp(a.name(), "uuid") == 0)
                m_itemsByUuid.Remove(n, a);
            else if (isChild && std::strcmp(a.name(), "uuidref") == 0)
                m_nodesByUuidref.Remove(n, a);
        }
    }
}

// The document element, "items", the organization root and whatever holds them are never
// removed or moved, whatever identifier a hand-edited file gives them.
bool XmlDataStore::IsProtected(pugi::xml_node node) const {
    if (node.type() != pugi::node_element || node == Document().document_element())
        return true;
    for (const pugi::xml_node& kept : {m_items, m_root}) {
        for (pugi::xml_node n = kept; n; n = n.parent()) {
            if (n == node)
                return true;
        }
    }
    return false;
}

bool XmlDataStore::RemoveNode(pugi::xml_node node) {
    if (!node || IsProtected(node))
        return false;
    UnindexSubtree(node);
    MarkModified();
    return node.parent().remove_child(node);
}

QString XmlDataStore::NewUuid() const {
    return NewItemIdentifier();
}

QString XmlDataStore::CreateItem(const QString& kind) {
    if (!IsOpen() || !m_items || !m_root || !IsXmlName(kind))
        return {};
    const QString id = NewUuid();
    const QByteArray idText = id.toUtf8();
    pugi::xml_node item = m_items.append_child(kind.toUtf8().constData());
    if (!item)
        return {};
    item.append_attribute("uuid") = idText.constData();
    pugi::xml_node child = m_root.append_child("child");
    if (!child) {
        m_items.remove_child(item);
        return {};
    }
    child.append_attribute("uuidref") = idText.constData();
    MarkModified();
    IndexSubtree(item);
    IndexSubtree(child);
    return id;
}

pugi::xml_node XmlDataStore::FindItem(const QString& id) const {
    if (!IsOpen())
        return {};
    const QByteArray key = id.toUtf8();
    return m_itemsByUuid.First(std::string_view(key.constData(), key.size()));
}

pugi::xml_node XmlDataStore::FindOrganizationNode(const QString& id) const {
    if (!IsOpen())
        return {};
    if (id == QLatin1StringView(kRoot))
        return m_root;
    const QByteArray key = id.toUtf8();
    return m_nodesByUuidref.First(std::string_view(key.constData(), key.size()));
}

pugi::xml_node XmlDataStore::GetPropertiesNode(const QString& id) {
    pugi::xml_node item = FindItem(id);
    if (!item)
        return {};
    pugi::xml_node properties = FirstChildElement(item, "properties");
    if (!properties)
        properties = item.append_child("properties");
    return properties;
}

void XmlDataStore::ClearProperties(const QString& id) {
    if (RemoveNode(GetPropertiesNode(id)))
        GetPropertiesNode(id);
}

bool XmlDataStore::RemoveProperty(const QString& id, const QString& name) {
    const pugi::xml_node properties = GetPropertiesNode(id);
    if (!properties)
        return false;
    return RemoveNode(FirstChildElement(properties, name.toUtf8().constData()));
}

bool XmlDataStore::AddProperty(const QString& id, const QString& name, const QString& value) {
    if (!IsXmlName(name))
        return false;
    pugi::xml_node properties = GetPropertiesNode(id);
    if (!properties)
        return false;
    pugi::xml_node property = properties.append_child(name.toUtf8().constData());
    if (!property)
        return false;
    MarkModified();
    if (value.isEmpty())
        return true;
    // Text of blanks only would be dropped when the file is read back; a CDATA section keeps it.
    const pugi::xml_node_type type = IsWhitespaceOnly(value) ? pugi::node_cdata : pugi::node_pcdata;
    return property.append_child(type).set_value(value.toUtf8().constData());
}

bool XmlDataStore::IsLastProperty(const QString& id, const QString& name,
                                  const QString& value) const {
    const pugi::xml_node item = FindItem(id);
    const pugi::xml_node properties = FirstChildElement(item, "properties");
    const pugi::xml_node property = properties.last_child();
    if (!properties || !property || property.first_attribute() ||
        FirstChildElement(properties, name.toUtf8().constData()) != property)
        return false;
    // Exactly what AddProperty makes of the value.
    const pugi::xml_node text = property.first_child();
    const bool ownText = *property.value() != 0; // kept in the element by the load
    if (value.isEmpty())
        return !text && !ownText;
    const pugi::xml_node_type type = IsWhitespaceOnly(value) ? pugi::node_cdata : pugi::node_pcdata;
    if (ownText)
        return !text && type == pugi::node_pcdata && QString::fromUtf8(property.value()) == value;
    return text && !text.next_sibling() && text.type() == type &&
           QString::fromUtf8(text.value()) == value;
}

bool XmlDataStore::ReadProperty(const QString& id, const QString& name, QString* value) {
    const pugi::xml_node properties = GetPropertiesNode(id);
    if (!properties || value == nullptr)
        return false;
    const pugi::xml_node property = FirstChildElement(properties, name.toUtf8().constData());
    if (!property)
        return false;
    *value = StringValue(property);
    return true;
}

int XmlDataStore::CopyPropertiesTo(const QString& id, DataExchange::IProperties* target) {
    const pugi::xml_node properties = GetPropertiesNode(id);
    if (!properties || target == nullptr)
        return 0;
    int copied = 0;
    for (pugi::xml_node p = properties.first_child(); p; p = p.next_sibling()) {
        if (p.type() != pugi::node_element)
            continue;
        target->SetProperty(QString::fromUtf8(p.name()), StringValue(p));
        ++copied;
    }
    return copied;
}

int XmlDataStore::GetChildren(const QString& id, QStringList* children) const {
    const pugi::xml_node parent = FindOrganizationNode(id);
    if (!parent || children == nullptr)
        return 0;
    int count = 0;
    for (pugi::xml_node c = FirstReference(parent); c; c = NextReference(c.next_sibling())) {
        children->append(QString::fromUtf8(c.attribute("uuidref").value()));
        ++count;
    }
    return count;
}

int XmlDataStore::ReportChildren(const QString& id,
                                 DataExchange::IStringIDReporter* reporter) const {
    QStringList children;
    if (reporter == nullptr || GetChildren(id, &children) == 0)
        return 0;
    for (const QString& child : children)
        reporter->ReportStringID(child);
    return static_cast<int>(children.size());
}

int XmlDataStore::ReportDescendants(const QString& id, IDataStoreReporter* reporter) const {
    const pugi::xml_node top = FindOrganizationNode(id);
    if (!top || reporter == nullptr)
        return 0;
    // Walks the subtree itself, not the references again by identifier, and only through
    // each item's first reference, the one every lookup answers: a later one (a second place,
    // or a reference to an ancestor) is passed over with what lies below it, so each item is
    // reported once and deleting what holds such a reference never takes its item along.
    int count = 0;
    std::vector<pugi::xml_node> resume;
    pugi::xml_node next = FirstReference(top);
    for (;;) {
        if (!next) {
            if (resume.empty())
                break;
            next = resume.back();
            resume.pop_back();
            continue;
        }
        const pugi::xml_node current = next;
        next = NextReference(current.next_sibling());
        if (!IsFirstReference(current))
            continue;
        reporter->ReportItem(QString::fromUtf8(current.attribute("uuidref").value()));
        ++count;
        if (reporter->SkipChildren() != 0)
            continue;
        const pugi::xml_node first = FirstReference(current);
        if (first) {
            resume.push_back(next);
            next = first;
        }
    }
    return count;
}

bool XmlDataStore::IsFirstReference(const pugi::xml_node& child) const {
    const char* const id = child.attribute("uuidref").value();
    return std::strcmp(id, kRoot) != 0 && m_nodesByUuidref.First(id) == child;
}

bool XmlDataStore::MoveItem(const QString& id, const QString& newParent, const QString& before) {
    if (!IsOpen())
        return false;
    const pugi::xml_node beforeNode =
        before.isEmpty() ? pugi::xml_node() : FindOrganizationNode(before);
    return MoveNode(FindOrganizationNode(id), FindOrganizationNode(newParent), beforeNode);
}

bool XmlDataStore::MoveNode(pugi::xml_node source, pugi::xml_node newParent,
                            pugi::xml_node before) {
    if (!source || !newParent || source == newParent || IsProtected(source))
        return false;
    // A parent inside the moved subtree would take the subtree into itself.
    for (pugi::xml_node n = newParent; n; n = n.parent()) {
        if (n == source)
            return false;
    }
    const int newDepth = DepthOf(newParent) + 1;
    if (newDepth > DepthOf(source) && newDepth + HeightOf(source) - 1 > kMaxEditDepth)
        return false;
    if (before == source) {
        if (source.parent() == newParent)
            return true; // already in place
        before = {};
    }
    // The node itself moves, so the indexes stay valid; the order of any duplicates is
    // worked out at lookup.
    const bool moved = before && before.parent() == newParent
                           ? static_cast<bool>(newParent.insert_move_before(source, before))
                           : static_cast<bool>(newParent.append_move(source));
    if (moved)
        MarkModified();
    return moved;
}

QString XmlDataStore::FindDocumentByPath(const QString& path) {
    // An empty path names no file; it would match every stored copy, whose path is emptied.
    if (!IsOpen() || path.isEmpty())
        return {};
    if (m_items) {
        m_variables.set("path", path.toUtf8().constData());
        const pugi::xpath_node found = m_documentByPath->evaluate_node(m_items);
        if (found.attribute())
            return QString::fromUtf8(found.attribute().value());
    }
    const QFileInfo file(path);
    const QString folderName = QFileInfo(file.path()).fileName();
    QString fileName;
    if (!folderName.isEmpty() && FindItem(folderName) &&
        ReadProperty(folderName, QStringLiteral("filename"), &fileName) &&
        fileName == file.fileName())
        return folderName;
    return {};
}

bool XmlDataStore::DeleteItem(const QString& id) {
    if (!IsOpen() || id == QLatin1StringView(kRoot))
        return false;
    // Descendants go first, each after its own descendants.
    CRecursiveChildrenReporter descendants;
    ReportDescendants(id, &descendants);
    const QStringList& doomed = descendants.Items();
    for (auto it = doomed.rbegin(); it != doomed.rend(); ++it)
        DeleteOne(*it);
    DeleteOne(id);
    return true;
}

void XmlDataStore::DeleteOne(const QString& id) {
    if (id == QLatin1StringView(kRoot))
        return;
    RemoveNode(FindOrganizationNode(id));
    RemoveNode(FindItem(id));
    // Only identifiers of the GUID form name folders; anything else could point elsewhere.
    QString folder;
    if (m_host == nullptr || !IsItemIdentifier(id) ||
        m_host->GetItemFolder(&folder, id, false) != 1)
        return;
    const QFileInfo info(folder);
    if (info.isDir() && !info.isSymLink())
        QDir(folder).removeRecursively(); // removes links inside without following them
}

} // namespace Brindle::Data::XmlAccess
