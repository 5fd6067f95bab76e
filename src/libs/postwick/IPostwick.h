#pragma once

#include "common/IUnicodeString.h"
#include "common/Result.h"

#include <QMap>
#include <QString>

#include <functional>

// The blogging library: blog accounts and posting notes to them. Blogs are reached through
// their MetaWeblog XML-RPC interface.
namespace Postwick {

using AccountProperties = QMap<QString, QString>;

// Account properties that every account carries.
inline const QString kAccountName = QStringLiteral("blogAccountName");
inline const QString kAccountBlogHost = QStringLiteral("blogAccountBlogHost");
inline const QString kAccountXmlRpcUrl = QStringLiteral("blogAccountXmlRpcUrl");
inline const QString kAccountUser = QStringLiteral("blogAccountUser");
inline const QString kAccountBlogId = QStringLiteral("blogAccountBlogId");

// How a post ended: the text says where the post is, or why it failed (the server's own
// words for a fault).
struct PostResult {
    bool posted = false;
    QString message;
    QString link;
};

} // namespace Postwick

// The accounts, as the Blogging settings page manages them.
class IBlogAccountManager {
public:
    virtual ~IBlogAccountManager() = default;
    // The accounts in stored order: 0 while an account was delivered, 1 past the last.
    virtual int GetFirstAccount(Postwick::AccountProperties* properties) = 0;
    virtual int GetNextAccount(Postwick::AccountProperties* properties) = 0;
    // S_OK with the default account's properties, S_FALSE when there is none.
    virtual HRESULT GetDefaultAccount(Postwick::AccountProperties* properties) = 0;
    virtual bool IsDefaultAccount(const QString& name) = 0;
    virtual HRESULT SetDefaultAccount(const QString& name) = 0;
    // showDialog 1 asks the user for the account and checks it with the blog before it is
    // kept; the new account's name goes to nameSink. S_FALSE when the user cancelled.
    virtual HRESULT AddAccount(int showDialog, IUnicodeString* nameSink) = 0;
    virtual HRESULT EditAccount(const QString& name) = 0;
    virtual HRESULT RemoveAccount(const QString& name) = 0;
    virtual HRESULT GetAccountDetails(const QString& name,
                                      Postwick::AccountProperties* properties) = 0;
    // Whether passwords go to the desktop's secret store, and in words where they are kept.
    virtual bool UsesSecretStore() const = 0;
    virtual QString PasswordStorageDescription() const = 0;
};

class IPostwick {
public:
    // The folder, with a trailing separator, where the library keeps its files.
    virtual HRESULT SetWorkingFolder(const QString& folder) = 0;
    // Owned by the library; null before a working folder was given.
    virtual IBlogAccountManager* GetAccountManager() = 0;
    // Starts posting the note file (its body, its pictures first) to the default account and
    // returns at once; done runs when the post ended, unless the library went first (done is
    // then destroyed unrun). S_OK when started, S_FALSE without a default account (done is
    // not kept), E_INVALIDARG without a title or a readable note.
    virtual HRESULT PostNote(const QString& title, const QString& notePath,
                             std::function<void(const Postwick::PostResult&)> done) = 0;
    virtual unsigned long Release() = 0;

protected:
    virtual ~IPostwick() = default;
};

// A new blogging interface, released by the caller.
IPostwick* GetPostwickInterface();
