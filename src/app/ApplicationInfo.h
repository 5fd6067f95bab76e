#pragma once

#include "app/IApplicationInfo.h"

#include <atomic>

class ApplicationInfo final : public Brindle::Application::IApplicationInfo {
public:
    // programFolder: where the program file lies; empty for the running executable's folder.
    explicit ApplicationInfo(const QString& programFolder = {});

    unsigned long AddRef() override;
    unsigned long Release() override;
    HRESULT SetLanguage(const QString& code) override;
    HRESULT GetProgramFolder(IUnicodeString* sink) override;
    // The program folder + "/../Languages/<code>/Programs/", made absolute, with the
    // trailing separator.
    HRESULT GetLanguageFolder(IUnicodeString* sink) override;

private:
    ~ApplicationInfo() override = default;

    std::atomic<unsigned long> m_references{0};
    QString m_language = QStringLiteral("EN");
    QString m_programFolder;
};

// A new application info holding its first reference.
ApplicationInfo* CreateApplicationInfo(const QString& programFolder = {});
