#include "libs/postwick/CBlogAccountManager.h"

#include "libs/postwick/CBlogAccountDlg.h"
#include "libs/postwick/CPasswordStore.h"

#include <QApplication>

using namespace Qt::StringLiterals;

CBlogAccountManager::CBlogAccountManager(const QString& accountsFile, CPasswordStore* passwords,
                                         QNetworkAccessManager* network, const int* timeoutMs)
    : m_store(accountsFile), m_passwords(passwords), m_network(network), m_timeoutMs(timeoutMs) {}

int CBlogAccountManager::GetFirstAccount(Postwick::AccountProperties* properties) {
    m_next = 0;
    return GetNextAccount(properties);
}

int CBlogAccountManager::GetNextAccount(Postwick::AccountProperties* properties) {
    if (properties == nullptr || m_next >= m_store.Accounts().size())
        return 1;
    *properties = m_store.Accounts().at(m_next++);
    return 0;
}

HRESULT CBlogAccountManager::GetDefaultAccount(Postwick::AccountProperties* properties) {
    const qsizetype index = m_store.Find(m_store.DefaultName());
    if (properties == nullptr)
        return E_INVALIDARG;
    if (m_store.DefaultName().isEmpty() || index < 0)
        return S_FALSE;
    *properties = m_store.Accounts().at(index);
    return S_OK;
}

bool CBlogAccountManager::IsDefaultAccount(const QString& name) {
    return !name.isEmpty() && name == m_store.DefaultName();
}

HRESULT CBlogAccountManager::SetDefaultAccount(const QString& name) {
    return m_store.SetDefault(name) ? S_OK : E_FAIL;
}

HRESULT CBlogAccountManager::AddAccount(int showDialog, IUnicodeString* nameSink) {
    if (showDialog != 1)
        return E_INVALIDARG;
    QString name;
    const HRESULT result = RunDialog({}, &name);
    if (result == S_OK && nameSink != nullptr)
        nameSink->Assign(name);
    return result;
}

HRESULT CBlogAccountManager::EditAccount(const QString& name) {
    const qsizetype index = m_store.Find(name);
    if (index < 0)
        return E_INVALIDARG;
    QString saved;
    return RunDialog(m_store.Accounts().at(index), &saved);
}

HRESULT CBlogAccountManager::RunDialog(const Postwick::AccountProperties& account,
                                       QString* savedName) {
    QStringList names;
    for (const Postwick::AccountProperties& existing : m_store.Accounts())
        names.append(existing.value(Postwick::kAccountName));
    QPointer<CBlogAccountDlg> dialog =
        new CBlogAccountDlg(m_network, *m_timeoutMs, names, QApplication::activeWindow());
    const QString oldName = account.value(Postwick::kAccountName);
    if (!account.isEmpty()) {
        QPointer<CPasswordStore> passwords(m_passwords);
        dialog->SetAccount(account, [passwords, oldName](auto deliver) {
            if (passwords)
                passwords->Read(oldName,
                                [deliver](bool, const QString& password) { deliver(password); });
        });
    }
    // The dialog may go with its parent while it runs.
    const int answer = dialog->exec();
    if (!dialog || answer != QDialog::Accepted) {
        delete dialog.data();
        return S_FALSE;
    }
    const Postwick::AccountProperties checked = dialog->Account();
    const QString password = dialog->Password();
    delete dialog.data();
    if (!m_store.Put(oldName, checked))
        return E_FAIL;
    *savedName = checked.value(Postwick::kAccountName);
    if (!oldName.isEmpty() && oldName != *savedName)
        m_passwords->Remove(oldName);
    m_passwords->Write(*savedName, password, [](bool) {});
    return S_OK;
}

HRESULT CBlogAccountManager::RemoveAccount(const QString& name) {
    if (!m_store.Remove(name))
        return E_FAIL;
    m_passwords->Remove(name);
    return S_OK;
}

HRESULT CBlogAccountManager::GetAccountDetails(const QString& name,
                                               Postwick::AccountProperties* properties) {
    const qsizetype index = m_store.Find(name);
    if (properties == nullptr || index < 0)
        return E_INVALIDARG;
    *properties = m_store.Accounts().at(index);
    return S_OK;
}

bool CBlogAccountManager::UsesSecretStore() const {
    return m_passwords->UsesSecretStore();
}

QString CBlogAccountManager::PasswordStorageDescription() const {
    if (m_passwords->UsesSecretStore())
        return u"Passwords are kept in the desktop's secret store."_s;
    return u"No secret store is running on this desktop: passwords are kept in the file "
           u"\"%1\", which only you can read."_s.arg(m_passwords->FallbackFile());
}
