#include "messaging/CNavInstanceMgr.h"

#include "dataexchange/WProperties.h"
#include "libs/toolwell/IQmBridge.h"
#include "libs/toolwell/ItemIdentifier.h"
#include "messaging/CNoteToolService.h"
#include "messaging/CShowAllWindows.h"
#include "messaging/INavigatorService.h"
#include "messaging/INoteToolService.h"
#include "messaging/IViewerService.h"
#include "navigator/WNavDS.h"

#include <QFileInfo>
#include <QSet>

namespace {

using namespace Qt::StringLiterals;

// The properties that the note tool and the viewer own and may change from outside; the
// catalog's structure ("linked", "deleted", "path", "filename", "type", "uuid") is not theirs.
const QSet<QString> kOwnedKeys{u"title"_s,           u"open"_s,           u"datecreated"_s,
                               u"dateaccessed"_s,    u"size"_s,           u"position"_s,
                               u"keepontop"_s,       u"font"_s,           u"fontsize"_s,
                               u"backgroundcolor"_s, u"backgroundimage"_s};

// The value when the set has the key.
bool Get(DataExchange::IProperties* properties, const QString& key, QString* value) {
    UnicodeStringPtr sink(value);
    return properties->GetProperty(key, &sink) == S_OK;
}

// The "itemid" of the set, when it has one of the catalog's form.
bool GetItemId(DataExchange::IProperties* properties, QString* itemId) {
    return Get(properties, u"itemid"_s, itemId) && IsItemIdentifier(*itemId);
}

// A copy holding only the owned pairs (and "type" with withType).
ReleasePtr<DataExchange::IProperties> OwnedPairs(DataExchange::IProperties* properties,
                                                 bool withType) {
    class Filter final : public DataExchange::IPropertyReporter {
    public:
        Filter(DataExchange::IProperties* target, bool withType)
            : m_target(target), m_withType(withType) {}
        HRESULT ReportProperty(const QString& name, const QString& value) override {
            if (kOwnedKeys.contains(name) || (m_withType && name == u"type"_s))
                m_target->SetProperty(name, value);
            return S_OK;
        }

    private:
        DataExchange::IProperties* m_target;
        bool m_withType;
    };
    ReleasePtr<DataExchange::IProperties> owned(DataExchange::CreateProperties());
    Filter filter(owned.get(), withType);
    properties->ReportProperties(&filter);
    return owned;
}

// The window handle of a report; the broker has made it the navigator's own number.
Platform::WindowHandle HandleOf(const QString& text) {
    bool ok = false;
    const Platform::WindowHandle handle = text.toLongLong(&ok);
    return ok ? handle : 0;
}

} // namespace

CNavInstanceMgr::CNavInstanceMgr(INavigatorService* navigatorService)
    : m_navigatorService(navigatorService) {}

CNavInstanceMgr::~CNavInstanceMgr() = default;

void CNavInstanceMgr::OnMessage(const QString& name, const QMap<QString, QString>& properties) {
    if (name == u"WindowShowNotification"_s) {
        CMethodNode node(name);
        for (auto pair = properties.cbegin(); pair != properties.cend(); ++pair)
            node.ReportProperty(pair.key(), pair.value());
        Dispatch(name, node.Properties());
        return;
    }
    auto node = std::make_unique<CMethodNode>(name);
    for (auto pair = properties.cbegin(); pair != properties.cend(); ++pair)
        node->ReportProperty(pair.key(), pair.value());
    m_queue.push_back(std::move(node));
}

void CNavInstanceMgr::OnNewNote() {
    WNavDS::Instance()->NewNote(nullptr, nullptr);
}

void CNavInstanceMgr::OnWindowsGone(const QList<Platform::WindowHandle>& windows) {
    WNavDS* navigator = WNavDS::Instance();
    for (const Platform::WindowHandle window : windows) {
        if (INoteToolService* noteTool = navigator->GetNoteToolService())
            noteTool->ForgetWindow(window);
        if (IViewerService* viewer = navigator->GetViewerService())
            viewer->ForgetWindow(window);
    }
}

bool CNavInstanceMgr::ProcessQueue(QDeadlineTimer deadline) {
    // A message may run a nested event loop in which more arrive: they join this round.
    while (!m_queue.empty()) {
        const std::unique_ptr<CMethodNode> node = std::move(m_queue.front());
        m_queue.pop_front();
        Dispatch(node->Name(), node->Properties());
        if (deadline.hasExpired())
            break;
    }
    return !m_queue.empty();
}

void CNavInstanceMgr::Dispatch(const QString& name, DataExchange::IProperties* properties) {
    if (m_navigatorService == nullptr || properties == nullptr)
        return;
    WNavDS* navigator = WNavDS::Instance();
    QString itemId;
    QString value;
    if (name == u"RequestNewNoteWithClipboard"_s) {
        CreateNote(properties);
    } else if (name == u"EventNotification"_s) {
        if (GetItemId(properties, &itemId) && Get(properties, u"event"_s, &value) &&
            value == u"WindowOnActivate"_s)
            navigator->SelectById(itemId);
    } else if (name == u"DocumentOpenNotification"_s ||
               name == u"DocumentWaitForOpenNotification"_s) {
        WindowOpened(properties, true);
    } else if (name == u"NoteOpenNotification"_s) {
        WindowOpened(properties, false);
    } else if (name == u"SaveDocumentToNotebook"_s) {
        SaveDocumentToNotebook(properties);
    } else if (name == u"WindowShowNotification"_s) {
        ShowAllWindows(properties);
    } else if (name == u"SendToBlog"_s) {
        QString path;
        QString title;
        QString fileName;
        if (Get(properties, u"path"_s, &path) && Get(properties, u"title"_s, &title) &&
            Get(properties, u"filename"_s, &fileName))
            navigator->SendFileToBlog(path, title, fileName);
    } else if (name == u"UpdateMetadata"_s) {
        UpdateMetadata(properties);
    } else if (name == u"OpenItemByItemID"_s) {
        if (GetItemId(properties, &itemId))
            navigator->OpenById(itemId);
    } else if (name == u"RequestViewerFromFile"_s) {
        RequestViewerFromFile(properties);
    } else if (name == u"RequestClipboardPasteToQm"_s) {
        if (ReleasePtr<IQmBridge> bridge{GetQmBridge()})
            bridge->PasteClipboardToQm();
    } else if (name == u"RequestExportToQm"_s) {
        if (GetItemId(properties, &itemId)) {
            Get(properties, u"QmChoice"_s, &value);
            navigator->SendItemTo(itemId, value);
        }
    }
}

void CNavInstanceMgr::CreateNote(DataExchange::IProperties* properties) {
    // From outside only notes are made, and only from the pairs a note may carry.
    QString type;
    if (!Get(properties, u"type"_s, &type) || type.compare(u"note"_s, Qt::CaseInsensitive) != 0)
        return;
    const ReleasePtr<DataExchange::IProperties> owned = OwnedPairs(properties, true);
    QString newId;
    UnicodeStringPtr sink(&newId);
    m_navigatorService->CreateItem(owned.get(), &sink);
}

void CNavInstanceMgr::WindowOpened(DataExchange::IProperties* properties, bool document) {
    QString itemId;
    QString handleText;
    if (!GetItemId(properties, &itemId) || !Get(properties, u"openwindowhandle"_s, &handleText))
        return;
    // A window whose program has already left is closed: nothing to record.
    const Platform::WindowHandle window = HandleOf(handleText);
    if (!Platform::ForeignWindows().IsWindow(window))
        return;
    WNavDS* navigator = WNavDS::Instance();
    if (document) {
        if (IViewerService* viewer = navigator->GetViewerService())
            viewer->OnDocumentWindowOpened(itemId, window);
    } else if (INoteToolService* noteTool = navigator->GetNoteToolService()) {
        noteTool->OnNoteWindowOpened(itemId, window);
    }
}

void CNavInstanceMgr::SaveDocumentToNotebook(DataExchange::IProperties* properties) {
    QString itemId;
    if (!GetItemId(properties, &itemId))
        return;
    // Only a linked document may be taken into the notebook from outside.
    const NavListItemData* item = WNavDS::Instance()->FindItem(itemId);
    if (item != nullptr && item->GetKind() == ItemKindDocument && item->IsLinked())
        m_navigatorService->SaveDocumentToNotebook(itemId);
}

void CNavInstanceMgr::ShowAllWindows(DataExchange::IProperties* properties) {
    QString commandType;
    if (!Get(properties, u"WindowShowCmdType"_s, &commandType))
        return;
    CShowAllWindows showAll(commandType);
    m_navigatorService->ForEachWindow(&showAll);
    INoteToolService* noteTool = CNoteToolService::GetInstance();
    noteTool->ForEachWindow(&showAll);
    noteTool->Release();
    if (const Platform::WindowHandle panel = Platform::ForeignWindows().FindStartPanel())
        showAll.Apply(panel, 0);
}

void CNavInstanceMgr::UpdateMetadata(DataExchange::IProperties* properties) {
    QString itemId;
    if (!GetItemId(properties, &itemId))
        return;
    // Only notes and documents are shown by other programs; folders take nothing from outside.
    WNavDS* navigator = WNavDS::Instance();
    const NavListItemData* item = navigator->FindItem(itemId);
    if (item == nullptr || (item->GetKind() != ItemKindNote && item->GetKind() != ItemKindDocument))
        return;
    const bool document = item->GetKind() == ItemKindDocument;
    const ReleasePtr<DataExchange::IProperties> owned = OwnedPairs(properties, false);
    m_navigatorService->UpdateItemProperties(itemId, owned.get());

    QString open;
    if (!Get(properties, u"open"_s, &open) || open.compare(u"false"_s, Qt::CaseInsensitive) != 0 ||
        navigator->FindItem(itemId) == nullptr)
        return;
    if (document) {
        if (IViewerService* viewer = navigator->GetViewerService())
            viewer->RemoveWindow(itemId, 0);
    } else if (INoteToolService* noteTool = navigator->GetNoteToolService()) {
        noteTool->RemoveWindow(itemId, 0);
    }
}

void CNavInstanceMgr::RequestViewerFromFile(DataExchange::IProperties* properties) {
    WNavDS* navigator = WNavDS::Instance();
    QString fileName;
    if (!Get(properties, u"filename"_s, &fileName)) {
        navigator->OpenNewDocumentInViewer();
        return;
    }
    // Only a file that exists, named by its whole path.
    const QFileInfo file(fileName);
    if (!file.isAbsolute() || !file.isFile())
        return;
    QString viewerId;
    if (Get(properties, u"itemid"_s, &viewerId) && !viewerId.isEmpty()) {
        if (!IsItemIdentifier(viewerId))
            return;
        if (IViewerService* viewer = navigator->GetViewerService())
            viewer->SetRequestingViewer(viewerId);
    }
    navigator->LinkDocument(file.absoluteFilePath(), true);
}
