#pragma once

#include "libs/toolwell/IMailService.h"

#include <QStringList>

// Mail through the desktop's "xdg-email", which opens the user's mail program with a new mail.
// The program is looked up on PATH at each call and started detached with an argument list.
class CMailService final : public IMailService {
public:
    bool CanSendMail() override;
    HRESULT SendFileByMail(const QString& path, int flags) override;
    HRESULT SendFileByMailWithSubject(const QString& path, const QString& subject,
                                      int flags) override;
    HRESULT TellAFriend() override;

private:
    // Attaches the file when it is an existing regular file; E_FAIL (nothing started) else.
    static HRESULT SendFile(const QString& path, const QString& subject);
    static HRESULT Compose(const QStringList& arguments);
};
