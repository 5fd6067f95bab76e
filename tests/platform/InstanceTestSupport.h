#pragma once

#include <QEventLoop>
#include <QFile>
#include <QLocalSocket>
#include <QSysInfo>
#include <QTimer>
#include <QtEndian>

#include <sys/socket.h>
#include <sys/un.h>
#include <unistd.h>

#include <cstring>
#include <functional>

// A message as a starting navigator sends it: 4-byte big-endian length, then the bytes.
inline QByteArray Frame(const QByteArray& payload) {
    QByteArray length(4, '\0');
    qToBigEndian(quint32(payload.size()), length.data());
    return length + payload;
}

// Runs the event loop until the condition holds or the time is up (the generous default makes
// a fault fail the test instead of hanging it); answers the condition.
inline bool SpinUntil(const std::function<bool()>& condition, int milliseconds = 20000) {
    QEventLoop loop;
    QTimer poll;
    QObject::connect(&poll, &QTimer::timeout, &loop, [&] {
        if (condition())
            loop.quit();
    });
    poll.start(5);
    QTimer::singleShot(milliseconds, &loop, &QEventLoop::quit);
    if (!condition())
        loop.exec();
    return condition();
}

// Lets the event loop run for a while, for things that must not happen.
inline void SpinFor(int milliseconds) {
    SpinUntil([] { return false; }, milliseconds);
}

// Sends bytes on a fresh connection from this thread and answers what came back before the
// other side closed it.
inline QByteArray SendRaw(const QString& path, const QByteArray& bytes) {
    QLocalSocket socket;
    socket.connectToServer(path);
    if (!socket.waitForConnected(5000))
        return "(no connection)";
    socket.write(bytes);
    QByteArray answer;
    QObject::connect(&socket, &QLocalSocket::readyRead, [&] { answer += socket.readAll(); });
    SpinUntil([&] { return socket.state() == QLocalSocket::UnconnectedState; });
    return answer + socket.readAll();
}

// A socket file nobody listens on, as a navigator that was killed leaves it behind.
inline bool MakeDeadSocket(const QString& path) {
    const int fd = ::socket(AF_UNIX, SOCK_STREAM, 0);
    sockaddr_un address{};
    address.sun_family = AF_UNIX;
    const QByteArray encoded = QFile::encodeName(path);
    std::memcpy(address.sun_path, encoded.constData(), size_t(encoded.size()));
    const bool bound = ::bind(fd, reinterpret_cast<sockaddr*>(&address), sizeof address) == 0;
    ::close(fd);
    return bound && QFile::exists(path);
}

// A lock file as a start-up that was killed while holding the lock leaves it behind.
inline bool MakeDeadLock(const QString& path) {
    QFile file(path);
    if (!file.open(QIODevice::WriteOnly))
        return false;
    // No process has this id (it is above the kernel's limit).
    file.write("999999999\nambrel-navigator\n" + QSysInfo::machineHostName().toUtf8() + '\n');
    return true;
}
