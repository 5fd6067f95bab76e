#include "SamplePdf.h"
#include "support/AmbrelTest.h"
#include "viewer/CFileDetailsPane.h"
#include "viewer/CPdfPane.h"
#include "viewer/CViewerWindow.h"

#include <QFile>

namespace {

using namespace Qt::StringLiterals;

class ViewerWindowTest : public AmbrelTest {
protected:
    CViewerWindow window;
};

TEST_F(ViewerWindowTest, ShowsAPdfFromItsFirstPage) {
    const QString path = Home() + u"/three pages.PDF"_s;
    ASSERT_TRUE(WriteSamplePdf(path, 3));
    window.ShowFile(path);
    ASSERT_EQ(window.CurrentlyShowing(), CViewerWindow::Showing::Pdf);
    EXPECT_EQ(window.PdfPane()->PageCount(), 3);
    EXPECT_EQ(window.PdfPane()->CurrentPage(), 0);
    EXPECT_TRUE(window.windowTitle().startsWith(u"three pages.PDF - "_s));
}

TEST_F(ViewerWindowTest, ShowsTheDetailsOfADocumentOfAnotherKind) {
    const QString path = WriteFile(u"letters/Letter to Ann.doc"_s, QByteArray(1500, 'x'));
    window.ShowFile(path);
    ASSERT_EQ(window.CurrentlyShowing(), CViewerWindow::Showing::Details);
    const CFileDetailsPane* details = window.DetailsPane();
    EXPECT_EQ(details->NameText(), u"Letter to Ann.doc"_s);
    EXPECT_TRUE(details->SizeText().contains(u"1,500 bytes"_s) ||
                details->SizeText().contains(u"1500 bytes"_s))
        << details->SizeText().toStdString();
    EXPECT_NE(details->ModifiedText(), u"—"_s);
}

TEST_F(ViewerWindowTest, AFileThatCannotBeShownGivesAMessageNotACrash) {
    struct Case {
        QString path;
        QString says;
    };
    const QString unreadable = WriteFile(u"locked.pdf"_s, "%PDF-1.4\n");
    QFile::setPermissions(unreadable, QFileDevice::WriteOwner);
    const bool canRead = QFile(unreadable).open(QIODevice::ReadOnly); // root reads everything
    const Case cases[] = {
        {Home() + u"/gone.pdf"_s, u"cannot be found"_s},
        {WriteFile(u"damaged.pdf"_s, "%PDF-1.4\n1 0 obj << /Type /Catalog /Pages 2 0 R"),
         u"damaged"_s},
        {WriteFile(u"empty.pdf"_s, {}), u"damaged"_s},
        {unreadable, canRead ? u"damaged"_s : u"cannot be read"_s},
    };
    for (const Case& c : cases) {
        window.ShowFile(c.path);
        EXPECT_EQ(window.CurrentlyShowing(), CViewerWindow::Showing::Message)
            << c.path.toStdString();
        EXPECT_TRUE(window.MessageText().contains(c.says)) << window.MessageText().toStdString();
    }
}

} // namespace
