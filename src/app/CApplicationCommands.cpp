#include "app/CApplicationCommands.h"

#include "app/CCommandRouter.h"
#include "app/SaveAsDocument.h"
#include "app/SystemIntegration.h"
#include "catalog/IDataStoreService.h"
#include "libs/postwick/IPostwick.h"
#include "libs/toolwell/IHarborUtils.h"
#include "libs/toolwell/IHelpService.h"
#include "libs/toolwell/IMailService.h"
#include "libs/toolwell/ISnapshotService.h"
#include "messaging/ActivityCenter.h"
#include "navigator/ItemProperties.h"
#include "navigator/WNavDS.h"
#include "settings/CNavigatorSettingsDlg.h"
#include "settings/NavigatorSettings.h"
#include "ui/ModalDialog.h"

#include <QFileDialog>
#include <QPointer>
#include <QTimer>

namespace {

using Command = CCommandRouter::Command;
using ItemProperties::NewProperties;
using ItemProperties::PropertiesPtr;

NavigatorSettings* Options() {
    return NavigatorSettings::Instance();
}

// Mails the selected note (its title as the subject) or document; nothing for a folder, an
// item without identifier, file or type.
void SendSelectedByMail() {
    WNavDS* model = WNavDS::Instance();
    const NavListItemData* selected = model->GetSelected();
    IDataStoreService* service = GetDataStoreService();
    if (selected == nullptr || selected->GetKind() == ItemKindFolder ||
        selected->GetItemId().isEmpty() || service == nullptr)
        return;
    const QString itemId = selected->GetItemId();
    PropertiesPtr properties = NewProperties();
    service->GetProperties(itemId, properties.get());
    QString path;
    model->ResolveDocumentPath(itemId, properties.get(), &path);
    QString type;
    UnicodeStringPtr typeSink(&type);
    if (path.isEmpty() || properties->GetProperty(QStringLiteral("type"), &typeSink) != S_OK)
        return;
    if (type == u"note") {
        QString title;
        UnicodeStringPtr titleSink(&title);
        properties->GetProperty(QStringLiteral("title"), &titleSink);
        GetMailService()->SendFileByMailWithSubject(path, title, 1);
    } else {
        GetMailService()->SendFileByMail(path, 1);
    }
}

// Asks where to put a copy of the selected document and copies it there. A failed copy is not
// reported: the user sees the file missing where it was to go.
void SaveSelectedDocumentAs(QWidget* owner) {
    QString path;
    if (!WNavDS::Instance()->GetSelectedDocumentPath(&path))
        return;
    const SaveAsDocument::FileType type = SaveAsDocument::Describe(path);
    ModalDialog modal(new QFileDialog(owner));
    auto* dialog = modal.Get<QFileDialog>();
    dialog->setAcceptMode(QFileDialog::AcceptSave);
    dialog->setFileMode(QFileDialog::AnyFile);
    dialog->setNameFilter(type.nameFilter);
    dialog->setDefaultSuffix(type.defaultSuffix);
    dialog->selectFile(type.fileName);
    if (modal.Exec() != QDialog::Accepted)
        return;
    if (auto* answered = modal.Get<QFileDialog>()) {
        const QStringList chosen = answered->selectedFiles();
        if (!chosen.isEmpty())
            SaveAsDocument::Copy(path, chosen.first());
    }
}

// Hides the navigator's window, lets the window system take it off the screen, grabs, and
// shows the window again, so that the snapshot never shows the navigator itself.
Command Snapshot(const std::function<QWidget*()>& mainWindow, HRESULT (ISnapshotService::*take)()) {
    return {[mainWindow, take] {
                QPointer<QWidget> window = mainWindow();
                const bool wasShown = window && window->isVisible();
                if (wasShown)
                    window->hide();
                QTimer::singleShot(wasShown ? CApplicationCommands::kHideBeforeSnapshot : 0,
                                   [window, wasShown, take] {
                                       (GetSnapshotService()->*take)();
                                       if (wasShown && window)
                                           window->show();
                                   });
            },
            nullptr, nullptr};
}

} // namespace

void CApplicationCommands::Register(CCommandRouter& router, std::function<QWidget*()> mainWindow) {
    router.Register({32783}, {[] { Options()->SetKeepOnTop(!Options()->GetKeepOnTop()); }, nullptr,
                              [] { return Options()->GetKeepOnTop(); }});
    router.Register({32785}, {[] { Options()->SetShowFrame(!Options()->GetShowFrame()); }, nullptr,
                              [] { return Options()->GetShowFrame(); }});
    // Without the message centre there is no bar to show or hide.
    if (GetHarborUtilsInterface()->IsFeatureAvailable(6) == 1) {
        router.Register(
            {32800}, {[] { Options()->SetShowMessageCentre(!Options()->GetShowMessageCentre()); },
                      nullptr, [] { return Options()->GetShowMessageCentre(); }});
    }

    const auto hasUserGuide = [] { return GetHelpService()->HasUserGuide() != 0; };
    router.Register({57670, 32776},
                    {[] { GetHelpService()->ShowHelpTopics(); }, hasUserGuide, nullptr});
    router.Register({32862}, {[] { GetHelpService()->ShowUserGuide(); }, hasUserGuide, nullptr});
    router.Register({32781}, {[] { GetHelpService()->OpenWebsite(); },
                              [] { return GetHelpService()->HasWebsite(); }, nullptr});
    router.Register({32782}, {[] { GetHelpService()->ShowAbout(); }, nullptr, nullptr});
    router.Register({32778}, {[] { GetMailService()->TellAFriend(); },
                              [] { return GetMailService()->CanSendMail(); }, nullptr});

    router.Register(
        {32775},
        {[mainWindow] { OpenSettingsDialog(mainWindow(), CNavigatorSettingsDlg::GeneralPage); },
         nullptr, nullptr});
    router.Register({32793}, {[] { LaunchStartPanel(Options()->GetApplicationInfo()); },
                              [] { return Options()->GetApplicationInfo() != nullptr; }, nullptr});
    router.Register({32784}, {[] { LaunchActivityCenter(false); },
                              [] { return IsActivityCenterInstalled(); }, nullptr});

    router.Register({32771}, Snapshot(mainWindow, &ISnapshotService::SnapshotToNewNote));
    router.Register({32772}, Snapshot(mainWindow, &ISnapshotService::SnapshotToClipboard));
    router.Register({32773}, Snapshot(mainWindow, &ISnapshotService::SnapshotToQm));

    router.Register(
        {32828, 32878, 32895},
        {&SendSelectedByMail,
         [] { return WNavDS::Instance()->CanPrintSelected() && GetMailService()->CanSendMail(); },
         nullptr});
    // The blogging library is linked into the program, so the data source can always make it.
    WNavDS::SetBlogServiceFactory(&GetPostwickInterface);
    router.Register({32923}, {[] { WNavDS::Instance()->SendSelectedNoteToBlog(); },
                              [] { return WNavDS::Instance()->CanBlogSelected(); }, nullptr});
    router.Register({32876},
                    {[mainWindow] { SaveSelectedDocumentAs(mainWindow()); },
                     [] {
                         const NavListItemData* selected = WNavDS::Instance()->GetSelected();
                         return selected != nullptr && selected->GetKind() == ItemKindDocument;
                     },
                     nullptr});
}
