#pragma once

#include <QString>

class QMimeData;

// One kind of data that can be dropped on the navigator tree, and what a drop of it does.
// Older-style results: 1 for yes or success, 0 otherwise.
class CBasicOperationHandler {
public:
    virtual ~CBasicOperationHandler() = default;
    CBasicOperationHandler(const CBasicOperationHandler&) = delete;
    CBasicOperationHandler& operator=(const CBasicOperationHandler&) = delete;

    // 1 when the data can be dropped.
    virtual int CanAccept(const QMimeData* data) = 0;
    // Carries out the drop; 1 when everything dropped was taken.
    virtual int Perform(const QMimeData* data) = 0;
    // The extension with its leading dot, in any letter case.
    virtual int IsLinkedDocumentExtension(const QString& extension) = 0;
    virtual int IsNoteExtension(const QString& extension) = 0;
    // 1 when every dropped file would become a linked document, and for no data at all.
    virtual int AreAllLinkedDocuments(const QMimeData* data) = 0;

protected:
    CBasicOperationHandler() = default;
};
