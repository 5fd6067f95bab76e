#include "common/ReleasePtr.h"
#include "notes/INoteDocumentCreator.h"
#include "support/AmbrelTest.h"
#include "support/FileSizeLimit.h"

#include <QDir>
#include <QFile>

#include <sys/stat.h>

namespace {

// Whether the note's name existed when a write went past the file size limit.
const char* g_watchedName = nullptr;
volatile sig_atomic_t g_nameSeenDuringWrite = 0;

void NoteNameWatcher(int) {
    struct stat status {};
    if (::lstat(g_watchedName, &status) == 0)
        g_nameSeenDuringWrite = 1;
}

class NoteDocumentCreatorTest : public AmbrelTest {
protected:
    void SetUp() override {
        AmbrelTest::SetUp();
        creator.reset(CreateNoteDocumentCreator());
        ASSERT_TRUE(creator);
        path = Home() + QStringLiteral("/note.htm");
        creator->SetFilePath(path);
    }

    // Writes the note and answers the file's bytes.
    QByteArray Written() {
        EXPECT_EQ(creator->Write(), S_OK);
        QFile file(path);
        EXPECT_TRUE(file.open(QIODevice::ReadOnly));
        return file.readAll();
    }

    ReleasePtr<INoteDocumentCreator> creator;
    QString path;
};

const QByteArray kHead = QByteArrayLiteral(
    "<!DOCTYPE HTML PUBLIC \"-//W3C//DTD HTML 4.0 Transitional//EN\"><HTML><HEAD><TITLE>");

TEST_F(NoteDocumentCreatorTest, NoteWithDefaultSettingsIsWrittenCharacterForCharacter) {
    // The values a new note gets from the default settings, in the order notes are filled.
    creator->SetTitle(QStringLiteral("Shopping list"));
    creator->SetBackgroundImage(QString());
    creator->SetBackgroundColor(0x00FFFFFF);
    creator->SetFontFamily(QStringLiteral("Times New Roman"));
    EXPECT_EQ(creator->SetFontSize(12, QStringLiteral("points")), S_OK);
    creator->SetContent(QStringLiteral("<PRE><FONT FACE=\"Times New Roman\">milk</FONT></PRE>"));

    const QByteArray expected(
        "<!DOCTYPE HTML PUBLIC \"-//W3C//DTD HTML 4.0 Transitional//EN\"><HTML><HEAD>"
        "<TITLE>Shopping%20list</TITLE><STYLE type=\"text/css\" > BODY { BACKGROUND : #ffffff "
        "url(  ) repeat top left scroll;FONT-FAMILY : Times New Roman;FONT-SIZE : 12 pt;COLOR "
        ": black; } P { MARGIN-TOP : 0 em;MARGIN-BOTTOM : 0 em; } </STYLE></HEAD><BODY><DIV>"
        "<PRE><FONT FACE=\"Times New Roman\">milk</FONT></PRE></DIV></BODY></HTML>\0",
        397);
    EXPECT_EQ(Written(), expected);
}

TEST_F(NoteDocumentCreatorTest, FirstValuesGiveAPlainWhiteNote) {
    EXPECT_EQ(Written(),
              kHead +
                  "</TITLE><STYLE type=\"text/css\" > BODY { BACKGROUND : #ffffff none repeat "
                  "top left scroll;FONT-FAMILY : Times New Roman;FONT-SIZE : 12 pt;COLOR : "
                  "black; } P { MARGIN-TOP : 0 em;MARGIN-BOTTOM : 0 em; } </STYLE></HEAD>"
                  "<BODY><DIV></DIV></BODY></HTML>" +
                  QByteArray(1, '\0'));
}

TEST_F(NoteDocumentCreatorTest, TitleAndStyleValuesAndTheirRefusals) {
    EXPECT_EQ(creator->SetFontSize(14, QStringLiteral("Points")), E_INVALIDARG);
    EXPECT_EQ(creator->SetFontSize(14, QStringLiteral("pt")), E_INVALIDARG);
    EXPECT_EQ(creator->SetReserved(7), E_NOTIMPL);
    EXPECT_EQ(creator->SetFontFamily(QString()), S_OK);
    EXPECT_EQ(creator->SetBackgroundImage(QStringLiteral("NONE")), S_OK);
    EXPECT_EQ(creator->SetBackgroundColor(0x1000FF), S_OK);
    EXPECT_EQ(creator->SetTextColor(0x563412), S_OK);
    EXPECT_EQ(creator->SetMargin(2), S_OK);
    EXPECT_EQ(creator->SetTitle(QStringLiteral("Tom & Jerry \u00e9t\u00e9 \u20ac")), S_OK);

    const QByteArray text = Written();
    EXPECT_TRUE(text.startsWith(kHead + "Tom%20&amp;%20Jerry%20\xc3\xa9t\xc3\xa9%20\xe2\x82\xac"
                                        "</TITLE>"));
    EXPECT_TRUE(text.contains("BODY { BACKGROUND : #ff0010 none repeat top left scroll;FONT-SIZE "
                              ": 12 pt;COLOR : #123456; } P { MARGIN-TOP : 2 em;MARGIN-BOTTOM : "
                              "2 em; } "))
        << text.toStdString();
    EXPECT_FALSE(text.contains("FONT-FAMILY"));
}

TEST_F(NoteDocumentCreatorTest, BackgroundImageIsAnUnquotedUrl) {
    creator->SetBackgroundImage(QStringLiteral("/home/u/my paper.png"));
    creator->SetFontSize(9, QStringLiteral("points"));
    EXPECT_TRUE(Written().contains(
        "BACKGROUND : #ffffff url( /home/u/my paper.png ) repeat top left scroll;FONT-FAMILY : "
        "Times New Roman;FONT-SIZE : 9 pt;"));
}

TEST_F(NoteDocumentCreatorTest, WriteNeverReplacesAFileNorFollowsALink) {
    WriteFile(QStringLiteral("note.htm"), QByteArrayLiteral("the user's note"));
    creator->SetContent(QStringLiteral("new"));
    EXPECT_EQ(Written(), QByteArrayLiteral("the user's note"));

    // A dangling link counts as an existing file and is not followed.
    const QString link = Home() + QStringLiteral("/link.htm");
    ASSERT_TRUE(QFile::link(Home() + QStringLiteral("/target.htm"), link));
    creator->SetFilePath(link);
    EXPECT_EQ(creator->Write(), S_OK);
    EXPECT_FALSE(QFile::exists(Home() + QStringLiteral("/target.htm")));

    creator->SetFilePath(Home() + QStringLiteral("/missing/note.htm"));
    EXPECT_EQ(creator->Write(), E_FAIL);
}

// A crash in the middle of writing must not leave a cut-off note: the name appears only with
// the whole file. A write that fails past the file size limit stands in for the crash.
TEST_F(NoteDocumentCreatorTest, ANoteFileAppearsUnderItsNameOnlyWhenWhole) {
    creator->SetContent(QString(64 * 1024, u'x'));
    const QByteArray name = QFile::encodeName(path);
    g_watchedName = name.constData();
    g_nameSeenDuringWrite = 0;
    {
        const FileSizeLimit limit(4096);
        std::signal(SIGXFSZ, NoteNameWatcher);
        EXPECT_EQ(creator->Write(), E_FAIL);
    }
    EXPECT_FALSE(g_nameSeenDuringWrite);
    EXPECT_EQ(QDir(Home()).entryList(QDir::Files | QDir::Hidden | QDir::System), QStringList());
}

} // namespace
