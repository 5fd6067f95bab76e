#include "libs/toolwell/CDataStoreHost.h"

#include "libs/toolwell/ItemIdentifier.h"
#include "platform/AppFolders.h"

#include <QDir>
#include <QFileInfo>

CDataStoreHost::CDataStoreHost(const QString& applicationDataFolder)
    : m_storeFolder(applicationDataFolder + QStringLiteral("/Catalog")) {}

unsigned long CDataStoreHost::AddRef() {
    return ++m_references;
}

unsigned long CDataStoreHost::Release() {
    const unsigned long left = --m_references;
    if (left == 0)
        delete this;
    return left;
}

int CDataStoreHost::GetStoreFolder(QString* folder, bool* exists) {
    if (folder == nullptr)
        return 0;
    *folder = m_storeFolder;
    if (exists != nullptr)
        *exists = QFileInfo(m_storeFolder).isDir();
    return 1;
}

int CDataStoreHost::GetCatalogPath(QString* path, bool* exists) {
    if (path == nullptr)
        return 0;
    *path = m_storeFolder + QStringLiteral("/catalog.xml");
    if (exists != nullptr)
        *exists = QFileInfo(*path).isFile();
    return 1;
}

HRESULT CDataStoreHost::GetNotesFolder(IUnicodeString* sink, int) {
    if (sink == nullptr)
        return E_INVALIDARG;
    return sink->Assign(m_storeFolder);
}

int CDataStoreHost::GetItemFolder(QString* folder, const QString& itemId, bool create) {
    // The identifier becomes a path: only the GUID form may, so "../x" never leaves the store.
    if (folder == nullptr || !IsItemIdentifier(itemId))
        return 0;
    *folder = m_storeFolder + u'/' + itemId;
    const QFileInfo info(*folder);
    if (info.isDir() && !info.isSymLink())
        return 1;
    if (!create || info.exists() || info.isSymLink())
        return 0;
    return QDir().mkpath(*folder) ? 1 : 0;
}

IDataStoreHost* GetDataStoreHost() {
    return new CDataStoreHost(Platform::ApplicationDataFolder());
}
