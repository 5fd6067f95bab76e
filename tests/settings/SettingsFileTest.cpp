#include "settings/NavigatorSettings.h"
#include "support/AmbrelTest.h"
#include "support/FileSizeLimit.h"

#include <QDir>
#include <QFile>

namespace {

// The text of a file the program writes with every option at its default, keys in code-unit
// order.
const char16_t* const kDefaultText =
    u"applicationposition|0,0,0,0|cleandeletedonclose|false|"
    u"defaultbackgroundcolor|255,255,255|defaultbackgroundimage||defaultfont|Times New Roman|"
    u"defaultfontsize|12|keepontop|false|lastselecteditemid||launchapponstart|false|"
    u"maxlinkeddocuments|100|showalltypes|true|showdoc|false|showframe|true|"
    u"showmessagecentre|true|shownotes|false|showopeneditemsonly|false|showpdf|false|"
    u"showqmd|false|";

// UTF-16 little-endian, written out unit by unit: low byte, then high byte.
QByteArray Utf16Le(const char16_t* text) {
    QByteArray bytes;
    for (const char16_t* unit = text; *unit != 0; ++unit) {
        bytes.append(static_cast<char>(*unit & 0xFF));
        bytes.append(static_cast<char>(*unit >> 8));
    }
    return bytes;
}

class SettingsFileTest : public AmbrelTest {
protected:
    QString FilePath() const { return AppDataFolder() + QStringLiteral("/NavSettings.dat"); }

    void WriteSettings(const QByteArray& bytes) const {
        WriteFile(QStringLiteral("data/Brindle/Quillmark Ambrel/NavSettings.dat"), bytes);
    }

    QByteArray FileBytes() const {
        QFile file(FilePath());
        EXPECT_TRUE(file.open(QIODevice::ReadOnly)) << "no settings file";
        return file.readAll();
    }

    static NavigatorSettings* Settings() { return NavigatorSettings::Instance(); }

    // Every value is at its default when saving writes the default file.
    void ExpectDefaults() {
        EXPECT_FALSE(Settings()->IsDirty());
        ASSERT_TRUE(Settings()->Save());
        EXPECT_EQ(FileBytes(), Utf16Le(kDefaultText));
    }

    // Loads a file holding only "applicationposition" with the given value.
    WindowRect PositionAfterLoading(const char16_t* value) {
        WriteSettings(Utf16Le(u"applicationposition|") + Utf16Le(value) + Utf16Le(u"|"));
        EXPECT_TRUE(Settings()->Load());
        return Settings()->GetApplicationPosition();
    }
};

} // namespace

TEST_F(SettingsFileTest, DefaultsAreWrittenByteForByte) {
    EXPECT_FALSE(Settings()->Load()) << "no file yet";
    EXPECT_EQ(Settings()->GetMaxLinkedDocuments(), 100);
    EXPECT_EQ(Settings()->GetDefaultFont(), QStringLiteral("Times New Roman"));
    EXPECT_TRUE(Settings()->GetShowAllTypes());
    ExpectDefaults();
}

TEST_F(SettingsFileTest, LoadThenSaveKeepsEveryValueAndByte) {
    const char16_t* const text =
        u"applicationposition|-20,30,400,700|cleandeletedonclose|true|"
        u"defaultbackgroundcolor|0,128,255|defaultbackgroundimage|/pics/a\\|b\\\\c.png|"
        u"defaultfont|Noto \\\\ Sans|defaultfontsize|18|keepontop|true|"
        u"lastselecteditemid|0F8FAD5B-D9CB-469F-A165-70867728950E|launchapponstart|true|"
        u"maxlinkeddocuments|7|showalltypes|false|showdoc|false|showframe|false|"
        u"showmessagecentre|false|shownotes|false|showopeneditemsonly|true|showpdf|true|"
        u"showqmd|false|";
    WriteSettings(Utf16Le(text));
    ASSERT_TRUE(Settings()->Load());

    NavigatorSettings* s = Settings();
    EXPECT_EQ(s->GetApplicationPosition(), (WindowRect{-20, 30, 380, 730}));
    EXPECT_EQ(s->GetDefaultBackgroundImage(), QStringLiteral("/pics/a|b\\c.png"));
    EXPECT_EQ(s->GetDefaultFont(), QStringLiteral("Noto \\ Sans"));
    EXPECT_EQ(s->GetDefaultFontSize(), 18);
    EXPECT_EQ(s->GetMaxLinkedDocuments(), 7);
    EXPECT_TRUE(s->GetCleanDeletedOnClose());
    EXPECT_FALSE(s->GetShowAllTypes());
    EXPECT_TRUE(s->GetShowPdf());
    EXPECT_FALSE(s->IsDirty()) << "loading is not a change";

    QFile::remove(FilePath());
    ASSERT_TRUE(s->Save());
    EXPECT_EQ(FileBytes(), Utf16Le(text));
}

TEST_F(SettingsFileTest, PositionIsPutBackOnTheVirtualScreen) {
    EXPECT_EQ(PositionAfterLoading(u"100,50,400,300"), (WindowRect{100, 50, 500, 350}));
    EXPECT_EQ(PositionAfterLoading(u"-5000,-5000,10,10"), (WindowRect{0, 0, 280, 650}));
    // Only the axis that is off the screen is reset; partly off the screen stays.
    EXPECT_EQ(PositionAfterLoading(u"90000,40,300,200"), (WindowRect{0, 40, 280, 240}));
    EXPECT_EQ(PositionAfterLoading(u"60,90000,300,200"), (WindowRect{60, 0, 360, 650}));
    EXPECT_EQ(PositionAfterLoading(u"-100,-20,300,200"), (WindowRect{-100, -20, 200, 180}));
    // Edges beyond the range of numbers are off the screen too.
    EXPECT_EQ(PositionAfterLoading(u"2147483647,40,400,300"), (WindowRect{0, 40, 280, 340}));
    EXPECT_EQ(PositionAfterLoading(u"60,-2147483648,300,-400"), (WindowRect{60, 0, 360, 650}));

    // A rectangle is not built from missing numbers: the current one stays.
    Settings()->SetApplicationPosition({10, 20, 300, 400});
    EXPECT_EQ(PositionAfterLoading(u"100,50,400"), (WindowRect{10, 20, 300, 400}));
    EXPECT_EQ(PositionAfterLoading(u"100,x,400,300"), (WindowRect{10, 20, 300, 400}));
    EXPECT_EQ(PositionAfterLoading(u""), WindowRect{});
}

TEST_F(SettingsFileTest, NumbersReadLikeTheCLibrary) {
    WriteSettings(Utf16Le(u"defaultfontsize| +24pt|maxlinkeddocuments|99999999999|"));
    ASSERT_TRUE(Settings()->Load());
    EXPECT_EQ(Settings()->GetDefaultFontSize(), 24);
    EXPECT_EQ(Settings()->GetMaxLinkedDocuments(), 2147483647);
}

TEST_F(SettingsFileTest, DamagedContentAndUnknownKeys) {
    // A byte-order mark becomes part of the first key, so that key is not recognised; text
    // after a zero unit and an unterminated pair are ignored.
    QByteArray bytes = QByteArray("\xFF\xFE", 2) + Utf16Le(u"applicationposition|100,50,400,300|");
    bytes += Utf16Le(u"keepontop|TRUE|showframe|yes|zzunknown|1|defaultfont|Arial|"
                     u"defaultbackgroundcolor||");
    bytes += QByteArray("\0\0", 2) + Utf16Le(u"launchapponstart|true|");
    WriteSettings(bytes);
    ASSERT_TRUE(Settings()->Load());

    ASSERT_TRUE(Settings()->Save());
    EXPECT_EQ(FileBytes(),
              Utf16Le(u"applicationposition|0,0,0,0|cleandeletedonclose|false|"
                      u"defaultbackgroundcolor||defaultbackgroundimage||"
                      u"defaultfont|Arial|defaultfontsize|12|keepontop|true|lastselecteditemid||"
                      u"launchapponstart|false|maxlinkeddocuments|100|showalltypes|true|"
                      u"showdoc|false|showframe|false|showmessagecentre|true|shownotes|false|"
                      u"showopeneditemsonly|false|showpdf|false|showqmd|false|"));
}

TEST_F(SettingsFileTest, AStrayLastByteIsDroppedAndAnUnreadableFileKeepsTheDefaults) {
    WriteSettings(Utf16Le(u"keepontop|true|maxlinkeddocuments|5|") + QByteArray("x"));
    ASSERT_TRUE(Settings()->Load()) << "half a code unit at the end";
    EXPECT_TRUE(Settings()->GetKeepOnTop());
    EXPECT_EQ(Settings()->GetMaxLinkedDocuments(), 5);
    ResetSingletons();

    QFile::remove(FilePath());
    ASSERT_TRUE(QDir().mkpath(FilePath()));
    EXPECT_FALSE(Settings()->Load());
    ASSERT_TRUE(QDir().rmdir(FilePath()));
    ExpectDefaults();
}

TEST_F(SettingsFileTest, SaveIfDirtyKeepsAChangeThatFailedToSaveUntilASaveWorks) {
    EXPECT_TRUE(Settings()->SaveIfDirty());
    EXPECT_FALSE(QFile::exists(FilePath())) << "nothing to save";

    Settings()->SetKeepOnTop(true);
    EXPECT_TRUE(Settings()->IsDirty());
    EXPECT_TRUE(Settings()->SaveIfDirty());
    EXPECT_FALSE(Settings()->IsDirty());
    EXPECT_TRUE(FileBytes().contains(Utf16Le(u"keepontop|true|")));

    // A file where the folder belongs: every save fails, and the change waits.
    ASSERT_TRUE(QDir(DataHome() + QStringLiteral("/Brindle")).removeRecursively());
    WriteFile(QStringLiteral("data/Brindle"), "blocks the folder");
    Settings()->SetShowFrame(false);
    for (int pass = 0; pass < 3; ++pass) {
        EXPECT_FALSE(Settings()->SaveIfDirty());
        EXPECT_TRUE(Settings()->IsDirty()) << "the change was dropped";
        EXPECT_FALSE(Settings()->SaveError().isEmpty());
    }

    ASSERT_TRUE(QFile::remove(DataHome() + QStringLiteral("/Brindle")));
    EXPECT_TRUE(Settings()->SaveIfDirty());
    EXPECT_FALSE(Settings()->IsDirty());
    EXPECT_TRUE(Settings()->SaveError().isEmpty());
    EXPECT_TRUE(FileBytes().contains(Utf16Le(u"showframe|false|")));
}

TEST_F(SettingsFileTest, AFailedSaveLeavesTheOldFileWhole) {
    ASSERT_TRUE(Settings()->Save());
    const QByteArray old = FileBytes();
    Settings()->SetDefaultFont(QStringLiteral("A font name far too long to fit in the file"));
    {
        const FileSizeLimit full(old.size() + 8);
        EXPECT_FALSE(Settings()->Save());
        EXPECT_EQ(Settings()->SaveError(), QStringLiteral("File too large"));
    }
    EXPECT_EQ(FileBytes(), old);
    EXPECT_EQ(QDir(AppDataFolder()).entryList(QDir::Files),
              QStringList{QStringLiteral("NavSettings.dat")});
}
