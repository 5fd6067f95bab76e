#pragma once

#include <QObject>
#include <QPointer>
#include <QUrl>
#include <QVariant>

#include <functional>

class QNetworkAccessManager;
class QNetworkReply;

// One XML-RPC request to a blog, never blocking: the answer arrives through `done`. The
// request gives up after the time-out, reads at most kMaxAnswer bytes, and follows a redirect
// only to the same host without leaving https. The call deletes itself once done has run;
// deleting it earlier (with its parent) aborts the request without running done.
class CXmlRpcCall final : public QObject {
    Q_OBJECT
public:
    struct Result {
        bool ok = false;
        QVariant value;
        // Why it failed, in words for the user: the server's fault text when it sent one.
        QString error;
    };
    using Done = std::function<void(const Result&)>;

    static constexpr qint64 kMaxAnswer = 1024 * 1024;
    static constexpr int kDefaultTimeoutMs = 30000;

    static CXmlRpcCall* Start(QNetworkAccessManager* network, const QUrl& url,
                              const QString& method, const QVariantList& params, int timeoutMs,
                              QObject* parent, Done done);
    ~CXmlRpcCall() override;

private:
    CXmlRpcCall(QObject* parent, Done done);
    void OnReadyRead();
    void OnFinished();
    void Finish(const Result& result);

    QPointer<QNetworkReply> m_reply;
    QByteArray m_answer;
    QString m_abortReason;
    Done m_done;
};
