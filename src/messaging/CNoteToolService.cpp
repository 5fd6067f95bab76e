#include "messaging/CNoteToolService.h"

#include "libs/toolwell/IDataStoreHost.h"
#include "libs/toolwell/IItemWindowHub.h"
#include "libs/toolwell/ItemIdentifier.h"
#include "messaging/CWindowService.h"
#include "messaging/IWindowCallback.h"
#include "messaging/PropertiesToMap.h"
#include "platform/IProcessLauncher.h"

#include <QDir>
#include <QFile>

namespace {

CNoteToolService* g_instance = nullptr;

constexpr int kDefaultTitleId = 100;
constexpr qsizetype kMaxStringLength = 1024;

// One string of a language file: lines "id=text" in UTF-8; null when missing or empty.
QString ReadLanguageString(const QString& path, int id) {
    QFile file(path);
    if (!file.open(QIODevice::ReadOnly))
        return {};
    const QString wanted = QString::number(id);
    while (!file.atEnd()) {
        const QString line = QString::fromUtf8(file.readLine()).remove(u'\r').remove(u'\n');
        const qsizetype equals = line.indexOf(u'=');
        if (equals <= 0 || line.left(equals).trimmed() != wanted)
            continue;
        const QString text = line.mid(equals + 1).left(kMaxStringLength);
        return text.isEmpty() ? QString() : text;
    }
    return {};
}

} // namespace

const QString CNoteToolService::LanguageFileName = QStringLiteral("NoteToolIntl.lang");

INoteToolService* CNoteToolService::GetInstance() {
    if (g_instance == nullptr)
        g_instance = new CNoteToolService();
    ++g_instance->m_references;
    return g_instance;
}

void CNoteToolService::ResetInstance() {
    CNoteToolService* old = g_instance;
    g_instance = nullptr;
    if (old != nullptr && old->m_references == 0)
        delete old;
}

unsigned long CNoteToolService::Release() {
    const unsigned long left = --m_references;
    if (left == 0) {
        if (g_instance == this)
            g_instance = nullptr;
        delete this;
    }
    return left;
}

HRESULT CNoteToolService::ClearWindows() {
    m_openWindows.Clear();
    return S_OK;
}

HRESULT CNoteToolService::SetProgramFolder(const QString& path) {
    m_programFolder = path;
    return S_OK;
}

HRESULT CNoteToolService::SetLanguageFolder(const QString& path) {
    m_languageFolder = path;
    return S_OK;
}

HRESULT CNoteToolService::ForEachWindow(IWindowCallback* callback) {
    return m_openWindows.ForEach(callback);
}

HRESULT CNoteToolService::GetWindowCount(int* count) {
    if (count == nullptr)
        return E_INVALIDARG;
    *count = m_openWindows.Count();
    return S_OK;
}

HRESULT CNoteToolService::FindWindow(const QString& itemId, Platform::WindowHandle* window) {
    return m_openWindows.Find(itemId, window);
}

IWindowService* CNoteToolService::GetWindowService(const QString& itemId) {
    Platform::WindowHandle window = 0;
    if (FindWindow(itemId, &window) != S_OK)
        return nullptr;
    return CreateWindowService(window);
}

HRESULT CNoteToolService::SetEventTarget(IWindowEventNotification* target) {
    m_eventTarget = target;
    return S_OK;
}

HRESULT CNoteToolService::OnNoteWindowOpened(const QString& itemId, Platform::WindowHandle window) {
    const QString key = ItemWindowMap::Key(itemId);
    m_openWindows.Set(itemId, window);
    if (m_waitingItems.remove(key))
        ActivateNote(itemId);
    return S_OK;
}

HRESULT CNoteToolService::RemoveWindow(const QString& itemId, int) {
    m_openWindows.Remove(itemId);
    return S_OK;
}

HRESULT CNoteToolService::ForgetWindow(Platform::WindowHandle window) {
    m_openWindows.RemoveWindow(window);
    return S_OK;
}

HRESULT CNoteToolService::GetDefaultNoteTitle(IUnicodeString* sink) {
    if (sink == nullptr || m_languageFolder.isEmpty())
        return E_FAIL;
    const QString title =
        ReadLanguageString(QDir(m_languageFolder).filePath(LanguageFileName), kDefaultTitleId);
    if (title.isNull())
        return E_FAIL;
    return sink->Assign(title);
}

HRESULT CNoteToolService::GetNoteFileName(IUnicodeString* sink) {
    if (sink == nullptr)
        return E_INVALIDARG;
    return sink->Assign(QStringLiteral("note.htm"));
}

HRESULT CNoteToolService::GetNoteFolder(IDataStoreHost* host, const QString& itemId,
                                        IUnicodeString* sink) {
    // The identifier becomes part of a path: only the catalog's form may.
    if (sink == nullptr || !IsItemIdentifier(itemId))
        return E_INVALIDARG;
    if (host == nullptr)
        return E_FAIL;
    QString folder;
    UnicodeStringPtr folderSink(&folder);
    if (const HRESULT hr = host->GetNotesFolder(&folderSink, 0); FAILED(hr))
        return hr;
    return sink->Assign(folder + u'/' + itemId + u'/');
}

HRESULT CNoteToolService::OpenNote(const QString& notePath, const QString& propertyText) {
    if (m_programFolder.isEmpty())
        return E_FAIL;
    QStringList arguments;
    if (!notePath.isEmpty())
        arguments << notePath;
    if (!propertyText.isEmpty())
        arguments << QStringLiteral("/PROPERTY") << propertyText;
    const QString program = m_programFolder + QStringLiteral("/AmbrelNoteTool");
    return Platform::ProcessLauncher().StartDetached(program, arguments) ? S_OK : E_FAIL;
}

HRESULT CNoteToolService::UpdateNote(const QString& itemId, DataExchange::IProperties* properties) {
    if (IItemWindowHub* hub = GetItemWindowHub())
        hub->UpdateNoteProperties(itemId, PropertiesToMap(properties));
    return S_OK;
}

HRESULT CNoteToolService::ActivateNote(const QString& itemId) {
    if (m_openWindows.Contains(itemId)) {
        if (IItemWindowHub* hub = GetItemWindowHub())
            hub->ActivateNote(itemId);
    } else {
        m_waitingItems.insert(ItemWindowMap::Key(itemId));
    }
    return S_OK;
}

HRESULT CNoteToolService::PrintNote(const QString& itemId) {
    if (IItemWindowHub* hub = GetItemWindowHub())
        hub->PrintNote(itemId);
    return S_OK;
}
