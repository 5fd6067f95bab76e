#include "catalog/XmlDataStoreBase.h"

#include "platform/FileWrite.h"

#include <QByteArrayView>
#include <QFile>
#include <QFileInfo>
#include <QSaveFile>
#include <QString>

#include <optional>

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
        if (m_error.isEmpty() &&
            !Platform::WriteAll(*m_file, static_cast<const char*>(data), static_cast<qint64>(size)))
            Cancel();
    }
    void Flush() {
        if (m_error.isEmpty() && !Platform::FlushAll(*m_file))
            Cancel();
    }
    // The first failure's reason: after a cancel the file only says that it was cancelled.
    const QString& Error() const { return m_error; }

private:
    void Cancel() {
        if (m_error.isEmpty())
            m_error = m_file->errorString();
        m_file->cancelWriting();
    }

    QSaveFile* m_file;
    QString m_error;
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

// Writes the UTF-8 form of UTF-16 LE code units to out (room for three bytes a unit), as the
// parser would convert them: a surrogate without its partner is left out. A lead at the end
// of the units waits in `lead` for the next call. Answers the bytes written.
qsizetype ToUtf8(const char* bytes, qsizetype units, char16_t* lead, char* out) {
    char* const start = out;
    for (qsizetype at = 0; at < units; ++at) {
        const auto unit = static_cast<char16_t>(static_cast<unsigned char>(bytes[2 * at]) |
                                                static_cast<unsigned char>(bytes[2 * at + 1]) << 8);
        if (*lead != 0) {
            const char16_t first = *lead;
            *lead = 0;
            if (unit >= 0xDC00 && unit < 0xE000) {
                const char32_t c = 0x10000 + ((first & 0x3FFu) << 10) + (unit & 0x3FFu);
                *out++ = static_cast<char>(0xF0 | (c >> 18));
                *out++ = static_cast<char>(0x80 | ((c >> 12) & 0x3F));
                *out++ = static_cast<char>(0x80 | ((c >> 6) & 0x3F));
                *out++ = static_cast<char>(0x80 | (c & 0x3F));
                continue;
            }
        }
        if (unit < 0x80) {
            *out++ = static_cast<char>(unit);
        } else if (unit < 0x800) {
            *out++ = static_cast<char>(0xC0 | (unit >> 6));
            *out++ = static_cast<char>(0x80 | (unit & 0x3F));
        } else if (unit >= 0xD800 && unit < 0xDC00) {
            *lead = unit;
        } else if (unit < 0xDC00 || unit >= 0xE000) {
            *out++ = static_cast<char>(0xE0 | (unit >> 12));
            *out++ = static_cast<char>(0x80 | ((unit >> 6) & 0x3F));
            *out++ = static_cast<char>(0x80 | (unit & 0x3F));
        }
    }
    return out - start;
}

// The UTF-8 text of a file in UTF-16 LE with byte-order mark (the form the store writes), read
// a piece at a time, so that the whole UTF-16 text is never in memory beside it. Null for any
// other file, which the parser reads itself.
// Bytes that are not UTF-8 would be dropped when the catalog is written as UTF-16, so a save
// could change names and values behind the reader's back; a damaged element name could even
// become a reference. They are read as U+FFFD instead, which is written back as it reads.
class Utf8Repair final : public pugi::xml_tree_walker {
public:
    bool for_each(pugi::xml_node& node) override {
        if (const auto name = Repaired(node.name()))
            node.set_name(name->constData());
        // An element's own text is kept in the element, where only its text object reaches it.
        if (const auto value = Repaired(node.value())) {
            if (node.type() == pugi::node_element)
                node.text().set(value->constData());
            else
                node.set_value(value->constData());
        }
        for (pugi::xml_attribute attribute : node.attributes()) {
            if (const auto name = Repaired(attribute.name()))
                attribute.set_name(name->constData());
            if (const auto value = Repaired(attribute.value()))
                attribute.set_value(value->constData());
        }
        return true;
    }

private:
    static std::optional<QByteArray> Repaired(const char* text) {
        const QByteArrayView view(text);
        if (view.isValidUtf8())
            return std::nullopt;
        return QString::fromUtf8(view).toUtf8();
    }
};

QByteArray ReadUtf16File(const QString& path) {
    QFile file(path);
    if (!file.open(QIODevice::ReadOnly))
        return {};
    const QByteArray mark = file.peek(4);
    // FF FE 00 00 marks UTF-32 for the parser.
    if (mark.size() < 4 || !mark.startsWith("\xFF\xFE") || mark.endsWith(QByteArray(2, '\0')))
        return {};
    file.skip(2);
    QByteArray text;
    text.reserve(file.size() / 2 + 1); // exact for text in ASCII; grows for the rest
    QByteArray piece(1 << 20, Qt::Uninitialized);
    QByteArray converted(3 * piece.size() / 2, Qt::Uninitialized);
    char16_t lead = 0;
    qsizetype carried = 0; // a byte of a unit split between pieces
    for (;;) {
        const qint64 read = file.read(piece.data() + carried, piece.size() - carried);
        if (read < 0)
            return {};
        if (read == 0)
            break;
        const qsizetype bytes = carried + read;
        text.append(converted.constData(),
                    ToUtf8(piece.constData(), bytes / 2, &lead, converted.data()));
        carried = bytes % 2;
        if (carried != 0)
            piece[0] = piece[bytes - 1];
    }
    return text;
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
    m_text.clear();
    m_loadFailed = false;
    m_modified = false;
    m_open = 1;
    return m_open == 1;
}

bool XmlDataStoreBase::Close() {
    m_document.reset();
    m_text.clear();
    m_loadFailed = false;
    m_modified = false;
    m_open = 0;
    return true;
}

bool XmlDataStoreBase::LoadFrom(const QString& path) {
    if (!IsOpen() || path.isNull())
        return false;
    // An element's leading text is kept in the element itself instead of a node of its own:
    // every property value would otherwise cost a node, a third of the document's memory. The
    // document reads, queries and writes back the same.
    const unsigned int options =
        pugi::parse_default | pugi::parse_declaration | pugi::parse_embed_pcdata;
    m_document->reset();
    m_text = ReadUtf16File(path);
    pugi::xml_parse_result result;
    if (!m_text.isNull()) {
        // The document's strings point into the text, which lives as long as it does.
        result = m_document->load_buffer_inplace(m_text.data(), m_text.size(), options,
                                                 pugi::encoding_utf8);
    } else {
        result = m_document->load_file(QFile::encodeName(path).constData(), options);
        if (result) {
            Utf8Repair repair;
            m_document->traverse(repair);
        }
    }
    const bool loaded = result && m_document->document_element() && AcceptDocument(*m_document);
    if (!loaded) {
        m_document->reset(); // a failed parse leaves a partial tree behind
        m_text.clear();
    }
    m_loadFailed = !loaded;
    m_modified = false;
    return loaded;
}

bool XmlDataStoreBase::SaveTo(const QString& path) {
    m_saveError.clear();
    if (path.isEmpty() || !IsSavable())
        return false;
    DeclareUtf16(m_document.get());
    QSaveFile file(path);
    if (!file.open(QIODevice::WriteOnly)) {
        m_saveError = file.errorString();
        return false;
    }
    SaveFileWriter writer(&file);
    m_document->save(writer, "\t", pugi::format_default | pugi::format_write_bom,
                     pugi::encoding_utf16_le);
    writer.Flush();
    if (!file.commit()) {
        m_saveError = writer.Error().isEmpty() ? file.errorString() : writer.Error();
        return false;
    }
    if (path == m_path)
        m_modified = false;
    return true;
}

bool XmlDataStoreBase::SaveIfModified() {
    m_saveError.clear();
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
