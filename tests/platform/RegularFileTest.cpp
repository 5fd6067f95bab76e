#include "platform/RegularFile.h"
#include "support/AmbrelTest.h"
#include "support/FileSizeLimit.h"

#include <QDir>
#include <QFile>

namespace {

using namespace Qt::StringLiterals;
using Platform::WholeFileResult;

class RegularFileTest : public AmbrelTest {
protected:
    void SetUp() override {
        AmbrelTest::SetUp();
        folder = Home() + u"/item"_s;
        ASSERT_TRUE(QDir().mkpath(folder));
    }
    QStringList FolderEntries() const {
        return QDir(folder).entryList(QDir::AllEntries | QDir::Hidden | QDir::System |
                                      QDir::NoDotAndDotDot);
    }
    static QByteArray Read(const QString& path) {
        QFile file(path);
        return file.open(QIODevice::ReadOnly) ? file.readAll() : QByteArray();
    }

    QString folder;
};

TEST_F(RegularFileTest, CreateFileWholeMakesANewFileAndNeverTakesAnExistingName) {
    const QString path = folder + u"/note.htm"_s;
    EXPECT_EQ(Platform::CreateFileWhole(path, "first\0"_ba), WholeFileResult::Created);
    EXPECT_EQ(Read(path), "first\0"_ba);
    EXPECT_EQ(Platform::CreateFileWhole(path, "second"_ba), WholeFileResult::NameTaken);
    EXPECT_EQ(Read(path), "first\0"_ba);

    // A dangling link is a taken name; its target is not made.
    const QString link = folder + u"/link.htm"_s;
    ASSERT_TRUE(QFile::link(folder + u"/target.htm"_s, link));
    EXPECT_EQ(Platform::CreateFileWhole(link, "x"_ba), WholeFileResult::NameTaken);

    EXPECT_EQ(Platform::CreateFileWhole(folder + u"/missing/note.htm"_s, "x"_ba),
              WholeFileResult::Failed);
    EXPECT_EQ(FolderEntries(), QStringList({u"link.htm"_s, u"note.htm"_s}));
}

TEST_F(RegularFileTest, CreateFileWholeThatCannotWriteLeavesNothingBehind) {
    {
        const FileSizeLimit limit(1000);
        EXPECT_EQ(Platform::CreateFileWhole(folder + u"/big.htm"_s, QByteArray(5000, 'x')),
                  WholeFileResult::Failed);
    }
    EXPECT_EQ(FolderEntries(), QStringList());
}

} // namespace
