#include "libs/postwick/CXmlRpcCall.h"

#include "libs/postwick/XmlRpcMessage.h"

#include <QNetworkAccessManager>
#include <QNetworkReply>
#include <QNetworkRequest>

using namespace Qt::StringLiterals;

CXmlRpcCall::CXmlRpcCall(QObject* parent, Done done) : QObject(parent), m_done(std::move(done)) {}

CXmlRpcCall::~CXmlRpcCall() {
    if (m_reply) {
        m_reply->disconnect(this);
        m_reply->abort();
        m_reply->deleteLater();
    }
}

CXmlRpcCall* CXmlRpcCall::Start(QNetworkAccessManager* network, const QUrl& url,
                                const QString& method, const QVariantList& params, int timeoutMs,
                                QObject* parent, Done done) {
    auto* call = new CXmlRpcCall(parent, std::move(done));
    QNetworkRequest request(url);
    request.setHeader(QNetworkRequest::ContentTypeHeader, u"text/xml; charset=utf-8"_s);
    request.setTransferTimeout(timeoutMs);
    // A blog that sends the request elsewhere could collect the password it carries.
    request.setAttribute(QNetworkRequest::RedirectPolicyAttribute,
                         QNetworkRequest::UserVerifiedRedirectPolicy);
    request.setMaximumRedirectsAllowed(5);
    call->m_reply = network->post(request, XmlRpcMessage::MethodCall(method, params));
    QNetworkReply* reply = call->m_reply;
    const QUrl origin = url;
    connect(reply, &QNetworkReply::redirected, call, [call, reply, origin](const QUrl& target) {
        const QUrl resolved = origin.resolved(target);
        const bool sameHost = resolved.host().compare(origin.host(), Qt::CaseInsensitive) == 0;
        const bool keepsTls = origin.scheme() != u"https"_s || resolved.scheme() == u"https"_s;
        if (sameHost && keepsTls) {
            Q_EMIT reply->redirectAllowed();
            return;
        }
        call->m_abortReason =
            u"The blog sent the request on to another address (%1); it was not followed."_s.arg(
                resolved.toDisplayString(QUrl::RemoveUserInfo | QUrl::RemoveQuery));
        reply->abort();
    });
    connect(reply, &QNetworkReply::readyRead, call, &CXmlRpcCall::OnReadyRead);
    connect(reply, &QNetworkReply::finished, call, &CXmlRpcCall::OnFinished);
    return call;
}

void CXmlRpcCall::OnReadyRead() {
    if (!m_abortReason.isEmpty())
        return;
    const qint64 room = kMaxAnswer - m_answer.size();
    m_answer += m_reply->read(room + 1);
    if (m_answer.size() > kMaxAnswer) {
        m_abortReason = u"The blog's answer is larger than %1 MB; it was not read."_s.arg(
            kMaxAnswer / (1024 * 1024));
        m_reply->abort();
    }
}

void CXmlRpcCall::OnFinished() {
    if (m_abortReason.isEmpty() && m_reply->bytesAvailable() > 0)
        OnReadyRead();
    Result result;
    if (!m_abortReason.isEmpty()) {
        result.error = m_abortReason;
    } else if (m_reply->error() == QNetworkReply::OperationCanceledError ||
               m_reply->error() == QNetworkReply::TimeoutError) {
        // The transfer time-out ends a request this way.
        result.error = u"The blog did not answer in time."_s;
    } else if (m_reply->error() != QNetworkReply::NoError &&
               m_reply->error() < QNetworkReply::ContentAccessDenied) {
        result.error = u"The blog could not be reached: %1"_s.arg(m_reply->errorString());
    } else {
        // Some servers send a fault with an error status: the fault text says more.
        const XmlRpcMessage::Response response = XmlRpcMessage::ParseResponse(m_answer);
        switch (response.kind) {
        case XmlRpcMessage::Response::Kind::Value:
            result.ok = m_reply->error() == QNetworkReply::NoError;
            result.value = response.value;
            if (!result.ok)
                result.error = u"The blog refused the request: %1"_s.arg(m_reply->errorString());
            break;
        case XmlRpcMessage::Response::Kind::Fault:
            result.error = response.error;
            break;
        case XmlRpcMessage::Response::Kind::Malformed:
            result.error = m_reply->error() != QNetworkReply::NoError
                               ? u"The blog refused the request: %1"_s.arg(m_reply->errorString())
                               : response.error;
            break;
        }
    }
    Finish(result);
}

void CXmlRpcCall::Finish(const Result& result) {
    if (m_reply) {
        m_reply->disconnect(this);
        m_reply->deleteLater();
        m_reply = nullptr;
    }
    const Done done = std::move(m_done);
    m_done = nullptr;
    deleteLater();
    if (done)
        done(result);
}
