#include "app/CNavigatorStartActions.h"

#include "libs/toolwell/ISnapshotService.h"
#include "navigator/WNavDS.h"

void CNavigatorStartActions::NewNote() {
    WNavDS::Instance()->NewNote(nullptr, nullptr);
}

void CNavigatorStartActions::OpenDocument() {
    WNavDS::Instance()->OpenNewDocumentInViewer();
}

void CNavigatorStartActions::ViewDocument(const QString& path) {
    WNavDS::Instance()->LinkDocument(path, true);
}

void CNavigatorStartActions::NewNoteFromFile(const QString& path) {
    WNavDS::Instance()->AddNoteFromFile(path, nullptr);
}

void CNavigatorStartActions::SnapshotToNewNote() {
    if (ISnapshotService* snapshots = GetSnapshotService())
        snapshots->SnapshotToNewNote();
}

void CNavigatorStartActions::OpenRecentItem(const QString& identifier) {
    WNavDS::Instance()->OpenById(identifier);
}
