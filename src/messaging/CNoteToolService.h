#pragma once

#include "messaging/ItemWindowMap.h"

#include "messaging/INoteToolService.h"

#include <QMap>
#include <QSet>

#include <atomic>

class CNoteToolService final : public INoteToolService {
public:
    // The file in the language folder that holds the note tool's strings, one "id=text" a line.
    static const QString LanguageFileName;

    // The singleton with one more reference for the caller, made on the first call.
    static INoteToolService* GetInstance();
    // Forgets the singleton, so that the next GetInstance makes a fresh one (a test starts
    // afresh); the old object goes when its last holder releases it.
    static void ResetInstance();

    HRESULT ClearWindows() override;
    HRESULT SetProgramFolder(const QString& path) override;
    HRESULT SetLanguageFolder(const QString& path) override;
    HRESULT ForEachWindow(IWindowCallback* callback) override;
    HRESULT GetWindowCount(int* count) override;
    HRESULT FindWindow(const QString& itemId, Platform::WindowHandle* window) override;
    IWindowService* GetWindowService(const QString& itemId) override;
    HRESULT SetEventTarget(IWindowEventNotification* target) override;
    HRESULT OnNoteWindowOpened(const QString& itemId, Platform::WindowHandle window) override;
    HRESULT RemoveWindow(const QString& itemId, int flag) override;
    HRESULT ForgetWindow(Platform::WindowHandle window) override;
    unsigned long Release() override;
    HRESULT GetDefaultNoteTitle(IUnicodeString* sink) override;
    HRESULT GetNoteFileName(IUnicodeString* sink) override;
    HRESULT GetNoteFolder(IDataStoreHost* host, const QString& itemId,
                          IUnicodeString* sink) override;
    HRESULT OpenNote(const QString& notePath, const QString& propertyText) override;
    HRESULT UpdateNote(const QString& itemId, DataExchange::IProperties* properties) override;
    HRESULT ActivateNote(const QString& itemId) override;
    HRESULT PrintNote(const QString& itemId) override;

private:
    CNoteToolService() = default;
    ~CNoteToolService() override = default;

    // Keyed by the case-folded identifier, which makes lookups ignore case.
    ItemWindowMap m_openWindows;
    IWindowEventNotification* m_eventTarget = nullptr;
    QSet<QString> m_waitingItems;
    std::atomic<unsigned long> m_references{0};
    QString m_programFolder;
    QString m_languageFolder;
};
