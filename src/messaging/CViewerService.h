#pragma once

#include "messaging/ItemWindowMap.h"

#include "messaging/IViewerService.h"

#include <QMap>
#include <QSet>

#include <atomic>

class CViewerService final : public IViewerService {
public:
    // The singleton with one more reference for the caller, made on the first call.
    static IViewerService* GetInstance();
    // Forgets the singleton, so that the next GetInstance makes a fresh one (a test starts
    // afresh); the old object goes when its last holder releases it.
    static void ResetInstance();

    HRESULT ClearWindows() override;
    HRESULT ForEachWindow(IWindowCallback* callback) override;
    HRESULT GetWindowCount(int* count) override;
    HRESULT FindWindow(const QString& itemId, Platform::WindowHandle* window) override;
    HRESULT SetProgramFolder(const QString& path) override;
    HRESULT SetLanguageFolder(const QString& path) override;
    IWindowService* GetWindowService(const QString& itemId) override;
    HRESULT SetEventTarget(IWindowEventNotification* target) override;
    HRESULT OnDocumentWindowOpened(const QString& itemId, Platform::WindowHandle window) override;
    HRESULT RemoveWindow(const QString& itemId, int flag) override;
    HRESULT ForgetWindow(Platform::WindowHandle window) override;
    HRESULT ActivateDocument(const QString& itemId) override;
    HRESULT OpenDocument(const QString& itemId, const QString& path) override;
    HRESULT SetRequestingViewer(const QString& itemId) override;
    unsigned long Release() override;
    HRESULT PrintDocument(const QString& itemId) override;

private:
    CViewerService() = default;
    ~CViewerService() override = default;

    // Maps and sets are keyed by the case-folded identifier, which makes lookups ignore case.
    QMap<QString, QString> m_launchedDocuments;
    ItemWindowMap m_openWindows;
    QSet<QString> m_waitingItems;
    IWindowEventNotification* m_eventTarget = nullptr;
    std::atomic<unsigned long> m_references{0};
    QString m_programFolder;
    QString m_languageFolder;
    QString m_requestingViewer;
};
