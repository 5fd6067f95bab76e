#include "SamplePdf.h"
#include "support/AmbrelTest.h"
#include "viewer/CPdfPane.h"

#include <QPrinter>

namespace {

using namespace Qt::StringLiterals;

class PdfPaneTest : public AmbrelTest {
protected:
    QString SamplePath(int pages, int wordPage = -1, const QString& word = {}) {
        const QString path = Home() + u"/sample document.pdf"_s;
        EXPECT_TRUE(WriteSamplePdf(path, pages, wordPage, word));
        return path;
    }
    CPdfPane pane;
};

TEST_F(PdfPaneTest, OpensAtTheFirstPageAndPagesWithinTheDocument) {
    ASSERT_EQ(pane.Load(SamplePath(5)), QPdfDocument::Error::None);
    EXPECT_EQ(pane.PageCount(), 5);
    EXPECT_EQ(pane.CurrentPage(), 0);
    pane.PageUp();
    EXPECT_EQ(pane.CurrentPage(), 0);
    pane.PageDown();
    pane.PageDown();
    EXPECT_EQ(pane.CurrentPage(), 2);
    pane.PageUp();
    EXPECT_EQ(pane.CurrentPage(), 1);
    pane.GoToPage(40);
    EXPECT_EQ(pane.CurrentPage(), 4);
    pane.PageDown();
    EXPECT_EQ(pane.CurrentPage(), 4);

    // A second document starts at its first page again.
    ASSERT_EQ(pane.Load(SamplePath(3)), QPdfDocument::Error::None);
    EXPECT_EQ(pane.PageCount(), 3);
    EXPECT_EQ(pane.CurrentPage(), 0);
}

TEST_F(PdfPaneTest, ZoomWalksTheStepsAndStopsAtTheEnds) {
    ASSERT_EQ(pane.Load(SamplePath(1)), QPdfDocument::Error::None);
    EXPECT_DOUBLE_EQ(pane.ZoomFactor(), 1.0);
    pane.ZoomIn();
    EXPECT_DOUBLE_EQ(pane.ZoomFactor(), 1.25);
    pane.ZoomOut();
    pane.ZoomOut();
    EXPECT_DOUBLE_EQ(pane.ZoomFactor(), 0.75);
    for (int i = 0; i < 10; ++i)
        pane.ZoomOut();
    EXPECT_DOUBLE_EQ(pane.ZoomFactor(), 0.25);
    for (int i = 0; i < 20; ++i)
        pane.ZoomIn();
    EXPECT_DOUBLE_EQ(pane.ZoomFactor(), 4.0);
}

TEST_F(PdfPaneTest, FindShowsThePageThatHoldsTheWordAndComesRoundAgain) {
    ASSERT_EQ(pane.Load(SamplePath(6, 3, u"Marmalade"_s)), QPdfDocument::Error::None);
    EXPECT_TRUE(pane.FindNext(u"marmalade"_s));
    EXPECT_EQ(pane.CurrentPage(), 3);
    pane.GoToPage(5);
    EXPECT_TRUE(pane.FindNext(u"marmalade"_s));
    EXPECT_EQ(pane.CurrentPage(), 3);
    EXPECT_FALSE(pane.FindNext(u"Quince"_s));
    EXPECT_EQ(pane.CurrentPage(), 3);
}

TEST_F(PdfPaneTest, PrintsThePrintersPageRange) {
    ASSERT_EQ(pane.Load(SamplePath(4)), QPdfDocument::Error::None);
    const QString printed = Home() + u"/printed.pdf"_s;
    {
        QPrinter printer(QPrinter::HighResolution);
        printer.setOutputFormat(QPrinter::PdfFormat);
        printer.setOutputFileName(printed);
        printer.setPrintRange(QPrinter::PageRange);
        printer.setFromTo(2, 3);
        ASSERT_TRUE(pane.Print(&printer));
    }
    QPdfDocument result;
    ASSERT_EQ(result.load(printed), QPdfDocument::Error::None);
    EXPECT_EQ(result.pageCount(), 2);
    // The printed page carries the document's page, not a blank sheet.
    const QImage image = result.render(0, QSize(200, 283));
    int dark = 0;
    for (int y = 0; y < image.height(); ++y)
        for (int x = 0; x < image.width(); ++x)
            dark += qGray(image.pixel(x, y)) < 128 ? 1 : 0;
    EXPECT_GT(dark, 50);
}

} // namespace
