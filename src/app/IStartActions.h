#pragma once

#include <QString>

// What the navigator does for the start actions of a command line. The application implements
// it over the navigator data source and the snapshot service.
class IStartActions {
public:
    // A new note with the default note properties, opened at once.
    virtual void NewNote() = 0;
    // The viewer, started for a new item without a file.
    virtual void OpenDocument() = 0;
    // Links the document at the path (or finds its link) and opens it in the viewer.
    virtual void ViewDocument(const QString& path) = 0;
    // A new note built from the file; the file is deleted once a note constructor took it.
    virtual void NewNoteFromFile(const QString& path) = 0;
    // A picture note of the screen.
    virtual void SnapshotToNewNote() = 0;
    // Selects and opens the item, or has the note tool and the viewer forget the identifier
    // when the notebook does not hold it outside Deleted Items. The identifier comes from
    // outside and may be empty.
    virtual void OpenRecentItem(const QString& identifier) = 0;

protected:
    ~IStartActions() = default;
};
