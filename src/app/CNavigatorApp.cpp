#include "app/CNavigatorApp.h"

#include "app/IdlePass.h"
#include "libs/toolwell/IHarborUtils.h"
#include "navigator/WNavDS.h"
#include "settings/NavigatorSettings.h"
#include "ui/QtMessageBox.h"
#include "ui/QtWaitCursor.h"
#include "ui/TerminationSignals.h"
#include "ui/WMainFrame.h"

#include <QApplication>

namespace {

constexpr int kDefaultWidth = 280;
constexpr int kDefaultHeight = 650;

QtMessageBox g_messageBox;
QtWaitCursor g_waitCursor;

} // namespace

CNavigatorApp::CNavigatorApp() = default;

CNavigatorApp::~CNavigatorApp() {
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
    Platform::SetMessageBox(&g_messageBox);
    Platform::SetWaitCursor(&g_waitCursor);

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

    m_dataStoreHost.reset(GetDataStoreHost());
    if (!m_dataStoreHost)
        return false;
    // Without a catalog the navigator still starts; it just has nothing to show.
    m_dataStoreService = CreateDataStoreService(m_dataStoreHost.get());
    WNavDS* navigator = WNavDS::Instance();
    navigator->SetDataStoreHost(m_dataStoreHost.get());
    navigator->Initialize();
    settings->SetDataStoreHost(m_dataStoreHost.get());

    m_mainWindow = new WMainFrame;
    m_mainWindow->setAttribute(Qt::WA_DeleteOnClose);
    PlaceMainWindow();
    m_mainWindow->show();

    m_mainWindow->SetTrackPosition(true);
    settings->SetFrame(m_mainWindow);

    // The window options are applied through their settings, which also shows them at once.
    settings->SetKeepOnTop(settings->GetKeepOnTop());
    settings->SetShowMessageCentre(settings->GetShowMessageCentre());
    settings->SetShowFrame(settings->GetShowFrame());

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
    m_mainWindow->setGeometry(stored.left, stored.top, width, height);
}

bool CNavigatorApp::OnIdle(int count) {
    if (WNavDS::Instance()->IsChanged() && m_dataStoreService != nullptr)
        m_dataStoreService->Save();
    if (!m_mainWindow) {
        QCoreApplication::exit(0);
        return false;
    }
    m_mainWindow->OnIdleWork();
    NavigatorSettings::Instance()->SaveIfDirty();
    return count < 1;
}

int CNavigatorApp::ExitInstance() {
    m_terminationSignals.reset();
    if (NavigatorSettings* settings = NavigatorSettings::Instance(); settings->IsDirty())
        settings->Save();
    WNavDS::DestroyInstance();
    if (m_dataStoreService != nullptr) {
        m_dataStoreService->Shutdown(1);
        m_dataStoreService = nullptr;
    }
    m_dataStoreHost.reset();
    ReleaseHarborUtilsInterface();
    m_applicationInfo.reset();
    return m_exitCode;
}
