#include "libs/toolwell/CHelpService.h"

#include "platform/AppFolders.h"
#include "platform/IMessageBox.h"
#include "platform/Registry.h"

#include <QDesktopServices>
#include <QDir>
#include <QFileInfo>

CHelpService::CHelpService(const QString& programFolder) : m_programFolder(programFolder) {}

QString CHelpService::UserGuidePath() const {
    const QString programFolder =
        m_programFolder.isEmpty() ? Platform::ProgramFolder() : m_programFolder;
    return QDir::cleanPath(programFolder + QStringLiteral("/../help/index.html"));
}

HRESULT CHelpService::ShowHelpTopics() {
    return OpenUserGuide();
}

HRESULT CHelpService::ShowUserGuide() {
    return OpenUserGuide();
}

int CHelpService::HasUserGuide() {
    return QFileInfo(UserGuidePath()).isFile() ? 1 : 0;
}

HRESULT CHelpService::OpenUserGuide() {
    if (HasUserGuide() == 0)
        return E_FAIL;
    return QDesktopServices::openUrl(QUrl::fromLocalFile(UserGuidePath())) ? S_OK : E_FAIL;
}

QUrl CHelpService::Website() {
    const QString text =
        Platform::Registry::MachineValue(QStringLiteral("SOFTWARE\\Brindle\\Quillmark Ambrel"),
                                         QStringLiteral("Website"))
            .toString()
            .trimmed();
    const QUrl url(text, QUrl::StrictMode);
    // Anything else (a file, a program's own scheme) is not a website to browse.
    const bool web = url.scheme() == u"http" || url.scheme() == u"https";
    return url.isValid() && web && !url.host().isEmpty() ? url : QUrl();
}

bool CHelpService::HasWebsite() {
    return !Website().isEmpty();
}

HRESULT CHelpService::OpenWebsite() {
    const QUrl url = Website();
    if (url.isEmpty())
        return E_FAIL;
    return QDesktopServices::openUrl(url) ? S_OK : E_FAIL;
}

HRESULT CHelpService::ShowAbout() {
    const QString text =
        QStringLiteral("Quillmark Ambrel\nVersion " AMBREL_VERSION "\n\n"
                       "Copyright \u00a9 Brindle. All rights reserved.\n\n"
                       "This program is licensed to you, not sold, for use by one person on the "
                       "computers that person uses. You may not pass it on, rent it out or "
                       "change it. It comes as it is, without any warranty.");
    Platform::MessageBox().Show(text, QStringLiteral("About Quillmark Ambrel"),
                                Platform::MessageBoxStyle::Ok |
                                    Platform::MessageBoxStyle::IconInformation);
    return S_OK;
}

IHelpService* GetHelpService() {
    static CHelpService service;
    return &service;
}
