#pragma once

#include "app/IApplicationInfo.h"
#include "libs/toolwell/IDataStoreHost.h"
#include "settings/Bool.h"
#include "settings/NavigatorSettingsRecord.h"

#include <QString>

#include <functional>
#include <memory>

class ISettingsWindow;
class INoteToolService;
class IViewerService;

// The navigator's options, one object per process, kept in "NavSettings.dat" in the
// application data folder: the pipe-delimited property text in UTF-16 little-endian, without
// byte-order mark or terminator. Every setter marks the settings dirty; the idle pass writes
// them.
class NavigatorSettings {
public:
    // The single object, made with the defaults on first use and destroyed at process exit.
    static NavigatorSettings* Instance();
    // Destroys the single object now; the next Instance() makes a fresh one.
    static void DestroyInstance();

    ~NavigatorSettings();
    NavigatorSettings(const NavigatorSettings&) = delete;
    NavigatorSettings& operator=(const NavigatorSettings&) = delete;

    // "<application data folder>/NavSettings.dat".
    static QString SettingsFilePath();

    // True when the file was read and applied; a missing, unreadable or truncated file leaves
    // every option as it was.
    bool Load();
    // True when the file was written. It is replaced whole or not at all.
    bool Save();
    // Why the last Save failed; empty when it worked.
    const QString& SaveError() const { return m_saveError; }
    // Saves when dirty; answers false when that save failed. The flag is cleared only by a save
    // that worked, so a change is never dropped: a failing disk is tried again at the next call.
    bool SaveIfDirty();
    void MarkDirty() { m_dirty = true; }
    bool IsDirty() const { return m_dirty; }

    // The main window, to which window options are applied at once; null when there is none.
    // The window hands itself over once shown and takes itself back before it goes.
    void SetFrame(ISettingsWindow* frame) { m_frame = frame; }
    ISettingsWindow* GetFrame() const { return m_frame; }

    // Counted references handed over at start-up; each setter takes its own reference and
    // releases the one it held before.
    void SetDataStoreHost(IDataStoreHost* host);
    IDataStoreHost* GetDataStoreHost() const { return m_dataStoreHost; }
    void SetApplicationInfo(Brindle::Application::IApplicationInfo* info);
    Brindle::Application::IApplicationInfo* GetApplicationInfo() const { return m_applicationInfo; }

    // The viewer and note tool services, through which the program's windows are reached.
    IViewerService* GetViewerService() const { return m_viewerService; }
    INoteToolService* GetNoteToolService() const { return m_noteToolService; }

    // Called after a filter option changed, so that the tree can be refilled.
    void SetFilterChangedHandler(std::function<void()> handler) {
        m_filterChanged = std::move(handler);
    }

    // The record, for the settings dialog; whoever writes to it calls MarkDirty.
    NavigatorSettingsRecord* GetRecord() const { return m_record.get(); }

    WindowRect GetApplicationPosition() const;
    void SetApplicationPosition(const WindowRect& position);
    int GetMaxLinkedDocuments() const;
    void SetMaxLinkedDocuments(int count);
    bool GetCleanDeletedOnClose() const;
    void SetCleanDeletedOnClose(bool clean);
    bool GetLaunchAppOnStart() const;
    void SetLaunchAppOnStart(bool launch);

    // The five type filters form one choice: choosing one clears the other four; un-choosing
    // one changes nothing.
    bool GetShowNotes() const;
    void SetShowNotes(bool show);
    bool GetShowQmd() const;
    void SetShowQmd(bool show);
    bool GetShowDoc() const;
    void SetShowDoc(bool show);
    bool GetShowPdf() const;
    void SetShowPdf(bool show);
    bool GetShowAllTypes() const;
    void SetShowAllTypes(bool show);
    bool GetShowOpenedItemsOnly() const;
    void SetShowOpenedItemsOnly(bool show);

    QString GetLastSelectedItemId() const;
    void SetLastSelectedItemId(const QString& itemId);
    int GetDefaultFontSize() const;
    void SetDefaultFontSize(int size);
    QString GetDefaultFont() const;
    void SetDefaultFont(const QString& font);
    // Three decimal numbers, red, green and blue: "255,255,255".
    QString GetDefaultBackgroundColor() const;
    void SetDefaultBackgroundColor(const QString& color);
    QString GetDefaultBackgroundImage() const;
    void SetDefaultBackgroundImage(const QString& path);

    // Only ever true where the utility engine offers the message centre.
    bool GetShowMessageCentre() const;
    void SetShowMessageCentre(bool show);
    bool GetKeepOnTop() const { return m_keepOnTop.Value(); }
    void SetKeepOnTop(bool onTop);
    bool GetShowFrame() const { return m_showFrame.Value(); }
    void SetShowFrame(bool show);

private:
    NavigatorSettings();

    void ChooseTypeFilter(Settings::Bool NavigatorSettingsRecord::*filter, bool show);
    void FilterChanged();
    void FillServices();

    std::unique_ptr<NavigatorSettingsRecord> m_record;
    bool m_dirty = false;
    QString m_saveError;
    ISettingsWindow* m_frame = nullptr;
    Settings::Bool m_showMessageCentre{QStringLiteral("showmessagecentre"), true};
    Settings::Bool m_keepOnTop{QStringLiteral("keepontop"), false};
    Settings::Bool m_showFrame{QStringLiteral("showframe"), true};
    IDataStoreHost* m_dataStoreHost = nullptr;
    Brindle::Application::IApplicationInfo* m_applicationInfo = nullptr;
    std::function<void()> m_filterChanged;
    IViewerService* m_viewerService = nullptr;
    INoteToolService* m_noteToolService = nullptr;
};
