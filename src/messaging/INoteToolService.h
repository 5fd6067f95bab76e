#pragma once

#include "common/IUnicodeString.h"
#include "platform/IForeignWindows.h"

class IDataStoreHost;
class IWindowCallback;
class IWindowEventNotification;
class IWindowService;

namespace DataExchange {
class IProperties;
}

// Starts the note tool for notes and keeps track of the note windows. Item identifiers
// compare without regard to letter case.
class INoteToolService {
public:
    virtual HRESULT ClearWindows() = 0;
    virtual HRESULT SetProgramFolder(const QString& path) = 0;
    virtual HRESULT SetLanguageFolder(const QString& path) = 0;
    // Apply(window, 0) for every open note window; the last result, S_OK when there is none.
    virtual HRESULT ForEachWindow(IWindowCallback* callback) = 0;
    virtual HRESULT GetWindowCount(int* count) = 0;
    // S_OK with the window when the note has one, else S_FALSE.
    virtual HRESULT FindWindow(const QString& itemId, Platform::WindowHandle* window) = 0;
    // A new window service (one reference for the caller) for the note's window, or null.
    virtual IWindowService* GetWindowService(const QString& itemId) = 0;
    virtual HRESULT SetEventTarget(IWindowEventNotification* target) = 0;
    virtual HRESULT OnNoteWindowOpened(const QString& itemId, Platform::WindowHandle window) = 0;
    virtual HRESULT RemoveWindow(const QString& itemId, int flag) = 0;
    // Forgets the window whatever item it shows: its program has closed it.
    virtual HRESULT ForgetWindow(Platform::WindowHandle window) = 0;
    virtual unsigned long Release() = 0;
    // String 100 of the note tool's language file; E_FAIL without sink, file or string.
    virtual HRESULT GetDefaultNoteTitle(IUnicodeString* sink) = 0;
    // "note.htm"; E_INVALIDARG without sink.
    virtual HRESULT GetNoteFileName(IUnicodeString* sink) = 0;
    // The note's folder with a trailing separator; E_INVALIDARG without sink or for an
    // identifier that is not of the catalog's form.
    virtual HRESULT GetNoteFolder(IDataStoreHost* host, const QString& itemId,
                                  IUnicodeString* sink) = 0;
    // Starts the note tool on a note file, with the note's properties as pipe-delimited text;
    // S_OK when a process was started.
    virtual HRESULT OpenNote(const QString& notePath, const QString& propertyText) = 0;
    virtual HRESULT UpdateNote(const QString& itemId, DataExchange::IProperties* properties) = 0;
    // Brings the note's window forward, or does so as soon as the window is reported.
    virtual HRESULT ActivateNote(const QString& itemId) = 0;
    virtual HRESULT PrintNote(const QString& itemId) = 0;

protected:
    virtual ~INoteToolService() = default;
};
