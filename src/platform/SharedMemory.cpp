#include "platform/SharedMemory.h"

#include "platform/AppFolders.h"

#include <QCryptographicHash>
#include <QFile>
#include <QJsonArray>
#include <QJsonDocument>
#include <QLocalServer>
#include <QLocalSocket>
#include <QTimer>
#include <QtEndian>

#include <sys/socket.h>
#include <unistd.h>

namespace {

// sockaddr_un holds 108 bytes with the terminating NUL; stay one below that.
constexpr qsizetype kMaximumSocketPathBytes = 106;

// Whether the sender has closed its end, after giving up waiting for the answer.
bool PeerHungUp(QLocalSocket* socket) {
    if (socket == nullptr || socket->state() != QLocalSocket::ConnectedState)
        return true;
    char next = 0;
    return ::recv(int(socket->socketDescriptor()), &next, 1, MSG_PEEK | MSG_DONTWAIT) == 0;
}

} // namespace

SharedMemory::SharedMemory(QObject* parent) : QObject(parent) {}

SharedMemory::~SharedMemory() {
    Close();
}

QString SharedMemory::SocketPath(const QString& name) {
    if (name.isEmpty() || name.contains(u'/') || name == u"." || name == u"..")
        return {};
    const QString folder = Platform::RuntimeFolder();
    if (folder.isEmpty())
        return {};
    const QString path = folder + u'/' + name;
    if (QFile::encodeName(path).size() <= kMaximumSocketPathBytes)
        return path;
    // A deep runtime folder leaves too little room: a digest of the name stands in for it.
    const QByteArray digest =
        QCryptographicHash::hash(name.toUtf8(), QCryptographicHash::Sha256).toHex().left(16);
    const QString shortened = folder + QStringLiteral("/Ambrel-") + QString::fromLatin1(digest);
    if (QFile::encodeName(shortened).size() > kMaximumSocketPathBytes)
        return {};
    return shortened;
}

bool SharedMemory::PeerIsSameUser(qintptr socketDescriptor) {
    ucred credentials{};
    socklen_t length = sizeof credentials;
    if (::getsockopt(int(socketDescriptor), SOL_SOCKET, SO_PEERCRED, &credentials, &length) != 0)
        return false;
    return credentials.uid == ::geteuid();
}

QByteArray SharedMemory::EncodeArguments(const QStringList& arguments) {
    return QJsonDocument(QJsonArray::fromStringList(arguments)).toJson(QJsonDocument::Compact);
}

std::optional<QStringList> SharedMemory::DecodeArguments(const QByteArray& body) {
    // The reader refuses broken UTF-8 and anything after the array.
    QJsonParseError error{};
    const QJsonDocument document = QJsonDocument::fromJson(body, &error);
    if (error.error != QJsonParseError::NoError || !document.isArray())
        return std::nullopt;
    QStringList arguments;
    for (const QJsonValue& value : document.array()) {
        if (!value.isString() || value.toString().contains(QChar(0)))
            return std::nullopt;
        arguments.append(value.toString());
    }
    return arguments;
}

SharedMemory::Reading SharedMemory::ReadMessage(const QByteArray& received,
                                                QStringList* arguments) {
    if (received.size() < 4)
        return Reading::Incomplete;
    const quint32 length = qFromBigEndian<quint32>(received.constData());
    if (length > quint32(kMaximumMessageBytes))
        return Reading::Refused;
    if (received.size() < 4 + qsizetype(length))
        return Reading::Incomplete;
    if (received.size() != 4 + qsizetype(length))
        return Reading::Refused;
    std::optional<QStringList> decoded = DecodeArguments(received.mid(4));
    if (!decoded)
        return Reading::Refused;
    *arguments = std::move(*decoded);
    return Reading::Complete;
}

bool SharedMemory::Listen(const QString& name) {
    Close();
    const QString path = SocketPath(name);
    if (path.isEmpty())
        return false;
    auto server = std::make_unique<QLocalServer>();
    if (!server->listen(path)) {
        if (server->serverError() != QAbstractSocket::AddressInUseError)
            return false;
        QLocalServer::removeServer(path);
        if (!server->listen(path))
            return false;
    }
    // The runtime folder is private already; the socket is kept so as well.
    QFile::setPermissions(path, QFile::ReadOwner | QFile::WriteOwner);
    m_server = std::move(server);
    return true;
}

bool SharedMemory::IsListening() const {
    return m_server && m_server->isListening();
}

QString SharedMemory::ServerPath() const {
    return m_server ? m_server->fullServerName() : QString();
}

void SharedMemory::Publish(Handler handler) {
    m_handler = std::move(handler);
    if (!m_server)
        return;
    connect(m_server.get(), &QLocalServer::newConnection, this, &SharedMemory::AcceptPending,
            Qt::UniqueConnection);
    AcceptPending();
}

void SharedMemory::Close() {
    m_received.clear();
    if (!m_server)
        return;
    disconnect(m_server.get(), nullptr, this, nullptr);
    m_server->close();
    const auto sockets = m_server->findChildren<QLocalSocket*>(Qt::FindDirectChildrenOnly);
    for (QLocalSocket* socket : sockets)
        socket->abort();
    // A handler may close the channel from inside a socket's signal: the sockets must outlive
    // that call, so they go with the server once control is back in the event loop.
    if (m_handling)
        m_server.release()->deleteLater();
    else
        m_server.reset();
}

void SharedMemory::AcceptPending() {
    while (m_server && m_server->hasPendingConnections()) {
        QLocalSocket* socket = m_server->nextPendingConnection();
        if (!PeerIsSameUser(socket->socketDescriptor())) {
            socket->abort();
            socket->deleteLater();
            continue;
        }
        Watch(socket);
    }
}

void SharedMemory::Watch(QLocalSocket* socket) {
    connect(socket, &QLocalSocket::disconnected, socket, &QObject::deleteLater);
    // A peer that stalls half-way is cut off instead of holding the connection for ever.
    auto* patience = new QTimer(socket);
    patience->setSingleShot(true);
    connect(patience, &QTimer::timeout, socket, [socket] { socket->abort(); });
    patience->start(kReadPatienceMs);

    auto buffer = std::make_shared<QByteArray>();
    auto reading = std::make_shared<QMetaObject::Connection>();
    const auto read = [=, this] {
        buffer->append(socket->readAll());
        QStringList arguments;
        const Reading outcome = ReadMessage(*buffer, &arguments);
        if (outcome == Reading::Incomplete)
            return;
        disconnect(*reading);
        patience->stop();
        if (outcome == Reading::Refused) {
            Answer(socket, kAnswerRefused);
            return;
        }
        m_received.append({socket, arguments});
        HandleReceived();
    };
    *reading = connect(socket, &QLocalSocket::readyRead, this, read);
    if (socket->bytesAvailable() > 0)
        read();
}

void SharedMemory::HandleReceived() {
    // A handler that runs a nested event loop may let more messages in; they wait their turn.
    if (m_handling)
        return;
    m_handling = true;
    while (!m_received.isEmpty()) {
        const Received next = m_received.takeFirst();
        // A sender that stopped waiting has told its user that nothing happened; keep it so.
        if (PeerHungUp(next.socket))
            continue;
        if (m_handler)
            m_handler(next.arguments);
        if (next.socket && next.socket->state() == QLocalSocket::ConnectedState)
            Answer(next.socket, kAnswerDone);
    }
    m_handling = false;
}

void SharedMemory::Answer(QLocalSocket* socket, char answer) {
    socket->write(&answer, 1);
    socket->disconnectFromServer();
}
