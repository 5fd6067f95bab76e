#include "app/CNavigatorCmdLineInfo.h"
#include "app/ForwardedCommandLine.h"

#include "RecordingStartActions.h"
#include "support/AmbrelTest.h"

#include <QDir>

namespace {

using namespace Qt::StringLiterals;
using Case = std::pair<const char*, const char*>;

TEST(CommandLineTest, EachCommandLineRunsItsActionsInTheFixedOrder) {
    // A command line handed over, its arguments parted by "|", and the actions it runs.
    const Case cases[] = {
        {"p|-vIeWdOcUmEnT|/home/me/My Notes/a.pdf", "ViewDocument(/home/me/My Notes/a.pdf)"},
        {"/NewNote", ""}, // the program, even though it looks like a switch
        // After "/" only the navigator's own switch names are switches; the rest are paths.
        {"p|/ViewDocument|/NewNote/a.txt", "ViewDocument(/NewNote/a.txt)"},
        // A file switch as the last parameter, or followed by any switch, gets no file.
        {"p|/NewNoteFromFile", ""},
        {"p|/ViewDocument|-x|/tmp/a.pdf", ""},
        {"p|/NewNoteFromFile|/NewNote|/tmp/a.txt", "NewNote"},
        // An empty argument takes the place of the file.
        {"p|/ViewDocument||/home/me/a.pdf", ""},
        {"p||/NewNote", "NewNote"},
        // The recent item is the last plain parameter, even a file meant for another switch.
        {"p|/OpenMRUItem|FIRST|SECOND", "OpenRecentItem(SECOND)"},
        {"p|/OpenMRUItem|ITEM|/NewNoteFromFile|/tmp/a.txt",
         "NewNoteFromFile(/tmp/a.txt)|OpenRecentItem(/tmp/a.txt)"},
        // Alone it still runs: the item link forgets nothing for an empty identifier.
        {"p|/OpenMRUItem", "OpenRecentItem()"},
        // Viewing and a note from a file share one file argument; viewing empties it.
        {"p|/ViewDocument|/tmp/a.pdf|/NewNoteFromFile|/tmp/b.txt",
         "ViewDocument(/tmp/b.txt)|NewNoteFromFile()"},
        {"p|/OpenDocument|/SnapShotToNewNote|/NewNoteFromFile|/tmp/a.txt|/NewNote|/OpenMRUItem|ID",
         "NewNote|OpenDocument|NewNoteFromFile(/tmp/a.txt)|SnapshotToNewNote|OpenRecentItem(ID)"},
        {"p|/dQMO", ""}, // left to start-up
    };
    for (const auto& [arguments, actions] : cases) {
        RecordingStartActions recorded;
        RunForwardedCommandLine(QString::fromUtf8(arguments).split(u'|'), recorded);
        EXPECT_EQ(recorded.calls.join(u'|'), QString::fromUtf8(actions)) << arguments;
    }
}

TEST(CommandLineTest, StartActionsRunOnlyOnceAndQmoIsLeftToStartUp) {
    CNavigatorCmdLineInfo info;
    ParseCommandLine(info, {u"prog"_s, u"/dQMO"_s, u"/NewNote"_s});
    RecordingStartActions actions;
    RunStartActions(info, actions);
    RunStartActions(info, actions);
    EXPECT_EQ(actions.calls, QStringList{u"NewNote"_s});
    EXPECT_TRUE(info.Qmo());
}

class FileArgumentsTest : public AmbrelTest {};

TEST_F(FileArgumentsTest, FileArgumentsAreMadeAbsoluteAgainstThisStartsFolder) {
    // The running navigator has a folder of its own, where a file of the same name may lie:
    // a file that does not exist here must not name that one.
    const QString file = WriteFile(u"work/my note.txt"_s, "text");
    const QString saved = QDir::currentPath();
    ASSERT_TRUE(QDir::setCurrent(Home() + u"/work"_s));
    const QStringList made = MakeFileArgumentsAbsolute(
        {u"prog"_s, u"/NewNoteFromFile"_s, u"my note.txt"_s, u"/OpenMRUItem"_s, u"x"_s,
         u"-viewdocument"_s, u"../gone.pdf"_s, u"y"_s, u"/NewNoteFromFile"_s, u"/etc/a.txt"_s});
    QDir::setCurrent(saved);
    EXPECT_EQ(made, (QStringList{u"prog"_s, u"/NewNoteFromFile"_s, file, u"/OpenMRUItem"_s, u"x"_s,
                                 u"-viewdocument"_s, Home() + u"/work/../gone.pdf"_s, u"y"_s,
                                 u"/NewNoteFromFile"_s, u"/etc/a.txt"_s}));
}

} // namespace
