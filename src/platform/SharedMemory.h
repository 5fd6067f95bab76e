#pragma once

#include <QList>
#include <QObject>
#include <QPointer>
#include <QString>
#include <QStringList>

#include <functional>
#include <memory>
#include <optional>

class QLocalServer;
class QLocalSocket;

// The running navigator's announcement: a local socket named after the instance name in the
// per-user runtime folder. A later start connects to it and hands over its command line.
//
// On the wire a message is a 4-byte big-endian length and that many bytes of UTF-8 text: a JSON
// array of strings, the arguments with the program first, so that every argument arrives as it
// was given. The answer is one byte, sent after the handler has returned; the handler only takes
// the arguments in, so the answer does not wait for what they ask for. Connections of other
// users, messages over the size limit, anything but valid UTF-8 holding such an array without
// NULs, extra bytes and peers that stall are dropped without ever waiting on them. A message
// whose sender stopped waiting before its turn came is not handled: that start has already
// reported that nothing happened.
class SharedMemory final : public QObject {
    Q_OBJECT
public:
    using Handler = std::function<void(const QStringList& arguments)>;

    static constexpr qsizetype kMaximumMessageBytes = 64 * 1024;
    static constexpr char kAnswerDone = 'A';
    static constexpr char kAnswerRefused = 'R';
    // How long a connection may take to deliver its whole message.
    static constexpr int kReadPatienceMs = 10000;

    explicit SharedMemory(QObject* parent = nullptr);
    ~SharedMemory() override;

    // The socket path for an instance name; a name that would make the path too long for a
    // local socket is replaced by a digest of it. Empty when there is no safe runtime folder, the
    // name is not a plain file name or even the digest leaves the path too long.
    static QString SocketPath(const QString& name);

    // Whether the peer on a connected local socket runs as the same user as this process.
    static bool PeerIsSameUser(qintptr socketDescriptor);

    // The message body for an argument list, and the list back from a body; nothing for a body
    // that is not a well-formed message.
    static QByteArray EncodeArguments(const QStringList& arguments);
    static std::optional<QStringList> DecodeArguments(const QByteArray& body);

    // What the bytes received so far on a connection make: not yet a whole message, one to
    // refuse (over the size limit, bytes after it, a body that is no message), or a message,
    // whose arguments then go to `arguments`.
    enum class Reading { Incomplete, Refused, Complete };
    static Reading ReadMessage(const QByteArray& received, QStringList* arguments);

    // Starts listening. A socket file already at the path is taken for a dead navigator's and
    // replaced, so call this only while holding the start-up mutex and after no navigator
    // answered there.
    bool Listen(const QString& name);
    bool IsListening() const;
    QString ServerPath() const;

    // From now on messages are read and given to the handler one at a time, also those that
    // waited since Listen. The answer goes back after the handler returned.
    void Publish(Handler handler);

    // Stops listening (the socket file goes) and drops every connection.
    void Close();

private:
    struct Received {
        QPointer<QLocalSocket> socket;
        QStringList arguments;
    };

    void AcceptPending();
    void Watch(QLocalSocket* socket);
    void HandleReceived();
    static void Answer(QLocalSocket* socket, char answer);

    std::unique_ptr<QLocalServer> m_server;
    Handler m_handler;
    QList<Received> m_received;
    bool m_handling = false;
};
