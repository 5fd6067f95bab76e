#include "app/ApplicationInfo.h"

#include "platform/AppFolders.h"

#include <QDir>

ApplicationInfo::ApplicationInfo(const QString& programFolder) : m_programFolder(programFolder) {}

unsigned long ApplicationInfo::AddRef() {
    return ++m_references;
}

unsigned long ApplicationInfo::Release() {
    if (--m_references == 0)
        delete this;
    return 0;
}

HRESULT ApplicationInfo::SetLanguage(const QString& code) {
    m_language = code;
    return S_OK;
}

HRESULT ApplicationInfo::GetProgramFolder(IUnicodeString* sink) {
    if (sink == nullptr)
        return E_INVALIDARG;
    return sink->Assign(m_programFolder.isEmpty() ? Platform::ProgramFolder() : m_programFolder);
}

HRESULT ApplicationInfo::GetLanguageFolder(IUnicodeString* sink) {
    if (sink == nullptr)
        return E_INVALIDARG;
    QString programFolder;
    UnicodeStringPtr programSink(&programFolder);
    if (const HRESULT hr = GetProgramFolder(&programSink); FAILED(hr))
        return hr;
    const QString folder =
        QDir::cleanPath(QDir(programFolder)
                            .absoluteFilePath(QStringLiteral("../Languages/") + m_language +
                                              QStringLiteral("/Programs")));
    return sink->Assign(folder + u'/');
}

ApplicationInfo* CreateApplicationInfo(const QString& programFolder) {
    auto* info = new ApplicationInfo(programFolder);
    info->AddRef();
    return info;
}
