#pragma once

#include <QByteArray>
#include <QString>

#include <pugixml.hpp>

#include <memory>

namespace Brindle::Data::XmlAccess {

// One catalog document in memory: opened, loaded from and saved to its file.
class XmlDataStoreBase {
public:
    // Catalogs nested deeper than this are refused at load, like malformed ones: the DOM's
    // own node removal recurses, and no walk over a refused file can overflow the stack.
    static constexpr int kMaxDepth = 512;

    explicit XmlDataStoreBase(const QString& path);
    virtual ~XmlDataStoreBase();
    XmlDataStoreBase(const XmlDataStoreBase&) = delete;
    XmlDataStoreBase& operator=(const XmlDataStoreBase&) = delete;

    // Creates the (empty) document; answers whether the store is open.
    virtual bool Initialize();
    // Drops the document; always true.
    virtual bool Close();
    // Replaces the document with the file's content. On failure (unreadable, malformed, no
    // document element, nested too deep) the document is left empty and saving is refused
    // until a later load succeeds, so the broken file is never written over.
    virtual bool LoadFrom(const QString& path);
    bool Load() { return LoadFrom(m_path); }
    // Writes the whole document as UTF-16 LE with byte-order mark through a temporary file,
    // so a failed write leaves the previous file whole.
    virtual bool SaveTo(const QString& path);
    bool Save() { return SaveTo(m_path); }
    // Save, but only when the document changed since it was loaded or last written to its own
    // file (or that file has gone); an unchanged document answers as saved.
    bool SaveIfModified();
    // Why the last save failed to write its file; empty when it worked or wrote nothing.
    const QString& SaveError() const { return m_saveError; }
    virtual bool IsOpen() const;

    const QString& Path() const { return m_path; }
    // The document; empty while the store is closed.
    const pugi::xml_document& Document() const;

protected:
    pugi::xml_document* MutableDocument() { return m_document.get(); }
    // Every change to the document calls this, so that it reaches the file at the next save.
    void MarkModified() { m_modified = true; }
    // Called once on every freshly parsed document; false refuses it like a malformed file.
    // The default refuses documents nested deeper than kMaxDepth.
    virtual bool AcceptDocument(const pugi::xml_document& document);

private:
    bool IsSavable() const;

    int m_open = 0;
    // The text the loaded document was parsed in place from: the document's strings point
    // into it, so it goes only after the document.
    QByteArray m_text;
    std::unique_ptr<pugi::xml_document> m_document;
    QString m_path;
    bool m_loadFailed = false;
    bool m_modified = false;
    QString m_saveError;
};

} // namespace Brindle::Data::XmlAccess
