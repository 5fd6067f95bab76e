#include "NavigatorModelFixture.h"

#include "notes/CBasicNoteConstructor.h"
#include "notes/NoteConstructorRegistry.h"
#include "support/RecordingMessageBox.h"

#include <QDir>
#include <QFile>
#include <QFileInfo>

namespace {

class NoteFromFileTest : public NavigatorModelFixture {
protected:
    void SetUp() override {
        NavigatorModelFixture::SetUp();
        Platform::SetMessageBox(&messages);
    }

    QString NoteFile(const QString& itemId) const {
        return AppDataFolder() + QStringLiteral("/Catalog/") + itemId + QStringLiteral("/note.htm");
    }

    QByteArray Read(const QString& path) const {
        QFile file(path);
        return file.open(QIODevice::ReadOnly) ? file.readAll() : QByteArray();
    }

    RecordingMessageBox messages;
};

TEST_F(NoteFromFileTest, ATextFileBecomesAnOpenNoteAndIsThenRemoved) {
    const QString folder = Add(QStringLiteral("folder"), QStringLiteral("root"));
    WNavDS* model = Load();
    model->SelectItem(model->FindItem(folder));
    const QString source = WriteFile(QStringLiteral("in/clip.txt"), "a<b & c");

    QString itemId;
    UnicodeStringPtr idSink(&itemId);
    ASSERT_EQ(model->AddNoteFromFile(source, &idSink), S_OK);

    EXPECT_FALSE(QFile::exists(source));
    ASSERT_NE(model->FindItem(itemId), nullptr);
    EXPECT_EQ(model->FindItem(itemId)->GetParent(), model->FindItem(folder));
    EXPECT_EQ(CatalogValue(itemId, QStringLiteral("type")), QStringLiteral("note"));
    EXPECT_EQ(CatalogValue(itemId, QStringLiteral("open")), QStringLiteral("true"));
    EXPECT_EQ(CatalogValue(itemId, QStringLiteral("font")), QStringLiteral("Times New Roman"));
    EXPECT_EQ(CatalogValue(itemId, QStringLiteral("size")), QStringLiteral("525,400"));
    // Handed-over text is not preformatted, and it stays text.
    const QByteArray note = Read(NoteFile(itemId));
    EXPECT_TRUE(note.contains("<BODY><DIV>a&lt;b &amp; c</DIV></BODY></HTML>"));
    EXPECT_TRUE(note.endsWith('\0'));

    // The note tool was started on the note with its properties.
    ASSERT_FALSE(launcher.starts.isEmpty());
    const auto& start = launcher.starts.last();
    EXPECT_TRUE(start.program.endsWith(QStringLiteral("/AmbrelNoteTool")));
    ASSERT_GE(start.arguments.size(), 3);
    EXPECT_EQ(start.arguments.at(0), NoteFile(itemId));
    EXPECT_EQ(start.arguments.at(1), QStringLiteral("/PROPERTY"));
    EXPECT_TRUE(start.arguments.at(2).contains(QStringLiteral("itemid|") + itemId + u'|'));
    EXPECT_TRUE(messages.shown.isEmpty());
}

TEST_F(NoteFromFileTest, AFileThatCannotBecomeANoteIsKeptAndLeavesNothingBehind) {
    const QString folder = Add(QStringLiteral("folder"), QStringLiteral("root"));
    WNavDS* model = Load();
    NavListItemData* selected = model->FindItem(folder);
    model->SelectItem(selected);
    const qsizetype records = model->GetItems().size();
    const QStringList itemFolders = QDir(AppDataFolder() + QStringLiteral("/Catalog"))
                                        .entryList(QDir::Dirs | QDir::NoDotAndDotDot);

    // Three bytes are too short to be a note.
    const QString source = WriteFile(QStringLiteral("in/abc.txt"), "abc");
    EXPECT_EQ(model->AddNoteFromFile(source, nullptr), E_FAIL);

    EXPECT_TRUE(QFile::exists(source)) << "the user's file is lost";
    EXPECT_EQ(model->GetItems().size(), records);
    EXPECT_EQ(model->GetSelected(), selected);
    EXPECT_EQ(QDir(AppDataFolder() + QStringLiteral("/Catalog"))
                  .entryList(QDir::Dirs | QDir::NoDotAndDotDot),
              itemFolders);
    ASSERT_EQ(messages.shown.size(), 1);
    EXPECT_EQ(messages.shown.first().text,
              QStringLiteral("Quillmark Ambrel was not able to open the file abc.txt\nThe file "
                             "may contain invalid characters."));
    EXPECT_EQ(messages.shown.first().caption, QStringLiteral("Quillmark Ambrel"));
    EXPECT_TRUE(launcher.starts.isEmpty());

    // A file no constructor takes makes no item and no message, and stays.
    const QString page = WriteFile(QStringLiteral("in/page.htm"), "<p>hello</p>");
    EXPECT_EQ(model->AddNoteFromFile(page, nullptr), E_FAIL);
    EXPECT_TRUE(QFile::exists(page));
    EXPECT_EQ(model->GetItems().size(), records);
    EXPECT_EQ(messages.shown.size(), 1);
}

TEST_F(NoteFromFileTest, ADroppedPictureLandsOnTheDropTargetUnopened) {
    const QString folder = Add(QStringLiteral("folder"), QStringLiteral("root"));
    const QString other = Add(QStringLiteral("folder"), QStringLiteral("root"));
    WNavDS* model = Load();
    model->SelectItem(model->FindItem(other));
    model->SetDropTarget(model->FindItem(folder));
    const QString picture = WriteFile(QStringLiteral("in/photo.png"), "not really a png");

    ReleasePtr<CBasicNoteConstructor> constructor(CreateNoteConstructor(picture));
    ASSERT_TRUE(constructor);
    QString itemId;
    UnicodeStringPtr idSink(&itemId);
    ASSERT_EQ(model->AddNoteFromConstructor(QStringLiteral("photo.png"), constructor.get(), 0, 2,
                                            &idSink),
              S_OK);
    EXPECT_EQ(model->FindItem(itemId)->GetParent(), model->FindItem(folder));
    EXPECT_EQ(CatalogValue(itemId, QStringLiteral("title")), QStringLiteral("photo.png"));
    EXPECT_EQ(CatalogValue(itemId, QStringLiteral("open")), QStringLiteral("false"));
    EXPECT_TRUE(QFile::exists(picture)) << "a dropped file is the user's";
    EXPECT_TRUE(QFileInfo::exists(AppDataFolder() + QStringLiteral("/Catalog/") + itemId +
                                  QStringLiteral("/photo.png")));
    EXPECT_TRUE(Read(NoteFile(itemId)).contains("photo.png"));
    EXPECT_TRUE(launcher.starts.isEmpty()) << "an unopened note starts no note tool";
}

} // namespace
