#include "platform/SharedMemoryClient.h"

#include "platform/SharedMemory.h"

#include <QLocalSocket>
#include <QtEndian>

#include <algorithm>

namespace {

// One connection attempt waits at most this long, so that a deadline is looked at often.
constexpr qint64 kConnectSliceMs = 1000;

int RemainingMs(const QDeadlineTimer& deadline, qint64 cap = -1) {
    qint64 remaining = deadline.isForever() ? cap : std::max<qint64>(deadline.remainingTime(), 0);
    if (cap >= 0 && (remaining < 0 || remaining > cap))
        remaining = cap;
    return int(remaining);
}

} // namespace

SharedMemoryClient::SharedMemoryClient() = default;

SharedMemoryClient::~SharedMemoryClient() = default;

SharedMemoryClient::Connection SharedMemoryClient::Connect(const QString& name,
                                                           QDeadlineTimer deadline) {
    m_socket.reset();
    const QString path = SharedMemory::SocketPath(name);
    if (path.isEmpty())
        return Connection::Unavailable;
    auto socket = std::make_unique<QLocalSocket>();
    socket->connectToServer(path);
    if (!socket->waitForConnected(RemainingMs(deadline, kConnectSliceMs))) {
        switch (socket->error()) {
        case QLocalSocket::ServerNotFoundError:
        case QLocalSocket::ConnectionRefusedError:
            return Connection::NoListener;
        case QLocalSocket::SocketTimeoutError:
            return Connection::Busy;
        default:
            return Connection::Unavailable;
        }
    }
    if (!SharedMemory::PeerIsSameUser(socket->socketDescriptor()))
        return Connection::Unavailable;
    m_socket = std::move(socket);
    return Connection::Connected;
}

SharedMemoryClient::Answer SharedMemoryClient::Exchange(const QStringList& arguments,
                                                        QDeadlineTimer deadline) {
    if (!m_socket)
        return Answer::Dropped;
    const QByteArray bytes = SharedMemory::EncodeArguments(arguments);
    if (bytes.size() > SharedMemory::kMaximumMessageBytes)
        return Answer::TooLarge;

    QByteArray message(4, '\0');
    qToBigEndian<quint32>(quint32(bytes.size()), message.data());
    message += bytes;
    m_socket->write(message);
    while (m_socket->bytesToWrite() > 0) {
        if (!m_socket->waitForBytesWritten(RemainingMs(deadline))) {
            if (m_socket->state() != QLocalSocket::ConnectedState)
                return Answer::Dropped;
            if (deadline.hasExpired())
                return Answer::NoAnswer;
        }
    }
    while (m_socket->bytesAvailable() < 1) {
        if (m_socket->state() != QLocalSocket::ConnectedState)
            return Answer::Dropped;
        if (!m_socket->waitForReadyRead(RemainingMs(deadline)) && m_socket->bytesAvailable() < 1) {
            if (m_socket->state() != QLocalSocket::ConnectedState)
                return Answer::Dropped;
            if (deadline.hasExpired())
                return Answer::NoAnswer;
        }
    }
    char answer = 0;
    m_socket->getChar(&answer);
    m_socket.reset();
    return answer == SharedMemory::kAnswerDone ? Answer::Done : Answer::Refused;
}
