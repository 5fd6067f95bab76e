#pragma once

#include "app/ApplicationInfo.h"
#include "app/CNavigatorCmdLineInfo.h"
#include "app/CNavigatorStartActions.h"
#include "app/SingleInstance.h"
#include "catalog/IDataStoreService.h"
#include "common/ReleasePtr.h"
#include "libs/toolwell/IDataStoreHost.h"
#include "libs/toolwell/IMessageBroker.h"
#include "messaging/CNavInstanceMgr.h"
#include "messaging/INavigatorService.h"
#include "ui/CNavigatorWindows.h"
#include "ui/WMainFrame.h"

#include <QCoreApplication>
#include <QObject>
#include <QPointer>
#include <QStringList>

#include <memory>

class IdlePass;
class TerminationSignals;

// The application object: start-up, the idle pass and shut-down of the navigator.
class CNavigatorApp final : public QObject, public INavigatorService {
    Q_OBJECT
public:
    // arguments: the command line, the program first.
    explicit CNavigatorApp(QStringList arguments = QCoreApplication::arguments());
    ~CNavigatorApp() override;

    // Starts up, runs the event loop and shuts down; answers the process exit code.
    int Run();

    bool InitInstance();
    bool OnIdle(int count);
    int ExitInstance();

    HRESULT CreateItem(DataExchange::IProperties* properties, IUnicodeString* itemIdSink) override;
    HRESULT UpdateItemProperties(const QString& itemId,
                                 DataExchange::IProperties* properties) override;
    HRESULT SaveDocumentToNotebook(const QString& itemId) override;
    HRESULT ForEachWindow(IWindowCallback* callback) override;

    // The "Activity Center" command.
    void OnActivityCenter();

    WMainFrame* MainWindow() const { return m_mainWindow; }
    Brindle::Application::IApplicationInfo* ApplicationInfoObject() const {
        return m_applicationInfo.get();
    }

private:
    bool StartUp();
    void PlaceMainWindow();
    void ConnectMessageBroker();
    void RunFirstIdleWork();
    // Writes the catalog; a failure is told to the user and the save tried again later.
    void SaveCatalog();
    void ReportSettingsSave(bool saved);

    QStringList m_arguments;
    std::unique_ptr<SingleInstance> m_singleInstance;
    CNavigatorCmdLineInfo m_commandLineInfo;
    CNavigatorStartActions m_startActions;
    ReleasePtr<Brindle::Application::IApplicationInfo> m_applicationInfo;
    ReleasePtr<IDataStoreHost> m_dataStoreHost;
    IDataStoreService* m_dataStoreService = nullptr; // saved last, then Shutdown(0)
    QPointer<WMainFrame> m_mainWindow;
    std::unique_ptr<IdlePass> m_idlePass;
    std::unique_ptr<TerminationSignals> m_terminationSignals;
    int m_exitCode = 0;
    CNavInstanceMgr m_instanceManager{this};
    ReleasePtr<IMessageBroker> m_messageBroker;
    // The navigator's own window among the windows that requests act on; it relies on the
    // broker's bus side underneath, so it goes before the broker.
    std::unique_ptr<CNavigatorWindows> m_windows;
    bool m_firstIdle = true;
    // The last catalog save failed: the next idle pass tries again.
    bool m_catalogUnsaved = false;
};
