#pragma once

#include "common/Result.h"
#include "platform/IForeignWindows.h"

#include <QString>

class IWindowCallback;
class IWindowEventNotification;
class IWindowService;

// Starts the viewer for documents and keeps track of the viewer windows. Item identifiers
// compare without regard to letter case.
class IViewerService {
public:
    virtual HRESULT ClearWindows() = 0;
    // Apply(window, 0) for every open window; the last result, S_OK when there is none.
    virtual HRESULT ForEachWindow(IWindowCallback* callback) = 0;
    virtual HRESULT GetWindowCount(int* count) = 0;
    // S_OK with the window when the item has one, else S_FALSE.
    virtual HRESULT FindWindow(const QString& itemId, Platform::WindowHandle* window) = 0;
    virtual HRESULT SetProgramFolder(const QString& path) = 0;
    virtual HRESULT SetLanguageFolder(const QString& path) = 0;
    // A new window service (one reference for the caller) for the item's window, or null.
    virtual IWindowService* GetWindowService(const QString& itemId) = 0;
    virtual HRESULT SetEventTarget(IWindowEventNotification* target) = 0;
    virtual HRESULT OnDocumentWindowOpened(const QString& itemId,
                                           Platform::WindowHandle window) = 0;
    virtual HRESULT RemoveWindow(const QString& itemId, int flag) = 0;
    // Forgets the window whatever item it shows: its program has closed it.
    virtual HRESULT ForgetWindow(Platform::WindowHandle window) = 0;
    // Brings the document's window forward, or does so as soon as the window is reported.
    // Answers E_FAIL in both cases.
    virtual HRESULT ActivateDocument(const QString& itemId) = 0;
    // S_OK only when a new viewer process was started; a null path starts an empty viewer.
    virtual HRESULT OpenDocument(const QString& itemId, const QString& path) = 0;
    // The viewer that asked for the next file to be opened in itself; E_FAIL for null.
    virtual HRESULT SetRequestingViewer(const QString& itemId) = 0;
    virtual unsigned long Release() = 0;
    virtual HRESULT PrintDocument(const QString& itemId) = 0;

protected:
    virtual ~IViewerService() = default;
};
