#include "common/ReleasePtr.h"
#include "libs/toolwell/IDataStoreHost.h"
#include "messaging/CCloseAllWindows.h"
#include "messaging/CNoteToolService.h"
#include "messaging/CWindowService.h"
#include "support/AmbrelTest.h"
#include "support/RecordingForeignWindows.h"
#include "support/RecordingItemWindowHub.h"
#include "support/RecordingProcessLauncher.h"

namespace {

const QString kNote = QStringLiteral("11111111-2222-3333-4444-555555555555");

class NoteToolServiceTest : public AmbrelTest {
protected:
    void SetUp() override {
        AmbrelTest::SetUp();
        CNoteToolService::ResetInstance();
        Platform::SetProcessLauncher(&launcher);
        Platform::SetForeignWindows(&windows);
        SetItemWindowHub(&hub);
        service = CNoteToolService::GetInstance();
        service->SetProgramFolder(QStringLiteral("/opt/Ambrel Bin"));
    }
    void TearDown() override {
        SetItemWindowHub(nullptr);
        Platform::SetForeignWindows(nullptr);
        service->Release();
        CNoteToolService::ResetInstance();
        AmbrelTest::TearDown();
    }

    QString DefaultTitle(HRESULT expected) {
        QString text;
        UnicodeStringPtr sink(&text);
        EXPECT_EQ(service->GetDefaultNoteTitle(&sink), expected);
        return text;
    }

    RecordingProcessLauncher launcher;
    RecordingForeignWindows windows;
    RecordingItemWindowHub hub;
    INoteToolService* service = nullptr;
};

TEST_F(NoteToolServiceTest, NotePathAndPropertyTextAreSeparateArguments) {
    const QString path = QStringLiteral("/home/a b/Catalog/") + kNote + QStringLiteral("/note.htm");
    const QString properties = QStringLiteral("title|My \"first\" note|type|note|");

    EXPECT_EQ(service->OpenNote(path, properties), S_OK);
    EXPECT_EQ(service->OpenNote(path, QString()), S_OK);
    ASSERT_EQ(launcher.starts.size(), 2);
    EXPECT_EQ(launcher.starts[0].program, QStringLiteral("/opt/Ambrel Bin/AmbrelNoteTool"));
    EXPECT_EQ(launcher.starts[0].arguments,
              QStringList({path, QStringLiteral("/PROPERTY"), properties}));
    EXPECT_EQ(launcher.starts[1].arguments, QStringList({path}));
    launcher.succeed = false;
    EXPECT_EQ(service->OpenNote(path, properties), E_FAIL);
}

TEST_F(NoteToolServiceTest, ActivationWaitsForTheWindowReport) {
    EXPECT_EQ(service->ActivateNote(kNote.toLower()), S_OK);
    EXPECT_TRUE(hub.calls.isEmpty());

    service->OnNoteWindowOpened(kNote, 77);
    ASSERT_EQ(hub.calls.size(), 1);
    EXPECT_EQ(hub.calls[0].operation, QStringLiteral("ActivateNote"));

    // Reported again later (the note reopened): nothing is waiting any more.
    service->RemoveWindow(kNote.toLower(), 0);
    service->OnNoteWindowOpened(kNote, 78);
    EXPECT_EQ(hub.calls.size(), 1);
}

TEST_F(NoteToolServiceTest, CloseAllAsksEveryWindowToCloseAndReturnsAtOnce) {
    service->OnNoteWindowOpened(QStringLiteral("a"), 1);
    service->OnNoteWindowOpened(QStringLiteral("b"), 2);
    service->OnNoteWindowOpened(QStringLiteral("B"), 3); // the same note as "b"

    CCloseAllWindows closeAll;
    EXPECT_EQ(service->ForEachWindow(&closeAll), S_OK);
    ASSERT_EQ(windows.requests.size(), 2);
    EXPECT_EQ(windows.requests[0].operation, QStringLiteral("Close"));
    EXPECT_EQ(windows.requests[0].window, 1);
    EXPECT_EQ(windows.requests[1].window, 3);
}

TEST_F(NoteToolServiceTest, WindowServiceActsOnlyOnLiveWindows) {
    EXPECT_EQ(service->GetWindowService(kNote), nullptr);
    service->OnNoteWindowOpened(kNote, 5);
    ReleasePtr<IWindowService> window(service->GetWindowService(kNote.toLower()));
    ASSERT_NE(window, nullptr);

    EXPECT_EQ(window->BringToFront(), E_FAIL);
    EXPECT_TRUE(windows.requests.isEmpty());

    windows.alive.insert(5);
    EXPECT_EQ(window->BringToFront(), S_OK);
    EXPECT_EQ(window->Show(Platform::ShowCommand::Restore), S_OK);
    ASSERT_EQ(windows.requests.size(), 2);
    EXPECT_EQ(windows.requests[1].showCommand, Platform::ShowCommand::Restore);
}

TEST_F(NoteToolServiceTest, DefaultTitleComesFromTheLanguageFile) {
    service->SetLanguageFolder(Home() + QStringLiteral("/Languages/EN/Programs/"));
    DefaultTitle(E_FAIL); // no language file
    WriteFile(QStringLiteral("Languages/EN/Programs/NoteToolIntl.lang"),
              "99=Other\r\n100=Untitled = draft\r\n");
    EXPECT_EQ(DefaultTitle(S_OK), QStringLiteral("Untitled = draft"));
    WriteFile(QStringLiteral("Languages/EN/Programs/NoteToolIntl.lang"), "101=Other\n");
    DefaultTitle(E_FAIL);
}

TEST_F(NoteToolServiceTest, NoteFolderAndFileName) {
    ReleasePtr<IDataStoreHost> host(GetDataStoreHost());
    QString path;
    AppendUnicodeStringPtr sink(&path);
    ASSERT_EQ(service->GetNoteFolder(host.get(), kNote, &sink), S_OK);
    ASSERT_EQ(service->GetNoteFileName(&sink), S_OK);
    EXPECT_EQ(path,
              AppDataFolder() + QStringLiteral("/Catalog/") + kNote + QStringLiteral("/note.htm"));

    // An identifier from outside never becomes a path that leaves the notebook.
    path.clear();
    EXPECT_EQ(service->GetNoteFolder(host.get(), QStringLiteral("../x"), &sink), E_INVALIDARG);
    EXPECT_TRUE(path.isEmpty());
}

} // namespace
