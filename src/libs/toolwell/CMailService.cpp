#include "libs/toolwell/CMailService.h"

#include "platform/IProcessLauncher.h"

#include <QFileInfo>
#include <QStandardPaths>

namespace {

QString MailProgram() {
    return QStandardPaths::findExecutable(QStringLiteral("xdg-email"));
}

} // namespace

bool CMailService::CanSendMail() {
    return !MailProgram().isEmpty();
}

HRESULT CMailService::SendFileByMail(const QString& path, int) {
    return SendFile(path, {});
}

HRESULT CMailService::SendFileByMailWithSubject(const QString& path, const QString& subject, int) {
    return SendFile(path, subject);
}

HRESULT CMailService::TellAFriend() {
    return Compose({QStringLiteral("--subject"), QStringLiteral("Try Quillmark Ambrel"),
                    QStringLiteral("--body"),
                    QStringLiteral("Hello,\n\nI keep my notes in Quillmark Ambrel: a small "
                                   "window beside my work that holds my notes, pictures and the "
                                   "documents I use, in one tree. I think you would like it "
                                   "too.\n")});
}

HRESULT CMailService::SendFile(const QString& path, const QString& subject) {
    if (path.isEmpty())
        return E_FAIL;
    const QFileInfo file(path);
    if (!file.isFile())
        return E_FAIL;
    QStringList arguments;
    if (!subject.isEmpty())
        arguments << QStringLiteral("--subject") << subject;
    // An absolute path can never be taken for a switch.
    arguments << QStringLiteral("--attach") << file.absoluteFilePath();
    return Compose(arguments);
}

HRESULT CMailService::Compose(const QStringList& arguments) {
    const QString program = MailProgram();
    if (program.isEmpty())
        return E_FAIL;
    // Qt hands arguments over in UTF-8 whatever the locale says.
    const QStringList all = QStringList{QStringLiteral("--utf8")} + arguments;
    return Platform::ProcessLauncher().StartDetached(program, all) ? S_OK : E_FAIL;
}

IMailService* GetMailService() {
    static CMailService service;
    return &service;
}
