#pragma once

#include "common/Result.h"

#include <QString>

// Hands files to the user's mail program as attachments of a new mail that the user finishes
// and sends. The object stays the library's: callers never release it.
class IMailService {
public:
    // True when a mail program can be reached; the mail commands are disabled otherwise.
    virtual bool CanSendMail() = 0;
    // A new mail with the file attached. `flags` is 1 from every caller: the user sees the
    // mail before it goes, which is the only way the mail program works here.
    virtual HRESULT SendFileByMail(const QString& path, int flags) = 0;
    // The same, with the subject line filled in.
    virtual HRESULT SendFileByMailWithSubject(const QString& path, const QString& subject,
                                              int flags) = 0;
    // A new mail recommending the product, without an attachment.
    virtual HRESULT TellAFriend() = 0;

protected:
    virtual ~IMailService() = default;
};

IMailService* GetMailService();
