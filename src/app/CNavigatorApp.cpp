#include "app/CNavigatorApp.h"

#include "app/ForwardedCommandLine.h"
#include "app/IdlePass.h"
#include "app/SystemIntegration.h"
#include "dataexchange/IProperties.h"
#include "libs/lustre/CVisualStyleManager.h"
#include "libs/sheen/ThemeUtilities.h"
#include "libs/toolwell/IHarborUtils.h"
#include "libs/toolwell/ISnapshotService.h"
#include "libs/toolwell/StartupBubble.h"
#include "messaging/ActivityCenter.h"
#include "messaging/IWindowCallback.h"
#include "navigator/WNavDS.h"
#include "platform/SaveFailureNotice.h"
#include "settings/CNavigatorBloggingSettingsDlg.h"
#include "settings/CNavigatorSettingsDlg.h"
#include "settings/NavigatorSettings.h"
#include "ui/ModalDialog.h"
#include "ui/QtMessageBox.h"
#include "ui/QtWaitCursor.h"
#include "ui/TerminationSignals.h"
#include "ui/WMainFrame.h"

#include <QApplication>
#include <QDeadlineTimer>

#include <cstdio>

namespace {

constexpr int kDefaultWidth = 280;
constexpr int kDefaultHeight = 650;
// The most time one idle pass gives to queued messages before the window may answer again.
constexpr int kMessageSliceMs = 50;

QtMessageBox g_messageBox;
QtWaitCursor g_waitCursor;

CNavigatorApp* g_application = nullptr;

} // namespace

extern "C" __attribute__((visibility("default"))) INavigatorService*
GetNavigatorServiceInterface() {
    return g_application;
}

CNavigatorApp::CNavigatorApp(QStringList arguments) : m_arguments(std::move(arguments)) {
    g_application = this;
}

CNavigatorApp::~CNavigatorApp() {
    if (g_application == this)
        g_application = nullptr;
    Platform::SetMessageBox(nullptr);
    Platform::SetWaitCursor(nullptr);
}

int CNavigatorApp::Run() {
    if (!InitInstance()) {
        delete m_mainWindow.data();
        return ExitInstance();
    }
    QApplication::setQuitOnLastWindowClosed(false); // the idle pass ends the loop
    m_idlePass = std::make_unique<IdlePass>([this](int count) { return OnIdle(count); });
    m_idlePass->Start();
    m_exitCode = QApplication::exec();
    m_idlePass.reset();
    return ExitInstance();
}

bool CNavigatorApp::InitInstance() {
    const bool started = StartUp();
    // The start-up lock is held from the single-instance check to here, whatever the outcome.
    if (m_singleInstance)
        m_singleInstance->EndStartup();
    return started;
}

bool CNavigatorApp::StartUp() {
    Platform::SetMessageBox(&g_messageBox);
    Platform::SetWaitCursor(&g_waitCursor);

    const QStringList arguments = MakeFileArgumentsAbsolute(m_arguments);
    m_singleInstance = std::make_unique<SingleInstance>();
    const SingleInstance::Outcome outcome = m_singleInstance->Start(arguments);
    if (outcome != SingleInstance::Outcome::Running) {
        // A second start ends here: the running navigator has had its command line, or could
        // not be reached, which the user who typed it must hear about.
        if (outcome != SingleInstance::Outcome::HandedOver) {
            std::fputs(qPrintable(SingleInstance::Describe(outcome) + u'\n'), stderr);
            m_exitCode = 1;
        }
        return false;
    }
    ParseCommandLine(m_commandLineInfo, arguments);

    m_applicationInfo.reset(CreateApplicationInfo());
    if (!m_applicationInfo)
        return false;

    NavigatorSettings* settings = NavigatorSettings::Instance();
    settings->SetApplicationInfo(m_applicationInfo.get());
    settings->Load();

    IHarborUtils* utils = GetHarborUtilsInterface();
    if (utils == nullptr || !utils->IsReady() || !utils->IsEnabled())
        return false;
    utils->SetShuttingDown(false);
    if (m_commandLineInfo.Qmo()) {
        utils->RunQmoStartAction();
        m_commandLineInfo.ClearQmo();
    }

    m_dataStoreHost.reset(GetDataStoreHost());
    if (!m_dataStoreHost)
        return false;
    // Without a catalog the navigator still starts; it just has nothing to show.
    m_dataStoreService = CreateDataStoreService(m_dataStoreHost.get());
    WNavDS* navigator = WNavDS::Instance();
    navigator->SetDataStoreHost(m_dataStoreHost.get());
    navigator->Initialize();
    // While the navigator waits for the other programs' windows to close, the idle work goes on.
    navigator->SetIdlePassHook([this] { OnIdle(0); });
    // A filter chosen anywhere refills the tree at the next idle pass.
    settings->SetFilterChangedHandler([] { WNavDS::Instance()->SetChanged(true); });
    settings->SetDataStoreHost(m_dataStoreHost.get());
    SetSnapshotNoteHandler(
        [](const QString& path) { return WNavDS::Instance()->AddNoteFromFile(path, nullptr); });

    // The look comes first, so the window is made in it.
    Lustre::CVisualStyleManager* styles = CreateVisualStyleManager();
    if (styles == nullptr || FAILED(styles->Register(QString::fromUtf16(Lustre::kVisualStylesKey))))
        return false;
    InitializeThemeUtilities();

    m_mainWindow = new WMainFrame;
    m_mainWindow->setAttribute(Qt::WA_DeleteOnClose);
    PlaceMainWindow();
    m_mainWindow->show();

    // A start from then on waits for this navigator to end instead of handing its command line
    // to one that is going away.
    connect(m_mainWindow, &WMainFrame::Closing, this, [this] {
        m_singleInstance->Withdraw();
        // A message box could no longer open: what fails from here on is written out.
        Platform::SaveFailureNotice::Instance().SetSilent(true);
    });
    m_singleInstance->Publish([this] {
        if (m_mainWindow) {
            m_mainWindow->showNormal();
            m_mainWindow->raise();
            m_mainWindow->activateWindow();
        }
    });

    m_mainWindow->SetTrackPosition(true);
    // The blogging side plugs into the settings dialog and the data source here, so neither of
    // them depends on the blogging library.
    CNavigatorSettingsDlg::SetBloggingPageFactory(&CreateBloggingSettingsPage);
    navigator->SetOpenBloggingSettingsHook(
        [this] { OpenSettingsDialog(m_mainWindow, CNavigatorSettingsDlg::BloggingPage); });
    settings->SetFrame(m_mainWindow);

    ConnectMessageBroker();
    m_windows = std::make_unique<CNavigatorWindows>(m_mainWindow, &Platform::ForeignWindows());
    Platform::SetForeignWindows(m_windows.get());

    // The window options are applied through their settings, which also shows them at once.
    settings->SetKeepOnTop(settings->GetKeepOnTop());
    settings->SetShowMessageCentre(settings->GetShowMessageCentre());
    settings->SetShowFrame(settings->GetShowFrame());

    QString programFolder;
    UnicodeStringPtr programFolderSink(&programFolder);
    m_applicationInfo->GetProgramFolder(&programFolderSink);
    RegisterBrowserMenuEntry(programFolder);

    if (utils->IsStartupBubbleEnabled())
        m_mainWindow->StartBubbleTimer(StartupBubble::Delay());

    m_terminationSignals = std::make_unique<TerminationSignals>();
    connect(m_terminationSignals.get(), &TerminationSignals::Received, this, [this] {
        // Closing the window as a user would lets the usual shut-down run.
        if (m_mainWindow)
            m_mainWindow->close();
        else
            QCoreApplication::exit(0);
    });
    return true;
}

void CNavigatorApp::PlaceMainWindow() {
    // The stored place wins; a stored width or height of 0 keeps the default.
    const WindowRect stored = NavigatorSettings::Instance()->GetApplicationPosition();
    const int width = stored.Width() != 0 ? stored.Width() : kDefaultWidth;
    const int height = stored.Height() != 0 ? stored.Height() : kDefaultHeight;
    m_mainWindow->PlaceFrame(QRect(stored.left, stored.top, width, height));
}

bool CNavigatorApp::OnIdle(int count) {
    // The tree's rebuild below clears the change flag, so a failed save is remembered here and
    // tried again at every pass until it works.
    if ((WNavDS::Instance()->IsChanged() || m_catalogUnsaved) && m_dataStoreService != nullptr)
        SaveCatalog();
    if (!m_mainWindow) {
        QCoreApplication::exit(0);
        return false;
    }
    m_mainWindow->OnIdleWork();
    ReportSettingsSave(NavigatorSettings::Instance()->SaveIfDirty());
    // A burst of messages is handled a slice per pass, so the window answers in between.
    const bool messagesLeft = m_instanceManager.ProcessQueue(QDeadlineTimer(kMessageSliceMs));
    if (m_firstIdle)
        RunFirstIdleWork();
    // The idle pass only runs once the queue is empty, so the window has been shown and
    // painted before the start actions run, this start's own before those handed over by later
    // starts; running them clears them.
    RunStartActions(m_commandLineInfo, m_startActions);
    m_singleInstance->RunHandedOver(m_startActions);
    return count < 1 || messagesLeft;
}

int CNavigatorApp::ExitInstance() {
    // Nothing may wait for an answer while the program ends.
    const ModalDialog::ClosingAll noMoreDialogs;
    Platform::SaveFailureNotice::Instance().SetSilent(true);
    // The window's close withdraws the navigator too; without a window it happens here.
    if (m_singleInstance)
        m_singleInstance->Withdraw();
    m_terminationSignals.reset();
    m_instanceManager.ProcessQueue();
    NavigatorSettings* settings = NavigatorSettings::Instance();
    if (settings->GetCleanDeletedOnClose())
        WNavDS::Instance()->EmptyDeletedItems();
    if (settings->IsDirty())
        ReportSettingsSave(settings->Save());
    if (m_windows) {
        Platform::SetForeignWindows(nullptr);
        m_windows.reset();
    }
    if (m_messageBroker) {
        m_messageBroker->Disconnect();
        m_messageBroker.reset();
    }
    SetSnapshotNoteHandler({});
    CNavigatorSettingsDlg::SetBloggingPageFactory({});
    WNavDS::DestroyInstance();
    if (m_dataStoreService != nullptr) {
        SaveCatalog();
        m_dataStoreService->Shutdown(0);
        m_dataStoreService = nullptr;
    }
    m_dataStoreHost.reset();
    ReleaseHarborUtilsInterface();
    // Made or not, the look is given up.
    ShutdownThemeUtilities();
    DeleteVisualStyleManager();
    m_applicationInfo.reset();
    m_singleInstance.reset();
    return m_exitCode;
}

void CNavigatorApp::SaveCatalog() {
    m_catalogUnsaved = m_dataStoreService->Save() != S_OK;
    QString path;
    QString reason;
    UnicodeStringPtr pathSink(&path);
    UnicodeStringPtr reasonSink(&reason);
    Platform::SaveFailureNotice& notice = Platform::SaveFailureNotice::Instance();
    if (m_dataStoreService->GetSaveError(&pathSink, &reasonSink) == S_OK)
        notice.Failed(Platform::SavedFile::Catalog, path, reason);
    else if (!m_catalogUnsaved)
        notice.Saved(Platform::SavedFile::Catalog);
}

void CNavigatorApp::ReportSettingsSave(bool saved) {
    Platform::SaveFailureNotice& notice = Platform::SaveFailureNotice::Instance();
    if (saved)
        notice.Saved(Platform::SavedFile::Settings);
    else
        notice.Failed(Platform::SavedFile::Settings, NavigatorSettings::SettingsFilePath(),
                      NavigatorSettings::Instance()->SaveError());
}

void CNavigatorApp::ConnectMessageBroker() {
    m_messageBroker.reset(GetMessageBroker());
    if (!m_messageBroker) {
        std::fputs("No session bus: other programs cannot reach the navigator.\n", stderr);
        return;
    }
    if (m_messageBroker->RegisterService(QStringLiteral("AmbrelService"), &m_instanceManager) !=
        S_OK) {
        std::fputs("The navigator's bus name is taken: other programs cannot reach it.\n", stderr);
        m_messageBroker->Disconnect();
        m_messageBroker.reset();
    }
}

void CNavigatorApp::RunFirstIdleWork() {
    m_firstIdle = false;
    LaunchActivityCenter(true);
    if (NavigatorSettings::Instance() != nullptr && !m_commandLineInfo.SnapshotToNewNote() &&
        !m_commandLineInfo.OpenRecentItem() && IsStartPanelLaunchOnStart())
        LaunchStartPanel(m_applicationInfo.get());
}

void CNavigatorApp::OnActivityCenter() {
    LaunchActivityCenter(false);
}

HRESULT CNavigatorApp::CreateItem(DataExchange::IProperties* properties,
                                  IUnicodeString* itemIdSink) {
    QString type;
    UnicodeStringPtr typeSink(&type);
    if (properties == nullptr || properties->GetProperty(QStringLiteral("type"), &typeSink) != S_OK)
        return E_FAIL;
    WNavDS* navigator = WNavDS::Instance();
    if (type.compare(QStringLiteral("note"), Qt::CaseInsensitive) == 0) {
        // The catalog knows the kind only in its own spelling.
        properties->SetProperty(QStringLiteral("type"), QStringLiteral("note"));
        navigator->NewNote(properties, itemIdSink);
        return S_OK;
    }
    if (type.compare(QStringLiteral("document"), Qt::CaseInsensitive) == 0) {
        properties->SetProperty(QStringLiteral("type"), QStringLiteral("document"));
        const HRESULT result = navigator->AddNewItemAndLimit(properties, 0, itemIdSink);
        navigator->SetChanged(true);
        return result;
    }
    return E_FAIL;
}

HRESULT CNavigatorApp::UpdateItemProperties(const QString& itemId,
                                            DataExchange::IProperties* properties) {
    WNavDS::Instance()->UpdateItem(itemId, properties, false);
    return S_OK;
}

HRESULT CNavigatorApp::SaveDocumentToNotebook(const QString& itemId) {
    WNavDS::Instance()->MoveById(itemId);
    return S_OK;
}

HRESULT CNavigatorApp::ForEachWindow(IWindowCallback* callback) {
    if (callback == nullptr)
        return E_INVALIDARG;
    return callback->Apply(CNavigatorWindows::HandleOf(m_mainWindow), 0);
}
