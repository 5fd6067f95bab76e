// The note tool's reader of "note.htm": whatever the file holds, reading ends, and a note
// saved from what was read saves the same way a second time.
#include "FuzzEnvironment.h"

#include "notetool/CNoteFile.h"

#include <cstddef>
#include <cstdint>
#include <cstdio>

extern "C" int LLVMFuzzerInitialize(int* argc, char*** argv) {
    FuzzEnvironment::SetUp(argc, argv, FuzzEnvironment::Application::Core);
    return 0;
}

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    NoteContent read;
    if (!CNoteFile::Parse(QByteArray(reinterpret_cast<const char*>(data), qsizetype(size)), &read))
        return 0;
    const QByteArray saved = CNoteFile::Format(read);
    NoteContent reread;
    FuzzEnvironment::Require(CNoteFile::Parse(saved, &reread), "a saved note reads again");
    const QByteArray savedAgain = CNoteFile::Format(reread);
    if (savedAgain != saved)
        std::fprintf(stderr, "saved:\n%s\nsaved again:\n%s\n", saved.constData(),
                     savedAgain.constData());
    FuzzEnvironment::Require(savedAgain == saved, "a note saved twice is the same file");
    return 0;
}
