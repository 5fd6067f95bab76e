#include "libs/postwick/CPostwick.h"

#include "libs/postwick/CBlogAccountManager.h"
#include "libs/postwick/CBlogPost.h"
#include "libs/postwick/CPasswordStore.h"
#include "libs/postwick/CXmlRpcCall.h"

#include <QDir>
#include <QNetworkAccessManager>

CPostwick::CPostwick()
    : m_timeoutMs(CXmlRpcCall::kDefaultTimeoutMs), m_network(new QNetworkAccessManager(this)) {}

CPostwick::~CPostwick() = default;

unsigned long CPostwick::Release() {
    delete this;
    return 0;
}

HRESULT CPostwick::SetWorkingFolder(const QString& folder) {
    if (folder.isEmpty() || !QDir().mkpath(folder))
        return E_INVALIDARG;
    const QDir dir(folder);
    m_accounts.reset();
    delete m_passwords;
    m_passwords = new CPasswordStore(dir.filePath(kPasswordsFile), this);
    m_accounts = std::make_unique<CBlogAccountManager>(dir.filePath(kAccountsFile), m_passwords,
                                                       m_network, &m_timeoutMs);
    return S_OK;
}

IBlogAccountManager* CPostwick::GetAccountManager() {
    return m_accounts.get();
}

HRESULT CPostwick::PostNote(const QString& title, const QString& notePath,
                            std::function<void(const Postwick::PostResult&)> done) {
    if (!m_accounts || title.isEmpty())
        return E_INVALIDARG;
    Postwick::AccountProperties account;
    if (m_accounts->GetDefaultAccount(&account) != S_OK)
        return S_FALSE;
    CNoteForBlog note;
    if (!note.Load(notePath))
        return E_INVALIDARG;
    auto* post = new CBlogPost(account, title, note, m_passwords, m_network, m_timeoutMs,
                               std::move(done), this);
    post->Start();
    return S_OK;
}

IPostwick* GetPostwickInterface() {
    return new CPostwick;
}
