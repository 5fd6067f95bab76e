#pragma once

#include "app/IStartActions.h"

// The start actions of a command line, carried out by the navigator data source and the
// snapshot service.
class CNavigatorStartActions final : public IStartActions {
public:
    void NewNote() override;
    void OpenDocument() override;
    void ViewDocument(const QString& path) override;
    void NewNoteFromFile(const QString& path) override;
    void SnapshotToNewNote() override;
    void OpenRecentItem(const QString& identifier) override;
};
