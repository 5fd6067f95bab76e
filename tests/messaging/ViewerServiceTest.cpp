#include "dataexchange/WProperties.h"
#include "libs/toolwell/IItemWindowHub.h"
#include "messaging/CViewerService.h"
#include "messaging/SearchForViewerFile.h"
#include "support/AmbrelTest.h"
#include "support/RecordingItemWindowHub.h"
#include "support/RecordingProcessLauncher.h"

#include <QDir>

namespace {

const QString kItem = QStringLiteral("0A1B2C3D-4E5F-6071-8293-A4B5C6D7E8F9");
const QString kItemLower = kItem.toLower();

class ViewerServiceTest : public AmbrelTest {
protected:
    void SetUp() override {
        AmbrelTest::SetUp();
        CViewerService::ResetInstance();
        Platform::SetProcessLauncher(&launcher);
        SetItemWindowHub(&hub);
        service = CViewerService::GetInstance();
        service->SetProgramFolder(QStringLiteral("/opt/Ambrel Bin"));
    }
    void TearDown() override {
        SetItemWindowHub(nullptr);
        service->Release();
        CViewerService::ResetInstance();
        AmbrelTest::TearDown();
    }

    RecordingProcessLauncher launcher;
    RecordingItemWindowHub hub;
    IViewerService* service = nullptr;
};

TEST_F(ViewerServiceTest, CommandLineHasOpenSwitchOnlyForAnExistingFile) {
    const QString existing = WriteFile(QStringLiteral("My Files/report one.pdf"), "%PDF");
    const QString missing = Home() + QStringLiteral("/gone.pdf");

    EXPECT_EQ(service->OpenDocument(kItem, existing), S_OK);
    EXPECT_EQ(service->OpenDocument(QStringLiteral("B"), missing), S_OK);
    EXPECT_EQ(service->OpenDocument(QStringLiteral("C"), QString()), S_OK);

    ASSERT_EQ(launcher.starts.size(), 3);
    EXPECT_EQ(launcher.starts[0].program, QStringLiteral("/opt/Ambrel Bin/AmbrelViewer"));
    EXPECT_EQ(launcher.starts[0].arguments,
              QStringList({QStringLiteral("/o"), QStringLiteral("/id:") + kItem}));
    EXPECT_EQ(launcher.starts[1].arguments, QStringList({QStringLiteral("/id:B")}));
    EXPECT_EQ(launcher.starts[2].arguments, QStringList({QStringLiteral("/id:C")}));

    // A start that fails leaves no file waiting for the item's window.
    launcher.succeed = false;
    EXPECT_EQ(service->OpenDocument(QStringLiteral("D"), existing), E_FAIL);
    service->OnDocumentWindowOpened(QStringLiteral("D"), 9);
    EXPECT_TRUE(hub.calls.isEmpty());
}

TEST_F(ViewerServiceTest, FirstWindowReportHandsTheFileOverAndTheNextOneRecordsTheWindow) {
    const QString path = WriteFile(QStringLiteral("a.pdf"), "%PDF");
    ASSERT_EQ(service->OpenDocument(kItem, path), S_OK);

    EXPECT_EQ(service->OnDocumentWindowOpened(kItemLower, 41), S_OK);
    ASSERT_EQ(hub.calls.size(), 1);
    EXPECT_EQ(hub.calls[0].operation, QStringLiteral("OpenDocumentInViewer"));
    EXPECT_EQ(hub.calls[0].path, path);
    EXPECT_EQ(service->FindWindow(kItem, nullptr), S_FALSE);

    service->OnDocumentWindowOpened(kItem, 41);
    Platform::WindowHandle window = 0;
    EXPECT_EQ(service->FindWindow(kItemLower, &window), S_OK);
    EXPECT_EQ(window, 41);
    EXPECT_EQ(hub.calls.size(), 1);
}

TEST_F(ViewerServiceTest, RequestingViewerShowsTheFileWithoutANewProcessOnce) {
    const QString path = WriteFile(QStringLiteral("b.qmd"), "x");
    service->OnDocumentWindowOpened(kItem, 12);
    EXPECT_EQ(service->SetRequestingViewer(QString()), E_FAIL);
    EXPECT_EQ(service->SetRequestingViewer(QStringLiteral("VIEWER-1")), S_OK);

    service->OpenDocument(kItem, path);
    EXPECT_TRUE(launcher.starts.isEmpty());
    ASSERT_EQ(hub.calls.size(), 1);
    EXPECT_EQ(hub.calls[0].viewerId, QStringLiteral("VIEWER-1"));
    EXPECT_EQ(hub.calls[0].path, path);
    // The old window of the item no longer shows it.
    EXPECT_EQ(service->FindWindow(kItem, nullptr), S_FALSE);

    EXPECT_EQ(service->OpenDocument(kItem, path), S_OK);
    EXPECT_EQ(launcher.starts.size(), 1);
}

TEST_F(ViewerServiceTest, ActivationBeforeTheWindowHappensWhenItIsReported) {
    service->ActivateDocument(kItemLower);
    EXPECT_TRUE(hub.calls.isEmpty());

    service->OnDocumentWindowOpened(kItem, 3);
    ASSERT_EQ(hub.calls.size(), 1);
    EXPECT_EQ(hub.calls[0].operation, QStringLiteral("ActivateDocument"));

    // Once shown, activation goes straight to the hub and nothing waits any more.
    service->ActivateDocument(kItem);
    service->RemoveWindow(kItemLower, 0);
    service->OnDocumentWindowOpened(kItem, 4);
    EXPECT_EQ(hub.calls.size(), 2);
}

TEST_F(ViewerServiceTest, EveryAccessorCallHoldsAReference) {
    IViewerService* second = CViewerService::GetInstance();
    service->OnDocumentWindowOpened(kItem, 1);
    EXPECT_EQ(second->Release(), 1u);
    EXPECT_EQ(service->FindWindow(kItem, nullptr), S_OK);
    EXPECT_EQ(service->Release(), 0u);

    service = CViewerService::GetInstance();
    EXPECT_EQ(service->FindWindow(kItem, nullptr), S_FALSE);
}

TEST(SearchForViewerFileTest, ComparesAbsoluteCleanPathsCaseSensitively) {
    SearchForViewerFile search;
    search.SetTarget(QStringLiteral("/data/docs/../docs/Plan.pdf"));
    EXPECT_EQ(search.Target(), QStringLiteral("/data/docs/Plan.pdf"));

    auto visit = [&search](const QString& path) {
        DataExchange::IProperties* set = DataExchange::CreateProperties();
        if (!path.isNull())
            set->SetProperty(QStringLiteral("path"), path);
        const bool found = search.Visit(set);
        set->Release();
        return found;
    };
    EXPECT_TRUE(visit(QStringLiteral("/data//docs/./Plan.pdf")));
    EXPECT_FALSE(visit(QStringLiteral("/data/docs/plan.pdf")));
    EXPECT_FALSE(visit(QString()));

    search.SetTarget(QDir::current().absoluteFilePath(QStringLiteral("x.pdf")));
    EXPECT_TRUE(visit(QStringLiteral("x.pdf")));
}

} // namespace
