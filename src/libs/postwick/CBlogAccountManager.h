#pragma once

#include "libs/postwick/CBlogAccountStore.h"
#include "libs/postwick/IPostwick.h"

#include <QPointer>

class CPasswordStore;
class QNetworkAccessManager;

// The accounts behind the Blogging settings page: the file of accounts, the passwords beside
// it, and the dialogs that add and edit accounts.
class CBlogAccountManager final : public IBlogAccountManager {
public:
    CBlogAccountManager(const QString& accountsFile, CPasswordStore* passwords,
                        QNetworkAccessManager* network, const int* timeoutMs);

    int GetFirstAccount(Postwick::AccountProperties* properties) override;
    int GetNextAccount(Postwick::AccountProperties* properties) override;
    HRESULT GetDefaultAccount(Postwick::AccountProperties* properties) override;
    bool IsDefaultAccount(const QString& name) override;
    HRESULT SetDefaultAccount(const QString& name) override;
    HRESULT AddAccount(int showDialog, IUnicodeString* nameSink) override;
    HRESULT EditAccount(const QString& name) override;
    HRESULT RemoveAccount(const QString& name) override;
    HRESULT GetAccountDetails(const QString& name,
                              Postwick::AccountProperties* properties) override;
    bool UsesSecretStore() const override;
    QString PasswordStorageDescription() const override;

private:
    // Runs the account dialog for a new account (empty `account`) or an existing one, and
    // keeps what it checked. S_FALSE when the user cancelled.
    HRESULT RunDialog(const Postwick::AccountProperties& account, QString* savedName);

    CBlogAccountStore m_store;
    CPasswordStore* m_passwords;
    QNetworkAccessManager* m_network;
    const int* m_timeoutMs;
    qsizetype m_next = 0;
};
