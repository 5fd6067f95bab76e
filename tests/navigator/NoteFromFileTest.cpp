#include "NavigatorModelFixture.h"

#include <QDir>
#include <QFile>

namespace {

class NoteFromFileTest : public NavigatorModelFixture {
protected:
    QByteArray Read(const QString& path) const {
        QFile file(path);
        return file.open(QIODevice::ReadOnly) ? file.readAll() : QByteArray();
    }
    QStringList ItemFolders() const {
        return QDir(AppDataFolder() + u"/Catalog"_s).entryList(QDir::Dirs | QDir::NoDotAndDotDot);
    }
};

TEST_F(NoteFromFileTest, ATextFileBecomesAnOpenNoteAndIsThenRemoved) {
    const QString folder = Folder();
    WNavDS* model = Load();
    model->SelectItem(Item(folder));
    const QString source = WriteFile(u"in/clip.txt"_s, "a<b & c");

    QString itemId;
    UnicodeStringPtr idSink(&itemId);
    ASSERT_EQ(model->AddNoteFromFile(source, &idSink), S_OK);
    EXPECT_FALSE(QFile::exists(source));
    EXPECT_EQ(Item(itemId)->GetParent(), Item(folder));
    EXPECT_EQ(CatalogValue(itemId, u"open"_s), u"true"_s);
    // Handed-over text is not preformatted, and it stays text.
    const QByteArray note = Read(ItemFile(itemId));
    EXPECT_TRUE(note.contains("<BODY><DIV>a&lt;b &amp; c</DIV></BODY></HTML>"));
    EXPECT_EQ(launcher.starts.value(0).arguments.value(0), ItemFile(itemId));
}

TEST_F(NoteFromFileTest, AFileThatCannotBecomeANoteIsKeptAndLeavesNothingBehind) {
    const QString folder = Folder();
    WNavDS* model = Load();
    model->SelectItem(Item(folder));
    const qsizetype records = model->GetItems().size();
    const QStringList itemFolders = ItemFolders();

    // Three bytes are too short to be a note.
    const QString source = WriteFile(u"in/abc.txt"_s, "abc");
    EXPECT_EQ(model->AddNoteFromFile(source, nullptr), E_FAIL);
    EXPECT_TRUE(QFile::exists(source)) << "the user's file is lost";
    EXPECT_EQ(model->GetItems().size(), records);
    EXPECT_EQ(model->GetSelected(), Item(folder));
    EXPECT_EQ(ItemFolders(), itemFolders);
    ASSERT_EQ(messages.shown.size(), 1);
    EXPECT_EQ(messages.shown[0].text, u"Quillmark Ambrel was not able to open the file abc.txt\n"
                                      u"The file may contain invalid characters."_s);
    EXPECT_EQ(messages.shown[0].caption, u"Quillmark Ambrel"_s);

    // A file no constructor takes makes no item and no message, and stays.
    const QString page = WriteFile(u"in/page.htm"_s, "<p>hello</p>");
    EXPECT_EQ(model->AddNoteFromFile(page, nullptr), E_FAIL);
    EXPECT_TRUE(QFile::exists(page));
    EXPECT_EQ(messages.shown.size(), 1);
}

} // namespace
