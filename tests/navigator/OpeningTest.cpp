#include "NavigatorModelFixture.h"

#include "libs/toolwell/IItemLink.h"
#include "libs/toolwell/WordProcessor.h"
#include "messaging/INoteToolService.h"
#include "messaging/IViewerService.h"
#include "platform/Registry.h"
#include "settings/NavigatorSettings.h"

#include <QFile>

namespace {

const QString kLostId = u"0F0F0F0F-1111-2222-3333-444455556666"_s;

class OpeningTest : public NavigatorModelFixture {
protected:
    void WriteItemFile(const QString& itemId, const QString& name) const {
        WriteFile(u"data/Brindle/Quillmark Ambrel/Catalog/"_s + itemId + u'/' + name, "content");
    }
    // A note whose file is there.
    QString Note(const QString& parentId = u"root"_s, Props properties = {}) {
        properties.insert(u"filename"_s, u"note.htm"_s);
        const QString id = Add(u"note"_s, parentId, properties);
        WriteItemFile(id, u"note.htm"_s);
        return id;
    }
    // A PDF document of the notebook whose file is there.
    QString Pdf(const QString& parentId = u"root"_s) {
        const QString id = Add(u"document"_s, parentId,
                               {{u"subtype"_s, u"pdf"_s}, {u"filename"_s, u"paper.pdf"_s}});
        WriteItemFile(id, u"paper.pdf"_s);
        return id;
    }
    // An executable that stands for the configured word processor; nothing runs it.
    QString ConfigureWordProcessor() {
        const QString program = WriteFile(u"apps/writer"_s, "#!/bin/sh\n");
        QFile::setPermissions(program, QFile::ReadOwner | QFile::WriteOwner | QFile::ExeOwner);
        Platform::Registry::SetUserValue(WordProcessor::KeyPath, WordProcessor::CommandValue,
                                         program);
        Platform::Registry::SetUserValue(WordProcessor::KeyPath,
                                         WordProcessor::NewDocumentSwitchValue, u"--new"_s);
        return program;
    }
};

TEST_F(OpeningTest, OpeningAFolderTogglesItsExpansionAndKeepsIt) {
    const QString folder = Folder();
    Note(folder);
    const QString empty = Folder();
    WNavDS* model = Load();

    model->OpenItem(Item(folder), true);
    EXPECT_TRUE(Item(folder)->IsExpanded());
    EXPECT_EQ(CatalogValue(folder, u"expanded"_s), u"true"_s);
    model->OpenItem(Item(folder), true);
    EXPECT_FALSE(Item(folder)->IsExpanded());
    EXPECT_EQ(CatalogValue(folder, u"expanded"_s), u"false"_s);
    EXPECT_TRUE(launcher.starts.isEmpty());

    // "Open all" on a folder with nothing to open toggles the folder instead.
    model->SelectById(empty);
    model->OpenAllInSelectedFolder();
    model->Load();
    EXPECT_TRUE(Item(empty)->IsExpanded());
}

TEST_F(OpeningTest, OpeningAMissingFileShowsFileNotFoundAndChangesNothing) {
    const QString document =
        Add(u"document"_s, u"root"_s, {{u"subtype"_s, u"pdf"_s}, {u"filename"_s, u"gone.pdf"_s}});
    const QString gonePath = Home() + u"/elsewhere/gone.qmd"_s;
    const QString linked = Linked(gonePath, 1);
    WNavDS* model = Load();
    model->SetChanged(false);
    hub.calls.clear();

    model->OpenItem(Item(document), true);
    model->OpenItem(Item(linked), true);
    ASSERT_EQ(messages.shown.size(), 2);
    const QString text = u"\nQuillmark Ambrel cannot find the file:\n\n\""_s;
    EXPECT_EQ(messages.shown[0].text, text + ItemFile(document, u"gone.pdf"_s) + u'"');
    EXPECT_EQ(messages.shown[1].text, text + gonePath + u'"');
    EXPECT_EQ(messages.shown[1].caption, u"File Not Found"_s);
    EXPECT_EQ(messages.shown[1].style, 0x30u);
    for (const QString& id : {document, linked})
        EXPECT_TRUE(CatalogValue(id, u"open"_s).isNull());
    EXPECT_FALSE(Item(linked)->IsOpen());
    EXPECT_FALSE(model->IsChanged());
    EXPECT_TRUE(launcher.starts.isEmpty());
    EXPECT_TRUE(hub.calls.isEmpty());
}

// Older catalogs name no file for a note: it is the note file of the item's folder.
TEST_F(OpeningTest, ANoteWithoutAFileNameOpensItsNoteFile) {
    const QString older = Add(u"note"_s);
    const QString empty = Add(u"note"_s, u"root"_s, {{u"filename"_s, u""_s}});
    WNavDS* model = Load();
    for (const QString& id : {older, empty}) {
        WriteItemFile(id, u"note.htm"_s);
        model->OpenItem(Item(id), true);
        EXPECT_TRUE(Item(id)->IsOpen());
        EXPECT_EQ(launcher.starts.value(0).arguments.value(0), ItemFile(id));
        launcher.starts.clear();
    }
    EXPECT_TRUE(messages.shown.isEmpty());
}

TEST_F(OpeningTest, CloseAllOpenNotesClosesOnlyNotes) {
    const QString note = Note();
    const QString document = Pdf();
    WNavDS* model = Load();
    // Nothing open: only the change flag is raised.
    model->SetChanged(false);
    model->CloseAllOpenNotes();
    EXPECT_TRUE(model->IsChanged());
    EXPECT_TRUE(CatalogValue(note, u"open"_s).isNull());

    model->OpenItem(Item(note), true);
    model->OpenItem(Item(document), true);
    model->CloseAllOpenNotes();
    EXPECT_EQ(CatalogValue(note, u"open"_s), u"false"_s);
    EXPECT_TRUE(Item(document)->IsOpen());
    ASSERT_EQ(hub.calls.size(), 1);
    EXPECT_EQ(hub.calls[0].operation, u"UpdateNoteProperties"_s);
}

TEST_F(OpeningTest, OpenAllAndCloseAllReachEveryLevelButDeletedAndLinkedItems) {
    const QString outer = Folder();
    const QString inner = Folder(outer);
    const QString deep = Note(inner);
    const QString shallow = Note(outer);
    const QString deleted = Note(outer, kDeleted);
    const QString linked = Linked(WriteFile(u"docs/linked.pdf"_s, "pdf"), 1);
    const QString outside = Note();
    WNavDS* model = Load();

    model->SelectItem(model->GetNotebook());
    model->OpenAllInSelectedFolder();
    EXPECT_EQ(launcher.starts.size(), 3);
    for (const QString& id : {deleted, linked})
        EXPECT_TRUE(CatalogValue(id, u"open"_s).isNull());
    // The last item opened, in catalog order, ends up selected.
    EXPECT_EQ(model->GetSelected(), Item(outside));

    model->CloseTree(inner);
    EXPECT_EQ(CatalogValue(deep, u"open"_s), u"false"_s);
    EXPECT_TRUE(Item(shallow)->IsOpen());
    model->CloseAllInFolder(outer);
    EXPECT_FALSE(Item(shallow)->IsOpen());
    EXPECT_TRUE(Item(outside)->IsOpen());
}

TEST_F(OpeningTest, SendingAFolderWithNoNotesLeftToSendIsRefused) {
    const QString folder = Folder();
    const QString first = Note(folder);
    Pdf(folder);
    const QString second = Note(Folder(folder));
    const QString allDeleted = Folder();
    Note(allDeleted, kDeleted);
    WNavDS* model = Load();

    QStringList paths;
    model->CollectNotePaths(folder, &paths);
    EXPECT_EQ(paths, (QStringList{ItemFile(first), ItemFile(second)}));
    paths.clear();
    model->CollectNotePaths(allDeleted, &paths);
    EXPECT_TRUE(paths.isEmpty());

    NavigatorSettings::Instance()->SetShowAllTypes(false);
    NavigatorSettings::Instance()->SetShowPdf(true);
    model->CollectNotePaths(folder, &paths);
    EXPECT_TRUE(paths.isEmpty());

    // The user is told, and no word processor is started.
    EXPECT_NE(model->SendItemTo(folder, ConfigureWordProcessor()), S_OK);
    EXPECT_TRUE(launcher.starts.isEmpty());
    ASSERT_EQ(messages.shown.size(), 1);
    EXPECT_EQ(messages.shown[0].text, u"Quillmark Ambrel could not complete the action."_s);
    EXPECT_EQ(messages.shown[0].caption, u"Quillmark Ambrel"_s);
    EXPECT_EQ(messages.shown[0].style, 0x11030u);
}

TEST_F(OpeningTest, SendingHandsNotesAndCopiesOfDocumentsToTheWordProcessor) {
    const QString note = Note();
    const QString document = Pdf();
    WNavDS* model = Load();
    const QString program = ConfigureWordProcessor();
    model->SelectById(note);
    model->SendSelectedToWordProcessor();
    ASSERT_EQ(launcher.starts.size(), 1);
    EXPECT_EQ(launcher.starts[0].program, program);
    EXPECT_EQ(launcher.starts[0].arguments, QStringList{ItemFile(note)});

    // A document of the notebook goes as a copy, so its own file is not a path to write to.
    const QByteArray tmpdir = qgetenv("TMPDIR");
    qputenv("TMPDIR", QFile::encodeName(Home()));
    EXPECT_EQ(model->SendItemTo(document, program), S_OK);
    tmpdir.isNull() ? qunsetenv("TMPDIR") : qputenv("TMPDIR", tmpdir);
    ASSERT_EQ(launcher.starts.size(), 2);
    const QString sent = launcher.starts[1].arguments.value(0);
    EXPECT_NE(sent, ItemFile(document, u"paper.pdf"_s));
    EXPECT_TRUE(sent.endsWith(u"/paper.pdf"_s));
}

TEST_F(OpeningTest, OpeningByIdForgetsAnIdTheNotebookLost) {
    const QString note = Note();
    const QString deleted = Note(u"root"_s, kDeleted);
    WNavDS* model = Load();
    ReleasePtr<IItemLink> notes(GetNoteToolLink(host.get()));
    ReleasePtr<IItemLink> documents(GetViewerLink(host.get()));
    for (const QString& id : {kLostId, deleted, note})
        notes->AnnounceItem(id, u"title"_s);
    documents->AnnounceItem(kLostId, u"title"_s);

    model->OpenById(kLostId.toLower());
    model->OpenById(deleted);
    model->OpenById(note);
    ASSERT_EQ(notes->Items().size(), 1);
    EXPECT_EQ(notes->Items()[0].itemId, note);
    EXPECT_TRUE(documents->Items().isEmpty());
    EXPECT_FALSE(Item(deleted)->IsOpen());
    EXPECT_EQ(model->GetSelected(), Item(note));
    EXPECT_TRUE(messages.shown.isEmpty());
}

TEST_F(OpeningTest, WaitingForWindowsGivesUpOnOneThatNeverCloses) {
    const QString note = Note();
    const QString document = Pdf();
    WNavDS* model = Load();
    INoteToolService* noteTool = model->GetNoteToolService();
    windows.alive = {11, 22};
    noteTool->OnNoteWindowOpened(note, 11);
    model->GetViewerService()->OnDocumentWindowOpened(document, 22);

    // The note tool's report of its closed window arrives through an idle pass.
    int idlePasses = 0;
    model->SetIdlePassHook([&] {
        if (++idlePasses == 2)
            noteTool->RemoveWindow(note, 0);
    });
    model->CloseAllWindowsAndWait(std::chrono::milliseconds(400));

    ASSERT_EQ(windows.requests.size(), 2);
    EXPECT_EQ(windows.requests[0].operation, u"Close"_s);
    EXPECT_EQ(windows.requests[1].window, 22);
    EXPECT_GE(idlePasses, 3);
    int count = -1;
    model->GetViewerService()->GetWindowCount(&count);
    EXPECT_EQ(count, 1);
}

} // namespace
