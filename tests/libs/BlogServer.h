#pragma once

#include <QByteArray>
#include <QList>
#include <QPointer>
#include <QTcpServer>
#include <QTcpSocket>
#include <QTimer>

// A blog on 127.0.0.1 for the length of a test: answers each HTTP request with the next
// scripted answer and records what was asked. It stops by itself after a while, so a test
// that goes wrong cannot hang on it.
class BlogServer final : public QObject {
public:
    struct Answer {
        QByteArray body;
        int status = 200;
        QByteArray location;      // sent as Location with a redirect status
        bool silent = false;      // never answers
        qint64 streamedBytes = 0; // an endless-looking body of this many bytes instead
    };
    static Answer Body(const QByteArray& body) {
        Answer answer;
        answer.body = body;
        return answer;
    }
    static Answer Silent() {
        Answer answer;
        answer.silent = true;
        return answer;
    }
    static Answer Streamed(qint64 bytes) {
        Answer answer;
        answer.streamedBytes = bytes;
        return answer;
    }
    static Answer Redirect(const QByteArray& location) {
        Answer answer;
        answer.status = 307;
        answer.location = location;
        return answer;
    }
    struct Request {
        QByteArray path;
        QByteArray body;
    };

    BlogServer() {
        m_server.listen(QHostAddress::LocalHost);
        connect(&m_server, &QTcpServer::newConnection, this, &BlogServer::Accept);
        m_stop.setSingleShot(true);
        connect(&m_stop, &QTimer::timeout, this, [this] {
            m_server.close();
            for (const QPointer<QTcpSocket>& socket : m_sockets)
                if (socket)
                    socket->abort();
        });
        m_stop.start(20000);
    }

    QByteArray Url(const QByteArray& path = "/xmlrpc.php") const {
        return "http://127.0.0.1:" + QByteArray::number(m_server.serverPort()) + path;
    }

    QList<Answer> answers;
    QList<Request> requests;

private:
    void Accept() {
        while (QTcpSocket* socket = m_server.nextPendingConnection()) {
            socket->setParent(this);
            m_sockets.append(socket);
            auto buffer = std::make_shared<QByteArray>();
            connect(socket, &QTcpSocket::readyRead, this, [this, socket, buffer] {
                *buffer += socket->readAll();
                const qsizetype headerEnd = buffer->indexOf("\r\n\r\n");
                if (headerEnd < 0)
                    return;
                const QByteArray head = buffer->left(headerEnd).toLower();
                const qsizetype at = head.indexOf("content-length:");
                const qsizetype length = at < 0
                                             ? 0
                                             : head.mid(at + 15, head.indexOf('\r', at) - at - 15)
                                                   .trimmed()
                                                   .toLongLong();
                if (buffer->size() < headerEnd + 4 + length)
                    return;
                requests.append({buffer->split(' ').value(1), buffer->mid(headerEnd + 4, length)});
                buffer->clear();
                Respond(socket, answers.isEmpty() ? Answer() : answers.takeFirst());
            });
        }
    }

    void Respond(QTcpSocket* socket, const Answer& answer) {
        if (answer.silent)
            return;
        const qint64 length = answer.streamedBytes > 0 ? answer.streamedBytes : answer.body.size();
        QByteArray head = "HTTP/1.1 " + QByteArray::number(answer.status) + " Answer\r\n" +
                          "Content-Type: text/xml\r\nConnection: close\r\nContent-Length: " +
                          QByteArray::number(length) + "\r\n";
        if (!answer.location.isEmpty())
            head += "Location: " + answer.location + "\r\n";
        socket->write(head + "\r\n");
        if (answer.streamedBytes == 0) {
            socket->write(answer.body);
            socket->disconnectFromHost();
            return;
        }
        // Written as the client takes it, so the whole body never sits in memory.
        auto left = std::make_shared<qint64>(answer.streamedBytes);
        const auto more = [socket, left] {
            const QByteArray chunk(64 * 1024, 'x');
            while (*left > 0 && socket->bytesToWrite() < 4 * chunk.size()) {
                socket->write(chunk.left(qMin<qint64>(chunk.size(), *left)));
                *left -= qMin<qint64>(chunk.size(), *left);
            }
        };
        connect(socket, &QTcpSocket::bytesWritten, socket, more);
        more();
    }

    QTcpServer m_server;
    QList<QPointer<QTcpSocket>> m_sockets;
    QTimer m_stop;
};
