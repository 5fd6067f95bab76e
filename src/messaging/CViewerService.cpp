#include "messaging/CViewerService.h"

#include "libs/toolwell/IItemWindowHub.h"
#include "messaging/CWindowService.h"
#include "messaging/IWindowCallback.h"
#include "platform/IProcessLauncher.h"

#include <QFileInfo>

namespace {

CViewerService* g_instance = nullptr;

} // namespace

IViewerService* CViewerService::GetInstance() {
    if (g_instance == nullptr)
        g_instance = new CViewerService();
    ++g_instance->m_references;
    return g_instance;
}

void CViewerService::ResetInstance() {
    CViewerService* old = g_instance;
    g_instance = nullptr;
    if (old != nullptr && old->m_references == 0)
        delete old;
}

unsigned long CViewerService::Release() {
    const unsigned long left = --m_references;
    if (left == 0) {
        if (g_instance == this)
            g_instance = nullptr;
        delete this;
    }
    return left;
}

HRESULT CViewerService::ClearWindows() {
    m_openWindows.Clear();
    return S_OK;
}

HRESULT CViewerService::ForEachWindow(IWindowCallback* callback) {
    return m_openWindows.ForEach(callback);
}

HRESULT CViewerService::GetWindowCount(int* count) {
    if (count == nullptr)
        return E_INVALIDARG;
    *count = m_openWindows.Count();
    return S_OK;
}

HRESULT CViewerService::FindWindow(const QString& itemId, Platform::WindowHandle* window) {
    return m_openWindows.Find(itemId, window);
}

HRESULT CViewerService::SetProgramFolder(const QString& path) {
    m_programFolder = path;
    return S_OK;
}

HRESULT CViewerService::SetLanguageFolder(const QString& path) {
    m_languageFolder = path;
    return S_OK;
}

IWindowService* CViewerService::GetWindowService(const QString& itemId) {
    Platform::WindowHandle window = 0;
    if (FindWindow(itemId, &window) != S_OK)
        return nullptr;
    return CreateWindowService(window);
}

HRESULT CViewerService::SetEventTarget(IWindowEventNotification* target) {
    m_eventTarget = target;
    return S_OK;
}

HRESULT CViewerService::OnDocumentWindowOpened(const QString& itemId,
                                               Platform::WindowHandle window) {
    const QString key = ItemWindowMap::Key(itemId);
    if (const auto launched = m_launchedDocuments.find(key);
        launched != m_launchedDocuments.end()) {
        // The viewer started for this item shows its first window: hand it the file. Its
        // window is recorded when it reports again with the file shown.
        const QString path = launched.value();
        m_launchedDocuments.erase(launched);
        if (IItemWindowHub* hub = GetItemWindowHub())
            hub->OpenDocumentInViewer(itemId, path, itemId);
        return S_OK;
    }
    m_openWindows.Set(itemId, window);
    if (m_waitingItems.remove(key))
        ActivateDocument(itemId);
    return S_OK;
}

HRESULT CViewerService::RemoveWindow(const QString& itemId, int) {
    m_openWindows.Remove(itemId);
    return S_OK;
}

HRESULT CViewerService::ForgetWindow(Platform::WindowHandle window) {
    m_openWindows.RemoveWindow(window);
    return S_OK;
}

HRESULT CViewerService::ActivateDocument(const QString& itemId) {
    if (m_openWindows.Contains(itemId)) {
        if (IItemWindowHub* hub = GetItemWindowHub())
            hub->ActivateDocument(itemId);
    } else {
        m_waitingItems.insert(ItemWindowMap::Key(itemId));
    }
    return E_FAIL;
}

HRESULT CViewerService::OpenDocument(const QString& itemId, const QString& path) {
    if (itemId.isEmpty())
        return E_FAIL;

    if (!path.isEmpty() && !m_requestingViewer.isEmpty()) {
        // A viewer asked for this file itself: it shows it, no new process is started.
        if (IItemWindowHub* hub = GetItemWindowHub()) {
            RemoveWindow(itemId, 0);
            hub->OpenDocumentInViewer(m_requestingViewer, path, itemId);
        }
        m_requestingViewer.clear();
        return E_FAIL;
    }

    if (m_programFolder.isEmpty())
        return E_FAIL;
    const QString key = ItemWindowMap::Key(itemId);
    m_launchedDocuments.insert(key, path.isNull() ? QStringLiteral("") : path);

    QStringList arguments;
    if (!path.isEmpty() && QFileInfo::exists(path))
        arguments << QStringLiteral("/o");
    arguments << QStringLiteral("/id:") + itemId;
    const QString program = m_programFolder + QStringLiteral("/AmbrelViewer");
    if (!Platform::ProcessLauncher().StartDetached(program, arguments)) {
        // No viewer will report: a later window of another viewer must not take this file.
        m_launchedDocuments.remove(key);
        return E_FAIL;
    }
    return S_OK;
}

HRESULT CViewerService::SetRequestingViewer(const QString& itemId) {
    if (itemId.isNull())
        return E_FAIL;
    m_requestingViewer = itemId;
    return S_OK;
}

HRESULT CViewerService::PrintDocument(const QString& itemId) {
    if (IItemWindowHub* hub = GetItemWindowHub())
        hub->PrintDocument(itemId);
    return S_OK;
}
