#include "app/CNavigatorCmdLineInfo.h"
#include "app/ForwardedCommandLine.h"

#include "RecordingStartActions.h"
#include "support/AmbrelTest.h"

#include <QDir>

#include <gtest/gtest.h>

namespace {

// The navigator's own command line: the program first, then `arguments` split on commas.
CNavigatorCmdLineInfo Parse(const QString& arguments) {
    QStringList list{QStringLiteral("/usr/bin/ambrel-navigator")};
    if (!arguments.isEmpty())
        list += arguments.split(u',');
    CNavigatorCmdLineInfo info;
    ParseCommandLine(info, list);
    return info;
}

QStringList RunActions(CNavigatorCmdLineInfo& info) {
    RecordingStartActions actions;
    RunStartActions(info, actions);
    return actions.calls;
}

QStringList RunForwarded(const QString& text) {
    RecordingStartActions actions;
    RunForwardedCommandLine(text, actions);
    return actions.calls;
}

TEST(CommandLineTest, SwitchesMatchInAnyCaseWithDashOrSlash) {
    auto view = Parse(QStringLiteral("-vIeWdOcUmEnT,/home/me/My Notes/a.pdf"));
    EXPECT_TRUE(view.HasAction());
    EXPECT_EQ(RunActions(view),
              QStringList{QStringLiteral("ViewDocument(/home/me/My Notes/a.pdf)")});

    auto note = Parse(QStringLiteral("/NEWNOTEFROMFILE,/tmp/clip.txt"));
    EXPECT_EQ(RunActions(note), QStringList{QStringLiteral("NewNoteFromFile(/tmp/clip.txt)")});

    auto snapshot = Parse(QStringLiteral("/snapshottonewnote"));
    EXPECT_TRUE(snapshot.SnapshotToNewNote());
    EXPECT_TRUE(snapshot.HasAction());
}

TEST(CommandLineTest, OnlyNavigatorSwitchNamesAfterASlashAreSwitches) {
    // An absolute path that happens to end in a switch name is still a path.
    auto info = Parse(QStringLiteral("/ViewDocument,/NewNote/a.txt"));
    EXPECT_FALSE(info.NewNote());
    EXPECT_EQ(info.FileArgument(), QStringLiteral("/NewNote/a.txt"));

    EXPECT_TRUE(IsSwitchToken(QStringLiteral("/dqmo")));
    EXPECT_TRUE(IsSwitchToken(QStringLiteral("-anything")));
    EXPECT_FALSE(IsSwitchToken(QStringLiteral("/home/me/NewNote")));
    EXPECT_FALSE(IsSwitchToken(QStringLiteral("/NewNotes")));
    EXPECT_FALSE(IsSwitchToken(QString()));

    // Any flag, even an unknown one, ends the wait for a file.
    auto interrupted = Parse(QStringLiteral("/ViewDocument,-x,/tmp/a.pdf"));
    EXPECT_FALSE(interrupted.ViewDocument());
    EXPECT_FALSE(interrupted.HasAction());
}

TEST(CommandLineTest, AFileSwitchWithoutItsFileYieldsNoAction) {
    for (const QString& line : {QStringLiteral("/NewNoteFromFile"), QStringLiteral("/ViewDocument"),
                                QStringLiteral("/ViewDocument,/NewNoteFromFile")}) {
        auto info = Parse(line);
        EXPECT_FALSE(info.NewNoteFromFile()) << line.toStdString();
        EXPECT_FALSE(info.ViewDocument()) << line.toStdString();
        EXPECT_FALSE(info.HasAction()) << line.toStdString();
        EXPECT_TRUE(RunActions(info).isEmpty()) << line.toStdString();
    }

    // A switch between the file switch and the file leaves the file unclaimed.
    auto info = Parse(QStringLiteral("/NewNoteFromFile,/NewNote,/tmp/a.txt"));
    EXPECT_EQ(RunActions(info), QStringList{QStringLiteral("NewNote")});
}

TEST(CommandLineTest, TheRecentItemIsTheLastPlainParameter) {
    auto two = Parse(QStringLiteral("/OpenMRUItem,FIRST,SECOND"));
    EXPECT_TRUE(two.HasAction());
    EXPECT_EQ(RunActions(two), QStringList{QStringLiteral("OpenRecentItem(SECOND)")});

    // Even a file meant for another switch replaces it.
    auto mixed = Parse(QStringLiteral("/OpenMRUItem,ITEM,/NewNoteFromFile,/tmp/a.txt"));
    EXPECT_EQ(mixed.RecentItem(), QStringLiteral("/tmp/a.txt"));
    EXPECT_EQ(mixed.FileArgument(), QStringLiteral("/tmp/a.txt"));

    auto alone = Parse(QStringLiteral("/OpenMRUItem"));
    EXPECT_TRUE(alone.OpenRecentItem());
    EXPECT_TRUE(alone.RecentItem().isEmpty());
    EXPECT_FALSE(alone.HasAction());
    // Still pending: the item link forgets nothing for an empty identifier.
    EXPECT_EQ(RunActions(alone), QStringList{QStringLiteral("OpenRecentItem()")});
}

TEST(CommandLineTest, QmoIsLeftToStartUp) {
    auto info = Parse(QStringLiteral("/dQMO"));
    EXPECT_TRUE(info.Qmo());
    EXPECT_TRUE(info.HasAction());
    EXPECT_TRUE(RunActions(info).isEmpty());
    EXPECT_TRUE(info.Qmo());

    EXPECT_TRUE(RunForwarded(QStringLiteral("ambrel-navigator /dQMO")).isEmpty());
}

TEST(CommandLineTest, StartActionsRunInTheirOrderOnlyOnce) {
    auto info = Parse(QStringLiteral(
        "/OpenDocument,/SnapShotToNewNote,/NewNoteFromFile,/tmp/a.txt,/NewNote,/OpenMRUItem,ID"));
    EXPECT_EQ(
        RunActions(info),
        (QStringList{QStringLiteral("NewNote"), QStringLiteral("OpenDocument"),
                     QStringLiteral("NewNoteFromFile(/tmp/a.txt)"),
                     QStringLiteral("SnapshotToNewNote"), QStringLiteral("OpenRecentItem(ID)")}));
    EXPECT_TRUE(RunActions(info).isEmpty());
}

TEST(CommandLineTest, ViewingUsesTheOneFileArgumentBeforeANoteFromFile) {
    // Both switches share the file argument; viewing comes first and empties it.
    auto info = Parse(QStringLiteral("/ViewDocument,/tmp/a.pdf,/NewNoteFromFile,/tmp/b.txt"));
    EXPECT_EQ(RunActions(info), (QStringList{QStringLiteral("ViewDocument(/tmp/b.txt)"),
                                             QStringLiteral("NewNoteFromFile()")}));
}

TEST(ForwardedCommandLineTest, SplitsOnBlanksKeepingEmptyTokensAndQuotedParts) {
    const struct {
        QString text;
        QStringList tokens;
    } cases[] = {
        {QString(), {}},
        {QStringLiteral("prog /NewNote"), {QStringLiteral("prog"), QStringLiteral("/NewNote")}},
        {QStringLiteral("a  b"), {QStringLiteral("a"), QString(), QStringLiteral("b")}},
        {QStringLiteral(" a"), {QString(), QStringLiteral("a")}},
        {QStringLiteral("a "), {QStringLiteral("a")}},
        {QStringLiteral("a  "), {QStringLiteral("a"), QString()}},
        {QStringLiteral("a\tb"), {QStringLiteral("a"), QStringLiteral("b")}},
        {QStringLiteral("\"/home/me/My Notes/a b.txt\" x"),
         {QStringLiteral("/home/me/My Notes/a b.txt"), QStringLiteral("x")}},
        {QStringLiteral("\"\" x"), {QString(), QStringLiteral("x")}},
        {QStringLiteral("key=\"a b\" x"), {QStringLiteral("key=\"a b\""), QStringLiteral("x")}},
        {QStringLiteral("\"a b\"c d"), {QStringLiteral("a bc"), QStringLiteral("d")}},
        {QStringLiteral("\"a\"b\"c d\" e"), {QStringLiteral("ab\"c d\""), QStringLiteral("e")}},
        {QStringLiteral("\"open to the end"), {QStringLiteral("open to the end")}},
    };
    for (const auto& c : cases)
        EXPECT_EQ(SplitForwardedCommandLine(c.text), c.tokens) << c.text.toStdString();
}

TEST(ForwardedCommandLineTest, RunsTheActionsOfTheTokensAfterTheProgram) {
    EXPECT_EQ(RunForwarded(QStringLiteral("/usr/bin/ambrel-navigator /NewNote")),
              QStringList{QStringLiteral("NewNote")});
    // The first token is the program even when it looks like a switch.
    EXPECT_TRUE(RunForwarded(QStringLiteral("/NewNote")).isEmpty());
    EXPECT_TRUE(RunForwarded(QString()).isEmpty());
    EXPECT_EQ(RunForwarded(QStringLiteral(
                  "\"/opt/Quillmark Ambrel/ambrel-navigator\" -viewdocument \"/home/me/a b.pdf\"")),
              QStringList{QStringLiteral("ViewDocument(/home/me/a b.pdf)")});
    // Two blanks give an empty token, which takes the place of the file.
    EXPECT_TRUE(RunForwarded(QStringLiteral("prog /ViewDocument  /home/me/a.pdf")).isEmpty());
    EXPECT_EQ(RunForwarded(QStringLiteral("prog  /NewNote")),
              QStringList{QStringLiteral("NewNote")});
}

TEST(ForwardedCommandLineTest, JoinedArgumentsSplitBackUnchanged) {
    const QStringList arguments{
        QStringLiteral("/opt/Quillmark Ambrel/ambrel-navigator"), QStringLiteral("/ViewDocument"),
        QStringLiteral("/home/me/My Notes/a\tb.pdf"), QString(), QStringLiteral("it's")};
    const QString text = JoinForwardedCommandLine(arguments);
    EXPECT_EQ(text, QStringLiteral("\"/opt/Quillmark Ambrel/ambrel-navigator\" /ViewDocument "
                                   "\"/home/me/My Notes/a\tb.pdf\" \"\" it's"));
    EXPECT_EQ(SplitForwardedCommandLine(text), arguments);

    EXPECT_TRUE(
        JoinForwardedCommandLine({QStringLiteral("prog"), QStringLiteral("say \"hi\"")}).isNull());
}

} // namespace

namespace {

class FileArgumentsTest : public AmbrelTest {};

TEST_F(FileArgumentsTest, RelativeFileArgumentsAreMadeAbsoluteForTheRunningNavigator) {
    const QString file = WriteFile(QStringLiteral("work/my note.txt"), "text");
    const QString saved = QDir::currentPath();
    ASSERT_TRUE(QDir::setCurrent(Home() + QStringLiteral("/work")));
    const QStringList made = MakeFileArgumentsAbsolute(
        {QStringLiteral("prog"), QStringLiteral("/NewNoteFromFile"), QStringLiteral("my note.txt"),
         QStringLiteral("/OpenMRUItem"), QStringLiteral("not-a-file"), QStringLiteral("/etc")});
    QDir::setCurrent(saved);
    EXPECT_EQ(made, (QStringList{QStringLiteral("prog"), QStringLiteral("/NewNoteFromFile"), file,
                                 QStringLiteral("/OpenMRUItem"), QStringLiteral("not-a-file"),
                                 QStringLiteral("/etc")}));
}

} // namespace
