#include "platform/RegularFile.h"
#include "support/AmbrelTest.h"
#include "support/FileSizeLimit.h"

#include <QDir>
#include <QFile>

#include <sys/stat.h>

namespace {

using namespace Qt::StringLiterals;
using Platform::WholeFileResult;

// Whether the watched name existed when a write went past the file size limit.
const char* g_watchedName = nullptr;
volatile sig_atomic_t g_nameSeenDuringWrite = 0;

void NameWatcher(int) {
    struct stat status {};
    if (::lstat(g_watchedName, &status) == 0)
        g_nameSeenDuringWrite = 1;
}

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

// A copy cut off by a crash must not pass for the document later: the copy's name appears only
// with the whole file. A write that fails past the file size limit stands in for the crash.
TEST_F(RegularFileTest, ACopyAppearsUnderItsNameOnlyWhenWhole) {
    const QString source = WriteFile(u"report.pdf"_s, QByteArray(64 * 1024, 'd'));
    const QString copy = folder + u"/report.pdf"_s;
    const QByteArray name = QFile::encodeName(copy);
    g_watchedName = name.constData();
    g_nameSeenDuringWrite = 0;
    {
        const FileSizeLimit limit(64 * 1024 - 1);
        std::signal(SIGXFSZ, NameWatcher);
        EXPECT_FALSE(Platform::CopyRegularFile(source, copy));
    }
    EXPECT_FALSE(g_nameSeenDuringWrite);
    EXPECT_EQ(FolderEntries(), QStringList());
    EXPECT_TRUE(Platform::CopyRegularFile(source, copy));
    EXPECT_EQ(Read(copy), QByteArray(64 * 1024, 'd'));
    EXPECT_FALSE(Platform::CopyRegularFile(source, copy));
}

} // namespace
