#pragma once

#include "drop/CBasicOperationHandler.h"

#include <QStringList>

#include <set>

// The navigator's drops: a file with a linked-document extension becomes a linked document
// that points at the file where it lies, one with a note extension becomes a new note made
// from it. Both land on the tree's drop target.
class CNavigatorOperationHandler : public CBasicOperationHandler {
public:
    // The dropped local files, as "text/uri-list" names them, in order; an entry that is not
    // a local file is an empty path.
    static QStringList DroppedFiles(const QMimeData* data);
    // From the last dot of the file name on, as written; empty when there is none.
    static QString ExtensionOf(const QString& path);

    int IsLinkedDocumentExtension(const QString& extension) override;
    int IsNoteExtension(const QString& extension) override;
    int AreAllLinkedDocuments(const QMimeData* data) override;

    int IsSupportedExtension(const QString& extension);
    // A linked document or a note titled fileName, by the path's extension; 0 for another
    // extension. A path that is not an existing regular file is reported and not taken.
    int DropFile(const QString& path, const QString& fileName, int singleFile);
    // A linked document for the file at the drop target, opened when open is 1; Linked
    // Documents is kept within its limit.
    int AddLinkedDocument(const QString& path, int open);
    // A note made from the file at the drop target, not opened; 1 when it was made.
    int MakeNoteFromFile(const QString& path, const QString& title, int singleFile);

protected:
    // Lower-case extensions with their leading dot.
    CNavigatorOperationHandler(const QStringList& linkedDocumentExtensions,
                               const QStringList& noteExtensions);

private:
    std::set<QString> m_linkedDocumentExtensions;
    std::set<QString> m_noteExtensions;
};
