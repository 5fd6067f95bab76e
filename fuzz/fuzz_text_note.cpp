// A note made from a text file of any content: the constructor ends, and the note it writes is
// one that the note tool can read.
#include "FuzzEnvironment.h"

#include "common/ReleasePtr.h"
#include "notes/NoteConstructorRegistry.h"
#include "notetool/CNoteFile.h"
#include "platform/IMessageBox.h"
#include "support/RecordingMessageBox.h"

#include <QFile>

#include <cstddef>
#include <cstdint>

extern "C" int LLVMFuzzerInitialize(int* argc, char*** argv) {
    FuzzEnvironment::SetUp(argc, argv, FuzzEnvironment::Application::Core);
    return 0;
}

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    const QString source = FuzzEnvironment::Home() + QStringLiteral("/drop/dropped.txt");
    const QString notePath =
        FuzzEnvironment::AppDataFolder() +
        QStringLiteral("/Catalog/2F1A4C3E-0B5D-4E6F-8A7B-9C0D1E2F3A4B/note.htm");
    FuzzEnvironment::Require(
        FuzzEnvironment::WriteFile(
            source, QByteArray(reinterpret_cast<const char*>(data), qsizetype(size))),
        "source file written");
    FuzzEnvironment::WriteFile(notePath, {});
    QFile::remove(notePath);

    RecordingMessageBox messages;
    Platform::SetMessageBox(&messages);
    int made = 0;
    {
        // The constructor the navigator picks for a ".txt" file: the text file one.
        ReleasePtr<CBasicNoteConstructor> constructor(CreateNoteConstructor(source));
        FuzzEnvironment::Require(constructor != nullptr, "a text file has a note constructor");
        constructor->SetNoteDefaults(NoteDefaults());
        made = constructor->Create(notePath, QStringLiteral("Dropped"));
    }
    if (made == 1) {
        NoteContent content;
        FuzzEnvironment::Require(CNoteFile::Parse(FuzzEnvironment::ReadFile(notePath), &content),
                                 "the note tool reads the note made from the text");
    }
    FuzzEnvironment::ResetProgram();
    return 0;
}
