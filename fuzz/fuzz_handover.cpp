// What a running navigator reads from a connection on its instance socket: the bytes arrive
// one by one, and the reader must neither run past them nor take in more than one message.
#include "FuzzEnvironment.h"

#include "app/ForwardedCommandLine.h"
#include "app/RecordingStartActions.h"
#include "platform/SharedMemory.h"

#include <cstddef>
#include <cstdint>

extern "C" int LLVMFuzzerInitialize(int* argc, char*** argv) {
    FuzzEnvironment::SetUp(argc, argv, FuzzEnvironment::Application::Core);
    return 0;
}

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    const QByteArray bytes(reinterpret_cast<const char*>(data), qsizetype(size));
    QStringList arguments;
    SharedMemory::Reading reading = SharedMemory::Reading::Incomplete;
    qsizetype taken = 0;
    while (reading == SharedMemory::Reading::Incomplete && taken < bytes.size())
        reading = SharedMemory::ReadMessage(bytes.left(++taken), &arguments);
    if (reading != SharedMemory::Reading::Complete)
        return 0;
    for (const QString& argument : arguments)
        FuzzEnvironment::Require(!argument.contains(QChar(0)), "no argument holds a NUL");
    // Bytes after a message that came whole are never read; a message read at once is the
    // same as one read piece by piece.
    if (taken == bytes.size()) {
        QStringList decoded;
        FuzzEnvironment::Require(SharedMemory::ReadMessage(bytes, &decoded) ==
                                         SharedMemory::Reading::Complete &&
                                     decoded == arguments,
                                 "a message read at once reads as one read piece by piece");
    }

    RecordingStartActions actions;
    RunForwardedCommandLine(MakeFileArgumentsAbsolute(arguments), actions);
    return 0;
}
