#pragma once

#include "app/IStartActions.h"

#include <QStringList>

// Writes down every start action it is asked for, in order.
class RecordingStartActions final : public IStartActions {
public:
    void NewNote() override { calls.append(QStringLiteral("NewNote")); }
    void OpenDocument() override { calls.append(QStringLiteral("OpenDocument")); }
    void ViewDocument(const QString& path) override {
        calls.append(QStringLiteral("ViewDocument(%1)").arg(path));
    }
    void NewNoteFromFile(const QString& path) override {
        calls.append(QStringLiteral("NewNoteFromFile(%1)").arg(path));
    }
    void SnapshotToNewNote() override { calls.append(QStringLiteral("SnapshotToNewNote")); }
    void OpenRecentItem(const QString& identifier) override {
        calls.append(QStringLiteral("OpenRecentItem(%1)").arg(identifier));
    }

    QStringList calls;
};
