#include "support/AmbrelTest.h"
#include "support/FakeNavigatorBroker.h"
#include "support/NavigatorProcess.h"

#include <QDir>
#include <QFile>
#include <QThread>

#include <csignal>
#include <memory>

namespace {

class InstanceTest : public AmbrelTest {
protected:
    QString CatalogFolder() const { return AppDataFolder() + QStringLiteral("/Catalog"); }

    // The notes on disk: item folders holding a note file.
    int NoteCount() const {
        int count = 0;
        const QDir catalog(CatalogFolder());
        for (const QString& folder : catalog.entryList(QDir::Dirs | QDir::NoDotAndDotDot))
            count += QFile::exists(catalog.filePath(folder) + QStringLiteral("/note.htm")) ? 1 : 0;
        return count;
    }

    // The item folders on disk (a note's folder is made with its catalog item).
    int ItemFolderCount() const {
        return static_cast<int>(
            QDir(CatalogFolder()).entryList(QDir::Dirs | QDir::NoDotAndDotDot).size());
    }

    // The processes' states are only brought up to date by their events.
    static bool WaitFor(const std::function<bool()>& condition, int timeoutMs = 10000) {
        return WaitForEvents(condition, timeoutMs);
    }
};

TEST_F(InstanceTest, NewNoteFromFileMakesTheNoteAndRemovesTheFile) {
    const QString source = WriteFile(QStringLiteral("clip.txt"), "handed over text");
    NavigatorProcess navigator(Home());
    navigator.Start({QStringLiteral("/NewNoteFromFile"), source});
    ASSERT_TRUE(navigator.WaitUntilRunning());
    EXPECT_TRUE(WaitFor([&] { return !QFile::exists(source); }));
    ASSERT_TRUE(navigator.Terminate());
    EXPECT_EQ(navigator.Process().exitCode(), 0);
    EXPECT_EQ(NoteCount(), 1);
    EXPECT_TRUE(CatalogFileText().contains(QStringLiteral("<type>note</type>")));
}

TEST_F(InstanceTest, ASecondStartHandsItsNoteToTheRunningNavigator) {
    NavigatorProcess navigator(Home());
    navigator.Start();
    ASSERT_TRUE(navigator.WaitUntilRunning());
    const int before = ItemFolderCount();

    EXPECT_EQ(navigator.RunToEnd({QStringLiteral("-newnote")}), 0);
    EXPECT_TRUE(WaitFor([&] { return ItemFolderCount() == before + 1; }));
    EXPECT_EQ(navigator.Process().state(), QProcess::Running);
    ASSERT_TRUE(navigator.Terminate());
}

// A start is answered once its command line is queued: an earlier start's action that waits for
// the user does not make it fail.
TEST_F(InstanceTest, StartsAreAnsweredWhileAnEarlierStartsActionWaitsForTheUser) {
    NavigatorProcess navigator(Home());
    navigator.Start();
    ASSERT_TRUE(navigator.WaitUntilRunning());
    // No note can be made from a text file that is not there: a message says so and waits.
    const QStringList startsInARow[] = {
        {QStringLiteral("/NewNoteFromFile"), Home() + QStringLiteral("/missing.txt")},
        {QStringLiteral("/NewNote")},
        {QStringLiteral("/NewNote")},
    };
    for (const QStringList& arguments : startsInARow)
        EXPECT_EQ(navigator.RunToEnd(arguments, 8000), 0) << arguments.join(u' ').toStdString();
    // Only the item of the note that waits for the message is there: the later notes wait
    // their turn behind it.
    QThread::msleep(500);
    EXPECT_EQ(ItemFolderCount(), 1);
    EXPECT_EQ(navigator.Process().state(), QProcess::Running);
}

TEST_F(InstanceTest, StartsAtTheSameMomentGiveOneNavigator) {
    constexpr int kStarts = 5;
    std::vector<std::unique_ptr<NavigatorProcess>> starts;
    for (int i = 0; i < kStarts; ++i) {
        starts.push_back(std::make_unique<NavigatorProcess>(Home()));
        starts.back()->Start({QStringLiteral("/NewNote")});
    }
    // Four hand over and end; one stays.
    ASSERT_TRUE(WaitFor(
        [&] {
            int ended = 0;
            for (const auto& start : starts)
                ended += start->Process().state() == QProcess::NotRunning ? 1 : 0;
            return ended == kStarts - 1;
        },
        30000));
    NavigatorProcess* running = nullptr;
    for (const auto& start : starts) {
        if (start->Process().state() == QProcess::Running)
            running = start.get();
        else
            EXPECT_EQ(start->Process().exitCode(), 0);
    }
    ASSERT_NE(running, nullptr);
    // Every start's note was made, the navigator's own included.
    EXPECT_TRUE(WaitFor([&] { return ItemFolderCount() == kStarts; })) << ItemFolderCount();
    ASSERT_TRUE(running->Terminate());
    EXPECT_EQ(running->Process().exitCode(), 0);
}

TEST_F(InstanceTest, TheNextStartAfterACrashBecomesTheNavigator) {
    {
        NavigatorProcess crashed(Home());
        crashed.Start();
        ASSERT_TRUE(crashed.WaitUntilRunning());
        crashed.Process().kill();
        ASSERT_TRUE(crashed.Process().waitForFinished(5000));
    }
    NavigatorProcess next(Home());
    next.Start();
    ASSERT_TRUE(next.WaitUntilRunning()) << "the crashed navigator's lock or socket stayed";
    EXPECT_EQ(next.RunToEnd({QStringLiteral("/NewNote")}), 0);
    ASSERT_TRUE(next.Terminate());
}

TEST_F(InstanceTest, ViewDocumentWithAnAbsolutePathLinksThatDocument) {
    const QString document = WriteFile(QStringLiteral("papers/report one.pdf"), "%PDF-1.4");
    NavigatorProcess navigator(Home());
    navigator.Start({QStringLiteral("/ViewDocument"), document});
    ASSERT_TRUE(navigator.WaitUntilRunning());
    ASSERT_TRUE(navigator.Terminate());
    EXPECT_TRUE(
        CatalogFileText().contains(QStringLiteral("<path>") + document + QStringLiteral("</path>")))
        << CatalogFileText().toStdString();
}

TEST_F(InstanceTest, ANavigatorThatDoesNotAnswerIsReportedNotReplaced) {
    NavigatorProcess navigator(Home());
    navigator.Start();
    ASSERT_TRUE(navigator.WaitUntilRunning());
    const auto pid = static_cast<pid_t>(navigator.Process().processId());
    ::kill(pid, SIGSTOP);
    const int code = navigator.RunToEnd({QStringLiteral("/NewNote")}, 30000);
    ::kill(pid, SIGCONT);
    EXPECT_EQ(code, 1);
    EXPECT_EQ(ItemFolderCount(), 0) << "the refused start's note was made after all";
    ASSERT_TRUE(navigator.Terminate());
}

} // namespace
