#pragma once

#include <QDeadlineTimer>
#include <QString>
#include <QStringList>

#include <memory>

class QLocalSocket;

// A starting navigator's end of the running navigator's socket (see SharedMemory). It blocks,
// so it needs no event loop.
class SharedMemoryClient final {
public:
    enum class Connection {
        Connected,
        NoListener,  // no socket, or one that nobody listens on
        Busy,        // a listener that did not accept in time
        Unavailable, // no usable path, or a peer of another user
    };
    enum class Answer {
        Done,     // the running navigator took the arguments in
        Refused,  // it took the message for malformed
        TooLarge, // the message is over the size limit and was not sent
        Dropped,  // the connection closed without an answer
        NoAnswer, // the deadline passed first
    };

    SharedMemoryClient();
    ~SharedMemoryClient();

    Connection Connect(const QString& name, QDeadlineTimer deadline);
    // Sends the arguments (the program first) and waits for the answer; only after Connect
    // answered Connected.
    Answer Exchange(const QStringList& arguments, QDeadlineTimer deadline);

private:
    std::unique_ptr<QLocalSocket> m_socket;
};
