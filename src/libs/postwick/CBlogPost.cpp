#include "libs/postwick/CBlogPost.h"

#include "libs/postwick/CPasswordStore.h"
#include "libs/postwick/CXmlRpcCall.h"

#include <QFile>
#include <QFileInfo>
#include <QMimeDatabase>
#include <QPointer>
#include <QUrl>

using namespace Qt::StringLiterals;

CBlogPost::CBlogPost(Postwick::AccountProperties account, QString title, CNoteForBlog note,
                     CPasswordStore* passwords, QNetworkAccessManager* network, int timeoutMs,
                     Done done, QObject* parent)
    : QObject(parent), m_account(std::move(account)), m_title(std::move(title)),
      m_note(std::move(note)), m_passwords(passwords), m_network(network), m_timeoutMs(timeoutMs),
      m_done(std::move(done)) {}

QString CBlogPost::Value(const QString& key) const {
    return m_account.value(key);
}

QUrl CBlogPost::Endpoint() const {
    return QUrl(Value(Postwick::kAccountXmlRpcUrl));
}

void CBlogPost::Start() {
    QPointer<CBlogPost> self(this);
    m_passwords->Read(Value(Postwick::kAccountName), [self](bool found, const QString& password) {
        if (!self)
            return;
        if (!found)
            return self->Fail(u"The password of the account is missing; enter it again in "
                              u"the account's settings."_s);
        self->m_password = password;
        self->UploadNext();
    });
}

void CBlogPost::UploadNext() {
    if (m_nextPicture >= m_note.Pictures().size())
        return Publish();
    const QString path = m_note.Pictures().at(m_nextPicture++);
    QFile picture(path);
    if (picture.size() > kMaxPictureSize)
        return Fail(u"The picture \"%1\" is larger than %2 MB."_s.arg(
            QFileInfo(path).fileName(), QString::number(kMaxPictureSize / (1024 * 1024))));
    if (!picture.open(QIODevice::ReadOnly))
        return Fail(u"The picture \"%1\" cannot be read."_s.arg(QFileInfo(path).fileName()));
    const QVariantMap media{
        {u"name"_s, QFileInfo(path).fileName()},
        {u"type"_s, QMimeDatabase().mimeTypeForFile(path).name()},
        {u"bits"_s, picture.readAll()},
    };
    CXmlRpcCall::Start(
        m_network, Endpoint(), u"metaWeblog.newMediaObject"_s,
        {Value(Postwick::kAccountBlogId), Value(Postwick::kAccountUser), m_password, media},
        m_timeoutMs, this, [this, path](const CXmlRpcCall::Result& result) {
            const QString url = result.value.toMap().value(u"url"_s).toString();
            if (!result.ok)
                return Fail(result.error);
            if (url.isEmpty())
                return Fail(u"The blog took the picture \"%1\" but gave no address for it."_s.arg(
                    QFileInfo(path).fileName()));
            m_addresses.insert(path, url);
            UploadNext();
        });
}

void CBlogPost::Publish() {
    const QVariantMap content{
        {u"title"_s, m_title},
        {u"description"_s, m_note.BodyWithAddresses(m_addresses)},
    };
    CXmlRpcCall::Start(
        m_network, Endpoint(), u"metaWeblog.newPost"_s,
        {Value(Postwick::kAccountBlogId), Value(Postwick::kAccountUser), m_password, content, true},
        m_timeoutMs, this, [this](const CXmlRpcCall::Result& result) {
            const QString postId = result.value.toString();
            if (!result.ok)
                return Fail(result.error);
            if (postId.isEmpty())
                return Fail(u"The blog gave no post number back."_s);
            AskForLink(postId);
        });
}

void CBlogPost::AskForLink(const QString& postId) {
    // The post is made; without its own address the blog's address says where it is.
    CXmlRpcCall::Start(m_network, Endpoint(), u"metaWeblog.getPost"_s,
                       {postId, Value(Postwick::kAccountUser), m_password}, m_timeoutMs, this,
                       [this](const CXmlRpcCall::Result& result) {
                           const QVariantMap post = result.value.toMap();
                           QString link = post.value(u"permaLink"_s).toString();
                           if (link.isEmpty())
                               link = post.value(u"link"_s).toString();
                           const QUrl url(link);
                           if (!result.ok || !url.isValid() ||
                               (url.scheme() != u"https"_s && url.scheme() != u"http"_s))
                               link = Value(Postwick::kAccountBlogHost);
                           Succeed(link);
                       });
}

void CBlogPost::Fail(const QString& why) {
    Postwick::PostResult result;
    result.message = u"The note \"%1\" could not be posted to %2:\n%3"_s.arg(
        m_title, Value(Postwick::kAccountName), why);
    const Done done = std::move(m_done);
    deleteLater();
    done(result);
}

void CBlogPost::Succeed(const QString& link) {
    Postwick::PostResult result;
    result.posted = true;
    result.link = link;
    result.message = u"The note \"%1\" was posted to %2:\n%3"_s.arg(
        m_title, Value(Postwick::kAccountName), link);
    const Done done = std::move(m_done);
    deleteLater();
    done(result);
}
