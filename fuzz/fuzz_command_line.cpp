// The navigator's command line, as its own start gets it and as a second start hands it over:
// the arguments are the input split at NUL bytes, as a program's arguments are.
#include "FuzzEnvironment.h"

#include "app/CNavigatorCmdLineInfo.h"
#include "app/ForwardedCommandLine.h"
#include "app/RecordingStartActions.h"
#include "platform/SharedMemory.h"

#include <QtEndian>

#include <cstddef>
#include <cstdint>

extern "C" int LLVMFuzzerInitialize(int* argc, char*** argv) {
    FuzzEnvironment::SetUp(argc, argv, FuzzEnvironment::Application::Core);
    return 0;
}

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    QStringList arguments{QStringLiteral("/usr/bin/ambrel-navigator")};
    const QByteArray bytes(reinterpret_cast<const char*>(data), qsizetype(size));
    if (!bytes.isEmpty()) {
        for (const QByteArray& argument : bytes.split('\0'))
            arguments.append(QString::fromUtf8(argument));
    }

    CNavigatorCmdLineInfo info;
    ParseCommandLine(info, arguments);
    RecordingStartActions actions;
    RunStartActions(info, actions);
    const qsizetype ran = actions.calls.size();
    RunStartActions(info, actions);
    FuzzEnvironment::Require(actions.calls.size() == ran, "start actions run once");

    // A second start sends the list with its file arguments made absolute; the running
    // navigator must receive exactly that list.
    const QStringList sent = MakeFileArgumentsAbsolute(arguments);
    FuzzEnvironment::Require(sent.size() == arguments.size(), "no argument lost or added");
    const QByteArray body = SharedMemory::EncodeArguments(sent);
    if (body.size() > SharedMemory::kMaximumMessageBytes)
        return 0;
    QByteArray frame(4, '\0');
    qToBigEndian<quint32>(quint32(body.size()), frame.data());
    frame.append(body);
    QStringList received;
    FuzzEnvironment::Require(SharedMemory::ReadMessage(frame, &received) ==
                                 SharedMemory::Reading::Complete,
                             "a sent command line is taken in");
    FuzzEnvironment::Require(received == sent, "a command line arrives as it was sent");

    RecordingStartActions forwarded;
    RunForwardedCommandLine(received, forwarded);
    RecordingStartActions direct;
    CNavigatorCmdLineInfo again;
    ParseCommandLine(again, sent);
    RunStartActions(again, direct);
    FuzzEnvironment::Require(forwarded.calls == direct.calls,
                             "a handed-over command line asks for what it asked for at start");
    return 0;
}
