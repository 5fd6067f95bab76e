#pragma once

#include "libs/postwick/IPostwick.h"

#include <QObject>

#include <atomic>
#include <memory>

class CBlogAccountManager;
class CPasswordStore;
class QNetworkAccessManager;

// The blogging interface: the accounts of the working folder and the posts under way. Its
// requests go when it is released.
class CPostwick final : public QObject, public IPostwick {
    Q_OBJECT
public:
    CPostwick();

    HRESULT SetWorkingFolder(const QString& folder) override;
    IBlogAccountManager* GetAccountManager() override;
    HRESULT PostNote(const QString& title, const QString& notePath,
                     std::function<void(const Postwick::PostResult&)> done) override;
    unsigned long Release() override;

    // How long one request may wait for the blog.
    void SetRequestTimeout(int milliseconds) { m_timeoutMs = milliseconds; }

    // The files kept in the working folder.
    static inline const QString kAccountsFile = QStringLiteral("BlogAccounts.json");
    static inline const QString kPasswordsFile = QStringLiteral("BlogPasswords.json");

private:
    ~CPostwick() override;

    int m_timeoutMs;
    QNetworkAccessManager* m_network;
    CPasswordStore* m_passwords = nullptr;
    std::unique_ptr<CBlogAccountManager> m_accounts;
};
