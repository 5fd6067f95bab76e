#pragma once

#include "libs/postwick/CNoteForBlog.h"
#include "libs/postwick/IPostwick.h"

#include <QMap>
#include <QObject>

#include <functional>

class CPasswordStore;
class QNetworkAccessManager;

// One note on its way to a blog: the account's password is fetched, each picture is
// uploaded (metaWeblog.newMediaObject), the body with the pictures' new addresses is posted
// (metaWeblog.newPost), and the post's address is asked for (metaWeblog.getPost). Each step
// waits for the last without blocking; the first failure ends the post. The object deletes
// itself when done has run.
class CBlogPost final : public QObject {
    Q_OBJECT
public:
    using Done = std::function<void(const Postwick::PostResult&)>;

    // Pictures larger than this are not sent.
    static constexpr qint64 kMaxPictureSize = 16 * 1024 * 1024;

    CBlogPost(Postwick::AccountProperties account, QString title, CNoteForBlog note,
              CPasswordStore* passwords, QNetworkAccessManager* network, int timeoutMs, Done done,
              QObject* parent);

    void Start();

private:
    void UploadNext();
    void Publish();
    void AskForLink(const QString& postId);
    void Fail(const QString& why);
    void Succeed(const QString& link);
    QUrl Endpoint() const;
    QString Value(const QString& key) const;

    Postwick::AccountProperties m_account;
    QString m_title;
    CNoteForBlog m_note;
    CPasswordStore* m_passwords;
    QNetworkAccessManager* m_network;
    int m_timeoutMs;
    Done m_done;
    QString m_password;
    qsizetype m_nextPicture = 0;
    QMap<QString, QString> m_addresses;
};
