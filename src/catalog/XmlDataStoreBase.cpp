#include "catalog/XmlDataStoreBase.h"

#include <QFile>
#include <QFileInfo>
#include <QSaveFile>

namespace Brindle::Data::XmlAccess {

namespace {

// Depth of the deepest node below the document, without recursion.
bool DepthWithin(const pugi::xml_node& document, int limit) {
    int depth = 0;
    pugi::xml_node node = document.first_child();
    while (node) {
        if (node.first_child()) {
            if (++depth >= limit)
                return false;
            node = node.first_child();
            continue;
        }
        // Text kept in its element counts as the level below it, as a text node would.
        if (*node.value() != 0 && node.type() == pugi::node_element && depth + 1 >= limit)
            return false;
        while (node && !node.next_sibling() && node != document) {
            node = node.parent();
            --depth;
        }
        if (!node || node == document)
            break;
        node = node.next_sibling();
    }
    return true;
}

class SaveFileWriter final : public pugi::xml_writer {
public:
    explicit SaveFileWriter(QSaveFile* file) : m_file(file) {}
    void write(const void* data, size_t size) override {
        const auto length = static_cast<qint64>(size);
        if (m_file->write(static_cast<const char*>(data), length) != length)
            m_file->cancelWriting();
    }

private:
    QSaveFile* m_file;
};

// The file is written as UTF-16, so its declaration must say so whatever it said when read.
void DeclareUtf16(pugi::xml_document* document) {
    pugi::xml_node declaration = document->first_child();
    if (declaration.type() != pugi::node_declaration) {
        declaration = document->prepend_child(pugi::node_declaration);
        declaration.append_attribute("version") = "1.0";
    }
    pugi::xml_attribute encoding = declaration.attribute("encoding");
    if (!encoding)
        encoding = declaration.append_attribute("encoding");
    encoding = "UTF-16";
}

const pugi::xml_document& EmptyDocument() {
    static const pugi::xml_document empty;
    return empty;
}

} // namespace

XmlDataStoreBase::XmlDataStoreBase(const QString& path) : m_path(path) {}

XmlDataStoreBase::~XmlDataStoreBase() = default;

bool XmlDataStoreBase::Initialize() {
    m_document = std::make_unique<pugi::xml_document>();
    m_loadFailed = false;
    m_modified = false;
    m_open = 1;
    return m_open == 1;
}

bool XmlDataStoreBase::Close() {
    m_document.reset();
    m_loadFailed = false;
    m_modified = false;
    m_open = 0;
    return true;
}

bool XmlDataStoreBase::LoadFrom(const QString& path) {
    if (!IsOpen() || path.isNull())
        return false;
    const QByteArray nativePath = QFile::encodeName(path);
    // An element's leading text is kept in the element itself instead of a node of its own:
    // every property value would otherwise cost a node, a third of the document's memory. The
    // document reads, queries and writes back the same.
    const pugi::xml_parse_result result = m_document->load_file(
        nativePath.constData(),
        pugi::parse_default | pugi::parse_declaration | pugi::parse_embed_pcdata);
    const bool loaded = result && m_document->document_element() && AcceptDocument(*m_document);
    if (!loaded)
        m_document->reset(); // a failed parse leaves a partial tree behind
    m_loadFailed = !loaded;
    m_modified = false;
    return loaded;
}

bool XmlDataStoreBase::SaveTo(const QString& path) {
    if (path.isEmpty() || !IsSavable())
        return false;
    DeclareUtf16(m_document.get());
    QSaveFile file(path);
    if (!file.open(QIODevice::WriteOnly))
        return false;
    SaveFileWriter writer(&file);
    m_document->save(writer, "\t", pugi::format_default | pugi::format_write_bom,
                     pugi::encoding_utf16_le);
    // The buffered tail is written by the flush; commit would not see that write fail.
    if (!file.flush())
        file.cancelWriting();
    if (!file.commit())
        return false;
    if (path == m_path)
        m_modified = false;
    return true;
}

bool XmlDataStoreBase::SaveIfModified() {
    if (!m_modified && IsSavable() && QFileInfo::exists(m_path))
        return true;
    return Save();
}

bool XmlDataStoreBase::IsSavable() const {
    return IsOpen() && !m_loadFailed && m_document->document_element();
}

bool XmlDataStoreBase::AcceptDocument(const pugi::xml_document& document) {
    return DepthWithin(document, kMaxDepth);
}

bool XmlDataStoreBase::IsOpen() const {
    return m_open == 1 && m_document != nullptr;
}

const pugi::xml_document& XmlDataStoreBase::Document() const {
    return m_document ? *m_document : EmptyDocument();
}

} // namespace Brindle::Data::XmlAccess
