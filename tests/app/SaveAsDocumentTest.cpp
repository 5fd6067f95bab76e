#include "app/SaveAsDocument.h"

#include "support/AmbrelTest.h"

#include <QDir>
#include <QFile>

using namespace Qt::StringLiterals;

namespace {

class SaveAsDocumentTest : public AmbrelTest {
protected:
    static QByteArray Read(const QString& path) {
        QFile file(path);
        return file.open(QIODevice::ReadOnly) ? file.readAll() : QByteArray("(unreadable)");
    }
};

TEST_F(SaveAsDocumentTest, TheDialogOffersTheDocumentsOwnTypeAsWritten) {
    struct Row {
        QString path;
        QString fileName;
        QString extension;
        QString nameFilter;
        QString defaultSuffix;
    };
    const Row rows[] = {
        {u"/d/Plan.doc"_s, u"Plan.doc"_s, u"doc"_s, u"Microsoft Word Document (*.doc)"_s, u"doc"_s},
        {u"/d/Plan.PDF"_s, u"Plan.PDF"_s, u"PDF"_s, u"PDF Document (*.PDF)"_s, u"PDF"_s},
        {u"/d/a.b/Plan.qmd"_s, u"Plan.qmd"_s, u"qmd"_s, u"Quillmark Document (*.qmd)"_s, u"qmd"_s},
        // Mixed case is no known type; neither is a name without extension.
        {u"/d/Plan.Doc"_s, u"Plan.Doc"_s, u"Doc"_s, u" (*.Doc)"_s, u"Doc"_s},
        {u"/d.x/report"_s, u"report"_s, u"*"_s, u" (*.*)"_s, QString()},
        {u"report.pdf"_s, QString(), u"*"_s, u" (*.*)"_s, QString()},
    };
    for (const Row& row : rows) {
        const SaveAsDocument::FileType type = SaveAsDocument::Describe(row.path);
        EXPECT_EQ(type.fileName, row.fileName) << row.path.toStdString();
        EXPECT_EQ(type.extension, row.extension) << row.path.toStdString();
        EXPECT_EQ(type.nameFilter, row.nameFilter) << row.path.toStdString();
        EXPECT_EQ(type.defaultSuffix, row.defaultSuffix) << row.path.toStdString();
    }
}

TEST_F(SaveAsDocumentTest, SavingOntoItsOwnPathLeavesTheDocumentWhole) {
    const QString document = WriteFile(u"docs/a.pdf"_s, "%PDF whole");
    EXPECT_TRUE(SaveAsDocument::Copy(document, document));
    EXPECT_EQ(Read(document), "%PDF whole");
    // The same file reached by another spelling of its path.
    EXPECT_TRUE(SaveAsDocument::Copy(document, Home() + u"/docs/../docs/a.pdf"_s));
    EXPECT_EQ(Read(document), "%PDF whole");
}

TEST_F(SaveAsDocumentTest, SavingOverAnExistingFileReplacesItWhole) {
    const QString document = WriteFile(u"docs/a.pdf"_s, "new text");
    const QString target = WriteFile(u"out/a.pdf"_s, "the old, longer text");
    // A reader that had the old file open goes on reading it whole: the copy took the old
    // file's place instead of being written into it.
    QFile reader(target);
    ASSERT_TRUE(reader.open(QIODevice::ReadOnly));
    EXPECT_TRUE(SaveAsDocument::Copy(document, target));
    EXPECT_EQ(Read(target), "new text");
    EXPECT_EQ(reader.readAll(), "the old, longer text");
    EXPECT_EQ(QDir(Home() + u"/out"_s).entryList(QDir::Files), QStringList{u"a.pdf"_s});

    EXPECT_FALSE(SaveAsDocument::Copy(Home() + u"/docs/gone.pdf"_s, target));
    EXPECT_EQ(Read(target), "new text");
}

} // namespace
