#pragma once

#include "app/IStartActions.h"

#include <QStringList>

// Writes down every start action it is asked for, in order: "Name" or "Name(argument)".
class RecordingStartActions final : public IStartActions {
public:
    void NewNote() override { calls << QStringLiteral("NewNote"); }
    void OpenDocument() override { calls << QStringLiteral("OpenDocument"); }
    void ViewDocument(const QString& path) override { Add(u"ViewDocument", path); }
    void NewNoteFromFile(const QString& path) override { Add(u"NewNoteFromFile", path); }
    void SnapshotToNewNote() override { calls << QStringLiteral("SnapshotToNewNote"); }
    void OpenRecentItem(const QString& id) override { Add(u"OpenRecentItem", id); }

    QStringList calls;

private:
    void Add(const char16_t* name, const QString& argument) {
        calls << QString::fromUtf16(name) + u'(' + argument + u')';
    }
};
