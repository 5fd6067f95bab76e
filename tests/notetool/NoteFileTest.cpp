#include "companion/CompanionBus.h"
#include "notes/INoteDocumentCreator.h"
#include "notetool/CNoteEditor.h"
#include "notetool/CNoteFile.h"
#include "notetool/CNoteToolApp.h"
#include "notetool/CNoteToolCommandLine.h"
#include "notetool/CNoteWindow.h"
#include "support/AmbrelTest.h"
#include "support/FileSizeLimit.h"

#include <QApplication>
#include <QClipboard>
#include <QDir>
#include <QDropEvent>
#include <QFile>
#include <QImage>
#include <QMimeData>
#include <QStatusBar>
#include <QTextCursor>
#include <QUrl>

namespace {

using namespace Qt::StringLiterals;

const QString kItemId = u"0B5A6C1E-8D2F-4E3A-9C7B-1D2E3F405162"_s;

// The header of a note written with the font "DejaVu Sans", 14 points, the background
// #fffbe6 and the empty picture, titled "Shopping list & more".
const QByteArray kHeader =
    "<!DOCTYPE HTML PUBLIC \"-//W3C//DTD HTML 4.0 Transitional//EN\"><HTML><HEAD><TITLE>"
    "Shopping%20list%20&amp;%20more</TITLE><STYLE type=\"text/css\" > BODY { BACKGROUND : "
    "#fffbe6 url(  ) repeat top left scroll;FONT-FAMILY : DejaVu Sans;FONT-SIZE : 14 pt;"
    "COLOR : black; } P { MARGIN-TOP : 0 em;MARGIN-BOTTOM : 0 em; } </STYLE></HEAD>"
    "<BODY><DIV>";

class NoteFileTest : public AmbrelTest {
protected:
    QString NotePath() const { return Home() + u"/Catalog/"_s + kItemId + u"/note.htm"_s; }

    // A note as the navigator's note constructors write it.
    void WriteNavigatorNote(const QString& content) const {
        WriteFile(u"Catalog/"_s + kItemId + u"/.keep"_s, {});
        INoteDocumentCreator* creator = CreateNoteDocumentCreator();
        creator->SetFilePath(NotePath());
        creator->SetTitle(u"Shopping list & more"_s);
        creator->SetFontFamily(u"DejaVu Sans"_s);
        creator->SetFontSize(14, u"points"_s);
        creator->SetBackgroundColor(0x00E6FBFF);
        creator->SetBackgroundImage(u""_s);
        creator->SetContent(content);
        ASSERT_EQ(creator->Write(), S_OK);
        creator->Release();
    }

    QByteArray NoteBytes() const {
        QFile file(NotePath());
        return file.open(QIODevice::ReadOnly) ? file.readAll() : QByteArray();
    }

    std::unique_ptr<CNoteToolApp> StartNote() {
        const CNoteToolCommandLine commandLine(
            {NotePath(), u"/PROPERTY"_s, u"itemid|"_s + kItemId + u"|size|600,300|"_s});
        auto note = std::make_unique<CNoteToolApp>(&m_bus, commandLine.NotePath(),
                                                   commandLine.Properties());
        EXPECT_TRUE(note->Start());
        return note;
    }

    CompanionBus m_bus;
};

TEST_F(NoteFileTest, ANavigatorNoteIsEditedAndSavedWithItsOwnHeader) {
    WriteNavigatorNote(u"<P>milk</P>"_s);
    // What a save killed before its rename left beside the note goes when the note opens.
    const QString left = NotePath() + u".Tx4yFV"_s;
    WriteFile(left.mid(Home().size() + 1), "half a note");
    std::unique_ptr<CNoteToolApp> note = StartNote();
    EXPECT_FALSE(QFile::exists(left));
    CNoteWindow* window = note->Window();
    EXPECT_EQ(window->NoteTitle(), u"Shopping list & more"_s);
    EXPECT_EQ(window->size(), QSize(600, 300));
    EXPECT_EQ(window->Editor()->toPlainText(), u"milk"_s);
    EXPECT_EQ(window->Editor()->document()->defaultFont().pointSize(), 14);
    EXPECT_FALSE(note->IsChanged());

    QTextCursor cursor = window->Editor()->textCursor();
    cursor.movePosition(QTextCursor::End);
    QTextCharFormat bold;
    bold.setFontWeight(QFont::Bold);
    cursor.insertText(u" and bread"_s, bold);
    EXPECT_TRUE(note->IsChanged());
    ASSERT_TRUE(note->Save());
    EXPECT_FALSE(note->IsChanged());

    const QByteArray saved = NoteBytes();
    EXPECT_TRUE(saved.startsWith(kHeader)) << saved.left(kHeader.size()).toStdString();
    EXPECT_TRUE(saved.endsWith(QByteArray("</DIV></BODY></HTML>", 20) + '\0'));
    EXPECT_EQ(saved.count('\0'), 1);
    EXPECT_TRUE(saved.contains("font-weight:700;\"> and bread</span>")) << saved.toStdString();

    // Read back, the note is what was typed, with the same look.
    NoteContent content;
    CNoteFile file(NotePath());
    ASSERT_EQ(file.Load(&content), CNoteFile::State::Read);
    EXPECT_EQ(content.title, u"Shopping list & more"_s);
    EXPECT_EQ(content.fontFamily, u"DejaVu Sans"_s);
    EXPECT_EQ(content.fontSize, 14U);
    EXPECT_EQ(content.backgroundColor, 0x00E6FBFFU);
    EXPECT_EQ(content.backgroundImage, u""_s);
    EXPECT_EQ(CNoteFile::Format(content), saved);
    note->Close();
}

TEST_F(NoteFileTest, DamagedOrForeignFilesOpenAsFarAsTheyCanBeRead) {
    const QByteArray header = kHeader;
    const struct {
        const char* what;
        QByteArray bytes;
        QString title;
        QString text;
    } cases[] = {
        {"cut inside the body", header + "<P>kept words</P><P>half a li", u"Shopping list & more"_s,
         u"kept words\nhalf a li"_s},
        {"cut inside a character", header + "<P>caf\xC3", u"Shopping list & more"_s, u"caf"_s},
        {"cut inside the header", header.left(96), u"Shopping list"_s, u""_s},
        {"older lower-case note without zero",
         "<html><head><title>Old</title></head><body><p>from before</p></body></html>", u"Old"_s,
         u"from before"_s},
        {"plain text", "just some words", u""_s, u"just some words"_s},
    };
    for (const auto& c : cases) {
        SCOPED_TRACE(c.what);
        QFile::remove(NotePath());
        WriteFile(u"Catalog/"_s + kItemId + u"/note.htm"_s, c.bytes);
        NoteContent content;
        content.title.clear();
        CNoteFile file(NotePath());
        ASSERT_EQ(file.Load(&content), CNoteFile::State::Read);
        EXPECT_EQ(content.title, c.title);
        CNoteEditor editor;
        editor.ShowNote(content, NotePath());
        EXPECT_EQ(editor.toPlainText(), c.text);
    }
}

TEST_F(NoteFileTest, OddHeadersReadAsTheyAreMeantAndSaveTheSameEveryTime) {
    struct Row {
        QByteArray style;
        QString fontFamily;
        std::uint32_t backgroundColor;
        QString backgroundImage;
        std::uint32_t margin;
    };
    const Row rows[] = {
        // An empty font name names no font: the note keeps the font it has.
        {"BODY { FONT-FAMILY : ;FONT-SIZE : 9 pt; }", u"Times New Roman"_s, 0x00FFFFFF, u"none"_s,
         0},
        // A picture's path is only a path, whatever it holds: a colour or a rule.
        {"BODY { BACKGROUND : #102030 url( /p/paper #e0e0ff.png ) repeat; }", u"Times New Roman"_s,
         0x00302010, u"/p/paper #e0e0ff.png"_s, 0},
        {"<!-- BODY { BACKGROUND : #102030 url( /p/P { MARGIN-TOP : 2 em ) repeat; } "
         "P { MARGIN-TOP : 3 em; } -->",
         u"Times New Roman"_s, 0x00302010, u"/p/P { MARGIN-TOP : 2 em"_s, 3},
    };
    for (const Row& row : rows) {
        NoteContent read;
        ASSERT_TRUE(CNoteFile::Parse("<HTML><HEAD><STYLE> " + row.style +
                                         " </STYLE></HEAD><BODY><DIV>x</DIV></BODY></HTML>",
                                     &read));
        EXPECT_EQ(read.fontFamily, row.fontFamily) << row.style.constData();
        EXPECT_EQ(read.backgroundColor, row.backgroundColor) << row.style.constData();
        EXPECT_EQ(read.backgroundImage, row.backgroundImage) << row.style.constData();
        EXPECT_EQ(read.margin, row.margin) << row.style.constData();
        const QByteArray saved = CNoteFile::Format(read);
        NoteContent reread;
        ASSERT_TRUE(CNoteFile::Parse(saved, &reread));
        EXPECT_EQ(CNoteFile::Format(reread), saved) << row.style.constData();
    }
}

TEST_F(NoteFileTest, AFileThatIsNoTextIsShownReadOnlyAndNeverWrittenOver) {
    const QByteArray cases[] = {kHeader + "<P>a\0b</P>" + QByteArray(1, '\0') + "x",
                                kHeader + "<P>\xFF\xFE\xFD binary</P></DIV></BODY></HTML>"};
    for (const QByteArray& bytes : cases) {
        QFile::remove(NotePath());
        WriteFile(u"Catalog/"_s + kItemId + u"/note.htm"_s, bytes);
        std::unique_ptr<CNoteToolApp> note = StartNote();
        EXPECT_EQ(note->FileState(), CNoteFile::State::Unreadable);
        EXPECT_TRUE(note->Window()->Editor()->isReadOnly());
        note->SetTitle(u"Renamed"_s);
        EXPECT_FALSE(note->Save());
        note->Close();
        EXPECT_EQ(NoteBytes(), bytes);
    }
}

TEST_F(NoteFileTest, ASaveOnAFullDiskKeepsTheOldNoteWholeAndSaysSo) {
    WriteNavigatorNote(u"<P>before</P>"_s);
    const QByteArray old = NoteBytes();
    std::unique_ptr<CNoteToolApp> note = StartNote();
    note->Window()->Editor()->setPlainText(u"after"_s);
    {
        // Smaller than the note: the new text stays in the write buffer until the commit.
        const FileSizeLimit full(static_cast<rlim_t>(old.size() / 2));
        EXPECT_FALSE(note->Save());
    }
    EXPECT_EQ(NoteBytes(), old);
    EXPECT_EQ(QDir(QFileInfo(NotePath()).path()).entryList(QDir::Files | QDir::Hidden),
              (QStringList{u".keep"_s, u"note.htm"_s}))
        << "a temporary file was left";
    const QString message = note->Window()->statusBar()->currentMessage();
    EXPECT_TRUE(message.startsWith(u"The note could not be saved"_s)) << message.toStdString();
    EXPECT_TRUE(message.endsWith(u"File too large"_s)) << message.toStdString();

    ASSERT_TRUE(note->Save()) << "the freed disk is written at the next save";
    EXPECT_TRUE(NoteBytes().contains("after"));
    note->Close();
}

TEST_F(NoteFileTest, PastedAndDroppedPicturesAreCopiedBesideTheNoteAndNamedInIt) {
    WriteNavigatorNote(u"<P>x</P>"_s);
    QImage image(8, 8, QImage::Format_RGB32);
    image.fill(Qt::red);
    const QString elsewhere = Home() + u"/pictures/sky.png"_s;
    WriteFile(u"pictures/.keep"_s, {});
    ASSERT_TRUE(image.save(elsewhere));
    // A file of the dropped picture's name is there already: it is kept.
    const QString taken = WriteFile(u"Catalog/"_s + kItemId + u"/sky.png"_s, "not mine");

    std::unique_ptr<CNoteToolApp> note = StartNote();
    CNoteEditor* editor = note->Window()->Editor();
    auto* pasted = new QMimeData;
    pasted->setImageData(image);
    QApplication::clipboard()->setMimeData(pasted);
    editor->paste();
    QMimeData dropped;
    dropped.setUrls({QUrl::fromLocalFile(elsewhere)});
    const QPoint at = editor->viewport()->rect().center();
    QDragEnterEvent enter(at, Qt::CopyAction, &dropped, Qt::LeftButton, Qt::NoModifier);
    QApplication::sendEvent(editor->viewport(), &enter);
    ASSERT_TRUE(enter.isAccepted());
    QDropEvent drop(at, Qt::CopyAction, &dropped, Qt::LeftButton, Qt::NoModifier);
    QApplication::sendEvent(editor->viewport(), &drop);
    ASSERT_TRUE(note->Save());

    const QString folder = Home() + u"/Catalog/"_s + kItemId + u'/';
    EXPECT_FALSE(QImage(folder + u"picture.png"_s).isNull());
    EXPECT_EQ(QImage(folder + u"sky-2.png"_s).pixelColor(0, 0), QColor(Qt::red));
    QFile kept(taken);
    ASSERT_TRUE(kept.open(QIODevice::ReadOnly));
    EXPECT_EQ(kept.readAll(), "not mine");
    const QByteArray saved = NoteBytes();
    EXPECT_TRUE(saved.contains("<img src=\"picture.png\" />")) << saved.toStdString();
    EXPECT_TRUE(saved.contains("<img src=\"sky-2.png\" />"));
    note->Close();
}

} // namespace
