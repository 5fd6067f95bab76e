#include "NavigatorModelFixture.h"

#include "libs/toolwell/IItemLink.h"
#include "libs/toolwell/WordProcessor.h"
#include "messaging/INoteToolService.h"
#include "messaging/IViewerService.h"
#include "platform/Registry.h"
#include "settings/NavigatorSettings.h"
#include "support/RecordingForeignWindows.h"
#include "support/RecordingMessageBox.h"

#include <QFile>

namespace {

const QString kRoot = QStringLiteral("root");
const QString kOpen = QStringLiteral("open");
const QString kTrue = QStringLiteral("true");
const QString kFalse = QStringLiteral("false");
const QString kLostId = QStringLiteral("0F0F0F0F-1111-2222-3333-444455556666");

class OpeningTest : public NavigatorModelFixture {
protected:
    void SetUp() override {
        NavigatorModelFixture::SetUp();
        Platform::SetMessageBox(&messages);
        Platform::SetForeignWindows(&windows);
    }

    // Where the store keeps an item's file.
    QString ItemFile(const QString& itemId, const QString& name) const {
        return AppDataFolder() + QStringLiteral("/Catalog/") + itemId + u'/' + name;
    }
    QString WriteItemFile(const QString& itemId, const QString& name) const {
        return WriteFile(QStringLiteral("data/Brindle/Quillmark Ambrel/Catalog/") + itemId + u'/' +
                             name,
                         "content");
    }
    // A note whose file is there.
    QString Note(const QString& parentId, QMap<QString, QString> properties = {}) {
        properties.insert(QStringLiteral("filename"), QStringLiteral("note.htm"));
        const QString id = Add(QStringLiteral("note"), parentId, properties);
        WriteItemFile(id, QStringLiteral("note.htm"));
        return id;
    }
    // A PDF document of the notebook whose file is there.
    QString Pdf(const QString& parentId) {
        const QString id = Add(QStringLiteral("document"), parentId,
                               {{QStringLiteral("subtype"), QStringLiteral("pdf")},
                                {QStringLiteral("filename"), QStringLiteral("paper.pdf")}});
        WriteItemFile(id, QStringLiteral("paper.pdf"));
        return id;
    }
    QString Folder(const QString& parentId) { return Add(QStringLiteral("folder"), parentId); }

    // An executable that stands for the configured word processor; nothing runs it.
    QString ConfigureWordProcessor() {
        const QString program = WriteFile(QStringLiteral("apps/writer"), "#!/bin/sh\n");
        QFile::setPermissions(program, QFile::ReadOwner | QFile::WriteOwner | QFile::ExeOwner);
        Platform::Registry::SetUserValue(WordProcessor::KeyPath, WordProcessor::CommandValue,
                                         program);
        Platform::Registry::SetUserValue(
            WordProcessor::KeyPath, WordProcessor::NewDocumentSwitchValue, QStringLiteral("--new"));
        return program;
    }

    NavListItemData* Item(const QString& itemId) { return WNavDS::Instance()->FindItem(itemId); }

    RecordingMessageBox messages;
    RecordingForeignWindows windows;
};

TEST_F(OpeningTest, OpeningAFolderTogglesItsExpansionAndKeepsIt) {
    const QString folder = Folder(kRoot);
    Note(folder);
    const QString empty = Folder(kRoot);
    WNavDS* model = Load();
    ASSERT_FALSE(Item(folder)->IsExpanded());

    model->OpenItem(Item(folder), true);
    EXPECT_TRUE(Item(folder)->IsExpanded());
    EXPECT_EQ(CatalogValue(folder, QStringLiteral("expanded")), kTrue);
    model->OpenItem(Item(folder), true);
    EXPECT_FALSE(Item(folder)->IsExpanded());
    EXPECT_EQ(CatalogValue(folder, QStringLiteral("expanded")), kFalse);
    EXPECT_TRUE(launcher.starts.isEmpty());

    // "Open all" on a folder with nothing to open toggles the folder instead.
    model->SelectById(empty);
    model->OpenAllInSelectedFolder();
    EXPECT_TRUE(Item(empty)->IsExpanded());
    model->Load();
    EXPECT_TRUE(Item(empty)->IsExpanded());
    EXPECT_FALSE(Item(folder)->IsExpanded());
}

TEST_F(OpeningTest, OpeningAMissingFileShowsFileNotFoundAndChangesNothing) {
    const QString document = Add(QStringLiteral("document"), kRoot,
                                 {{QStringLiteral("subtype"), QStringLiteral("pdf")},
                                  {QStringLiteral("filename"), QStringLiteral("gone.pdf")}});
    const QString gonePath = Home() + QStringLiteral("/elsewhere/gone.qmd");
    const QString linked =
        Add(QStringLiteral("document"), kRoot,
            {{QStringLiteral("linked"), kTrue}, {QStringLiteral("path"), gonePath}});
    WNavDS* model = Load();
    model->SetChanged(false);
    hub.calls.clear();

    model->OpenItem(Item(document), true);
    model->OpenItem(Item(linked), true);

    ASSERT_EQ(messages.shown.size(), 2);
    EXPECT_EQ(messages.shown[0].text,
              QStringLiteral("\nQuillmark Ambrel cannot find the file:\n\n\"") +
                  ItemFile(document, QStringLiteral("gone.pdf")) + u'"');
    EXPECT_EQ(messages.shown[1].text,
              QStringLiteral("\nQuillmark Ambrel cannot find the file:\n\n\"") + gonePath + u'"');
    for (const auto& shown : messages.shown) {
        EXPECT_EQ(shown.caption, QStringLiteral("File Not Found"));
        EXPECT_EQ(shown.style, 0x30u);
    }
    for (const QString& id : {document, linked}) {
        EXPECT_FALSE(Item(id)->IsOpen());
        EXPECT_TRUE(CatalogValue(id, kOpen).isNull());
    }
    EXPECT_FALSE(model->IsChanged());
    EXPECT_TRUE(launcher.starts.isEmpty());
    EXPECT_TRUE(hub.calls.isEmpty());
}

TEST_F(OpeningTest, OpeningADocumentStartsOneViewerAndThenRaisesItsWindow) {
    const QString document = Pdf(kRoot);
    WNavDS* model = Load();

    model->OpenItem(Item(document), true);
    EXPECT_TRUE(Item(document)->IsOpen());
    EXPECT_EQ(CatalogValue(document, kOpen), kTrue);
    ASSERT_EQ(launcher.starts.size(), 1);
    EXPECT_EQ(launcher.starts[0].arguments,
              (QStringList{QStringLiteral("/o"), QStringLiteral("/id:") + document}));

    // The viewer reports its window twice: once to take the file, then when it shows it.
    IViewerService* viewer = model->GetViewerService();
    windows.alive.insert(5);
    viewer->OnDocumentWindowOpened(document, 5);
    viewer->OnDocumentWindowOpened(document, 5);

    model->OpenItem(Item(document), false);
    model->OpenItem(Item(document), true);
    EXPECT_EQ(launcher.starts.size(), 1);
    ASSERT_EQ(windows.requests.size(), 3);
    EXPECT_EQ(windows.requests[0].operation, QStringLiteral("Show"));
    EXPECT_EQ(windows.requests[0].showCommand, Platform::ShowCommand::Restore);
    EXPECT_EQ(windows.requests[1].operation, QStringLiteral("Show"));
    EXPECT_EQ(windows.requests[2].operation, QStringLiteral("BringToFront"));
    EXPECT_EQ(windows.requests[2].window, 5);

    // Printing reaches the program of the item's kind.
    model->SelectById(document);
    model->PrintSelected();
    ASSERT_FALSE(hub.calls.isEmpty());
    EXPECT_EQ(hub.calls.last().operation, QStringLiteral("PrintDocument"));
    EXPECT_EQ(hub.calls.last().itemId, document);
}

TEST_F(OpeningTest, CloseAllOpenNotesClosesOnlyNotes) {
    const QString note = Note(kRoot);
    const QString document = Pdf(kRoot);
    WNavDS* model = Load();

    // Nothing open: only the change flag is raised.
    model->SetChanged(false);
    hub.calls.clear();
    model->CloseAllOpenNotes();
    EXPECT_TRUE(model->IsChanged());
    EXPECT_TRUE(hub.calls.isEmpty());
    EXPECT_TRUE(CatalogValue(note, kOpen).isNull());

    model->OpenItem(Item(note), true);
    model->OpenItem(Item(document), true);
    hub.calls.clear();
    model->CloseAllOpenNotes();
    EXPECT_FALSE(Item(note)->IsOpen());
    EXPECT_EQ(CatalogValue(note, kOpen), kFalse);
    EXPECT_TRUE(Item(document)->IsOpen());
    ASSERT_EQ(hub.calls.size(), 1);
    EXPECT_EQ(hub.calls[0].operation, QStringLiteral("UpdateNoteProperties"));
    EXPECT_EQ(hub.calls[0].properties.value(kOpen), kFalse);

    model->CloseAllOpenDocuments();
    EXPECT_FALSE(Item(document)->IsOpen());
    EXPECT_EQ(CatalogValue(document, kOpen), kFalse);
}

TEST_F(OpeningTest, OpenAllAndCloseAllReachEveryLevelButDeletedAndLinkedItems) {
    const QString outer = Folder(kRoot);
    const QString inner = Folder(outer);
    const QString deep = Note(inner);
    const QString shallow = Note(outer);
    const QString deleted = Note(outer, {{QStringLiteral("deleted"), kTrue}});
    const QString linkedFile = WriteFile(QStringLiteral("docs/linked.pdf"), "pdf");
    const QString linked =
        Add(QStringLiteral("document"), kRoot,
            {{QStringLiteral("linked"), kTrue}, {QStringLiteral("path"), linkedFile}});
    const QString outside = Note(kRoot);
    WNavDS* model = Load();

    model->SelectItem(model->GetNotebook());
    model->OpenAllInSelectedFolder();
    for (const QString& id : {deep, shallow, outside})
        EXPECT_TRUE(Item(id)->IsOpen()) << id.toStdString();
    for (const QString& id : {deleted, linked}) {
        EXPECT_FALSE(Item(id)->IsOpen());
        EXPECT_TRUE(CatalogValue(id, kOpen).isNull());
    }
    // The last item opened, in catalog order, ends up selected.
    EXPECT_EQ(model->GetSelected(), Item(outside));
    EXPECT_EQ(launcher.starts.size(), 3);

    model->CloseAllInFolder(outer);
    EXPECT_FALSE(Item(deep)->IsOpen());
    EXPECT_FALSE(Item(shallow)->IsOpen());
    EXPECT_EQ(CatalogValue(deep, kOpen), kFalse);
    EXPECT_TRUE(Item(outside)->IsOpen());

    model->OpenAllInFolder(outer);
    model->CloseTree(inner);
    EXPECT_FALSE(Item(deep)->IsOpen());
    EXPECT_TRUE(Item(shallow)->IsOpen());
    model->CloseTree(outside);
    EXPECT_FALSE(Item(outside)->IsOpen());
}

TEST_F(OpeningTest, NotePathsFollowTheFilterAndLeaveDeletedNotesOut) {
    const QString folder = Folder(kRoot);
    const QString first = Note(folder);
    Pdf(folder);
    const QString sub = Folder(folder);
    const QString second = Note(sub);
    const QString allDeleted = Folder(kRoot);
    Note(allDeleted, {{QStringLiteral("deleted"), kTrue}});
    Note(allDeleted, {{QStringLiteral("deleted"), kTrue}});
    WNavDS* model = Load();

    QStringList paths;
    model->CollectNotePaths(folder, &paths);
    EXPECT_EQ(paths, (QStringList{ItemFile(first, QStringLiteral("note.htm")),
                                  ItemFile(second, QStringLiteral("note.htm"))}));

    paths.clear();
    model->CollectNotePaths(allDeleted, &paths);
    EXPECT_TRUE(paths.isEmpty());

    NavigatorSettings* settings = NavigatorSettings::Instance();
    settings->SetShowAllTypes(false);
    settings->SetShowNotes(false);
    settings->SetShowPdf(true);
    model->CollectNotePaths(folder, &paths);
    EXPECT_TRUE(paths.isEmpty());

    // Sending a folder with no notes to send is refused, and the user is told.
    const QString program = ConfigureWordProcessor();
    EXPECT_NE(model->SendItemTo(folder, program), S_OK);
    EXPECT_TRUE(launcher.starts.isEmpty());
    ASSERT_EQ(messages.shown.size(), 1);
    EXPECT_EQ(messages.shown[0].text,
              QStringLiteral("Quillmark Ambrel could not complete the action."));
    EXPECT_EQ(messages.shown[0].caption, QStringLiteral("Quillmark Ambrel"));
    EXPECT_EQ(messages.shown[0].style, 0x11030u);
}

TEST_F(OpeningTest, SendingHandsNotesAndDocumentsToTheWordProcessor) {
    const QString note = Note(kRoot);
    const QString document = Pdf(kRoot);
    WNavDS* model = Load();
    const QString program = ConfigureWordProcessor();

    model->SelectById(note);
    model->SendSelectedToWordProcessor();
    ASSERT_EQ(launcher.starts.size(), 1);
    EXPECT_EQ(launcher.starts[0].program, program);
    EXPECT_EQ(launcher.starts[0].arguments,
              QStringList{ItemFile(note, QStringLiteral("note.htm"))});

    // A document of the notebook goes as a copy, so its own file is not a path to write to.
    const QByteArray tmpdir = qgetenv("TMPDIR");
    qputenv("TMPDIR", QFile::encodeName(Home()));
    const HRESULT sent = model->SendItemTo(document, program);
    if (tmpdir.isNull())
        qunsetenv("TMPDIR");
    else
        qputenv("TMPDIR", tmpdir);
    EXPECT_EQ(sent, S_OK);
    ASSERT_EQ(launcher.starts.size(), 2);
    ASSERT_EQ(launcher.starts[1].arguments.size(), 1);
    EXPECT_NE(launcher.starts[1].arguments[0], ItemFile(document, QStringLiteral("paper.pdf")));
    EXPECT_TRUE(launcher.starts[1].arguments[0].endsWith(QStringLiteral("/paper.pdf")));
    EXPECT_TRUE(messages.shown.isEmpty());

    // An item the notebook does not hold never reaches the bridge: the box has no caption.
    EXPECT_EQ(model->SendItemTo(kLostId, program), E_INVALIDARG);
    ASSERT_EQ(messages.shown.size(), 1);
    EXPECT_EQ(messages.shown[0].caption, QString());

    model->NewWordProcessorDocument();
    ASSERT_EQ(launcher.starts.size(), 3);
    EXPECT_EQ(launcher.starts[2].arguments, QStringList{QStringLiteral("--new")});
}

TEST_F(OpeningTest, OpeningByIdForgetsAnIdTheNotebookLost) {
    const QString note = Note(kRoot);
    const QString deleted = Note(kRoot, {{QStringLiteral("deleted"), kTrue}});
    WNavDS* model = Load();
    {
        ReleasePtr<IItemLink> notes(GetNoteToolLink(host.get()));
        ReleasePtr<IItemLink> documents(GetViewerLink(host.get()));
        for (const QString& id : {kLostId, deleted, note})
            notes->AnnounceItem(id, QStringLiteral("title"));
        documents->AnnounceItem(kLostId, QStringLiteral("title"));
    }

    model->OpenById(kLostId.toLower());
    model->OpenById(deleted);
    model->OpenById(note);

    ReleasePtr<IItemLink> notes(GetNoteToolLink(host.get()));
    const QList<ItemLinkEntry> left = notes->Items();
    ASSERT_EQ(left.size(), 1);
    EXPECT_EQ(left[0].itemId, note);
    ReleasePtr<IItemLink> documents(GetViewerLink(host.get()));
    EXPECT_TRUE(documents->Items().isEmpty());

    EXPECT_FALSE(Item(deleted)->IsOpen());
    EXPECT_TRUE(Item(note)->IsOpen());
    EXPECT_EQ(model->GetSelected(), Item(note));
    EXPECT_TRUE(messages.shown.isEmpty());
}

TEST_F(OpeningTest, WaitingForWindowsGivesUpOnOneThatNeverCloses) {
    const QString note = Note(kRoot);
    const QString document = Pdf(kRoot);
    WNavDS* model = Load();
    INoteToolService* noteTool = model->GetNoteToolService();
    IViewerService* viewer = model->GetViewerService();
    windows.alive = {11, 22};
    noteTool->OnNoteWindowOpened(note, 11);
    viewer->OnDocumentWindowOpened(document, 22);

    // The note tool's report of its closed window arrives through an idle pass.
    int idlePasses = 0;
    model->SetIdlePassHook([&] {
        if (++idlePasses == 2)
            noteTool->RemoveWindow(note, 0);
    });
    model->CloseAllWindowsAndWait(std::chrono::milliseconds(400));

    ASSERT_EQ(windows.requests.size(), 2);
    for (const auto& request : windows.requests)
        EXPECT_EQ(request.operation, QStringLiteral("Close"));
    EXPECT_EQ(windows.requests[0].window, 11);
    EXPECT_EQ(windows.requests[1].window, 22);
    EXPECT_GE(idlePasses, 3);
    int count = -1;
    noteTool->GetWindowCount(&count);
    EXPECT_EQ(count, 0);
    viewer->GetWindowCount(&count);
    EXPECT_EQ(count, 1);
}

} // namespace
