#include "libs/postwick/CPasswordStore.h"

#include <QDBusConnection>
#include <QDBusConnectionInterface>
#include <QFile>
#include <QJsonDocument>
#include <QJsonObject>
#include <QSaveFile>
#include <QTimer>
#include <qt6keychain/keychain.h>

using namespace Qt::StringLiterals;

namespace {

const QString kService = u"Quillmark Ambrel blog accounts"_s;

bool SecretServiceRunning() {
    const QDBusConnection bus = QDBusConnection::sessionBus();
    return bus.isConnected() && bus.interface() != nullptr &&
           bus.interface()->isServiceRegistered(u"org.freedesktop.secrets"_s).value();
}

constexpr QFileDevice::Permissions kOwnerOnly = QFileDevice::ReadOwner | QFileDevice::WriteOwner;

} // namespace

CPasswordStore::CPasswordStore(const QString& fallbackFile, QObject* parent)
    : QObject(parent), m_fallbackFile(fallbackFile), m_secretStore(SecretServiceRunning()) {}

QString CPasswordStore::ReadFile(const QString& account, bool* found) const {
    QFile file(m_fallbackFile);
    const QJsonObject passwords = file.open(QIODevice::ReadOnly)
                                      ? QJsonDocument::fromJson(file.readAll()).object()
                                      : QJsonObject();
    *found = passwords.contains(account);
    return passwords.value(account).toString();
}

bool CPasswordStore::WriteFile(const QString& account, const QString* password) const {
    QJsonObject passwords;
    if (QFile existing(m_fallbackFile); existing.open(QIODevice::ReadOnly))
        passwords = QJsonDocument::fromJson(existing.readAll()).object();
    if (password != nullptr)
        passwords.insert(account, *password);
    else if (!passwords.contains(account))
        return true;
    else
        passwords.remove(account);
    QSaveFile file(m_fallbackFile);
    // Owner-only before a byte is written, so the password is never readable by others.
    if (!file.open(QIODevice::WriteOnly) || !file.setPermissions(kOwnerOnly))
        return false;
    file.write(QJsonDocument(passwords).toJson(QJsonDocument::Compact));
    return file.commit() && QFile::setPermissions(m_fallbackFile, kOwnerOnly);
}

void CPasswordStore::Read(const QString& account,
                          std::function<void(bool found, const QString&)> done) {
    if (!m_secretStore) {
        bool found = false;
        const QString password = ReadFile(account, &found);
        QTimer::singleShot(0, this, [done, found, password] { done(found, password); });
        return;
    }
    auto* job = new QKeychain::ReadPasswordJob(kService, this);
    job->setKey(account);
    job->setInsecureFallback(false);
    connect(job, &QKeychain::Job::finished, this, [this, job, account, done] {
        if (job->error() == QKeychain::NoError) {
            done(true, job->textData());
            return;
        }
        // Kept in the file while the store refused it.
        bool found = false;
        const QString password = ReadFile(account, &found);
        done(found, password);
    });
    job->start();
}

void CPasswordStore::Write(const QString& account, const QString& password,
                           std::function<void(bool)> done) {
    if (!m_secretStore) {
        const bool written = WriteFile(account, &password);
        QTimer::singleShot(0, this, [done, written] { done(written); });
        return;
    }
    auto* job = new QKeychain::WritePasswordJob(kService, this);
    job->setKey(account);
    job->setInsecureFallback(false);
    job->setTextData(password);
    connect(job, &QKeychain::Job::finished, this, [this, job, account, password, done] {
        if (job->error() != QKeychain::NoError) {
            done(WriteFile(account, &password));
            return;
        }
        // A copy left in the file from before the store ran is no longer wanted.
        WriteFile(account, nullptr);
        done(true);
    });
    job->start();
}

void CPasswordStore::Remove(const QString& account) {
    WriteFile(account, nullptr);
    if (!m_secretStore)
        return;
    auto* job = new QKeychain::DeletePasswordJob(kService, this);
    job->setKey(account);
    job->setInsecureFallback(false);
    job->start();
}
