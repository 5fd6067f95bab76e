#include "navigator/NavigatorModelFixture.h"

#include "drop/CDropTarget.h"
#include "drop/CNavigatorFileDropOperation.h"
#include "drop/IDropFeedback.h"
#include "messaging/INoteToolService.h"

#include <QCoreApplication>
#include <QDir>
#include <QDropEvent>
#include <QFile>
#include <QFileInfo>
#include <QMimeData>
#include <QTreeWidget>
#include <QUrl>

#include <sys/stat.h>

namespace {

// A tree as the navigator's does it for outside drags: the row under the point becomes the
// model's drop target, and only places under the Notebook take a drop.
class FakeTree final : public QTreeWidget, public IDropFeedback {
public:
    FakeTree() {
        setHeaderHidden(true);
        resize(300, 400);
    }
    QPoint AddRow(const QString& itemId) {
        auto* row = new QTreeWidgetItem(this, {itemId});
        row->setData(0, Qt::UserRole, itemId);
        return visualItemRect(row).center();
    }

    bool DragOverFromOutside(const QPoint& viewportPoint) override {
        QTreeWidgetItem* row = itemAt(viewportPoint);
        WNavDS::Instance()->SetDropTargetById(row ? row->data(0, Qt::UserRole).toString()
                                                  : QString());
        marked = row != nullptr;
        return WNavDS::Instance()->DropTargetAccepts(true);
    }
    void RemoveInsertionMark() override { marked = false; }
    void EndExternalDrag() override { ++ended; }

    bool marked = false;
    int ended = 0;
};

struct DragOutcome {
    bool entered;
    bool over;
    bool dropped;
};

class DropTargetTest : public NavigatorModelFixture {
protected:
    void SetUp() override {
        NavigatorModelFixture::SetUp();
        m_oldTemp = qgetenv("TMPDIR");
        ASSERT_TRUE(QDir().mkpath(TempFolder()));
        qputenv("TMPDIR", QFile::encodeName(TempFolder()));
        folder = Folder();
        model = Load();
        tree = std::make_unique<FakeTree>();
        new CDropTarget(tree->viewport(), tree.get());
        atFolder = tree->AddRow(folder);
    }
    void TearDown() override {
        tree.reset();
        qputenv("TMPDIR", m_oldTemp);
        NavigatorModelFixture::TearDown();
    }

    QString TempFolder() const { return Home() + u"/tmp"_s; }

    // Enters, hovers and drops at the point as a drag from another program does.
    DragOutcome Drag(const QMimeData& data, const QPoint& at) {
        QWidget* viewport = tree->viewport();
        const Qt::DropActions actions = Qt::CopyAction | Qt::MoveAction | Qt::LinkAction;
        QDragEnterEvent enter(at, actions, &data, Qt::LeftButton, Qt::NoModifier);
        QCoreApplication::sendEvent(viewport, &enter);
        QDragMoveEvent move(at, actions, &data, Qt::LeftButton, Qt::NoModifier);
        QCoreApplication::sendEvent(viewport, &move);
        QDropEvent drop(at, actions, &data, Qt::LeftButton, Qt::NoModifier);
        QCoreApplication::sendEvent(viewport, &drop);
        return {enter.isAccepted() && enter.dropAction() == Qt::CopyAction,
                move.isAccepted() && move.dropAction() == Qt::CopyAction,
                drop.isAccepted() && drop.dropAction() == Qt::CopyAction};
    }
    DragOutcome DragFiles(const QStringList& paths) {
        QMimeData data;
        QList<QUrl> urls;
        for (const QString& path : paths)
            urls.append(QUrl::fromLocalFile(path));
        data.setUrls(urls);
        return Drag(data, atFolder);
    }
    DragOutcome DragText(const QByteArray& text) {
        QMimeData data;
        data.setData(u"text/plain"_s, text);
        return Drag(data, atFolder);
    }

    // The records in the folder, in list order.
    QList<NavListItemData*> InFolder() const {
        QList<NavListItemData*> records;
        for (const auto& record : model->GetItems()) {
            if (record->GetParent() == model->FindItem(folder))
                records.append(record.get());
        }
        return records;
    }
    QStringList TitlesInFolder() const {
        QStringList titles;
        for (const NavListItemData* record : InFolder())
            titles.append(record->GetTitle());
        return titles;
    }
    QByteArray NoteFile(const NavListItemData* record) const {
        QFile file(ItemFile(record->GetItemId()));
        return file.open(QIODevice::ReadOnly) ? file.readAll() : QByteArray();
    }
    QString DefaultTitle() const {
        QString title;
        UnicodeStringPtr sink(&title);
        model->GetNoteToolService()->GetDefaultNoteTitle(&sink);
        return title;
    }
    QStringList TempFiles() const {
        return QDir(TempFolder()).entryList(QDir::Files | QDir::Hidden | QDir::System);
    }

    QString folder;
    WNavDS* model = nullptr;
    std::unique_ptr<FakeTree> tree;
    QPoint atFolder;

private:
    QByteArray m_oldTemp;
};

TEST_F(DropTargetTest, DroppedFilesLandOnTheDropTargetAsNotesAndLinkedDocuments) {
    const QString text = WriteFile(u"in/a.txt"_s, "meeting minutes");
    const QString picture = WriteFile(u"in/b.jpg"_s, "picture bytes");
    // A name with blanks, quotes and letters beyond ASCII, as a file manager encodes it.
    const QString pdf = WriteFile(u"in/Q3 r\u00E9port 'x'.PDF"_s, "%PDF");
    QMimeData data;
    const QByteArray in = "file://" + QUrl::toPercentEncoding(Home(), "/") + "/in/";
    data.setData(u"text/uri-list"_s,
                 in + "a.txt\r\n" + in + "b.jpg\r\n" + in + "Q3%20r%C3%A9port%20%27x%27.PDF\r\n");

    const DragOutcome outcome = Drag(data, atFolder);
    EXPECT_TRUE(outcome.entered);
    EXPECT_TRUE(outcome.over);
    EXPECT_TRUE(outcome.dropped);
    EXPECT_FALSE(tree->marked);
    EXPECT_EQ(tree->ended, 1);

    const QList<NavListItemData*> dropped = InFolder();
    ASSERT_EQ(TitlesInFolder(), (QStringList{u"a.txt"_s, u"b.jpg"_s, u"Q3 r\u00E9port 'x'.PDF"_s}));
    for (const NavListItemData* note : dropped.first(2)) {
        EXPECT_EQ(note->GetKind(), ItemKindNote);
        EXPECT_EQ(CatalogValue(note->GetItemId(), u"open"_s), u"false"_s);
    }
    EXPECT_TRUE(NoteFile(dropped[0]).contains("meeting minutes"));
    EXPECT_TRUE(QFile::exists(ItemFile(dropped[1]->GetItemId(), u"b.jpg"_s)));
    for (const QString& source : {text, picture, pdf})
        EXPECT_TRUE(QFile::exists(source)) << "a dropped file is the user's and stays";

    // A document dropped into the notebook joins it: the model copies the linked file in.
    const QString documentId = dropped[2]->GetItemId();
    EXPECT_EQ(dropped[2]->GetKind(), ItemKindDocument);
    EXPECT_EQ(CatalogValue(documentId, u"subtype"_s), u"PDF"_s);
    QFile copy(ItemFile(documentId, QFileInfo(pdf).fileName()));
    ASSERT_TRUE(copy.open(QIODevice::ReadOnly));
    EXPECT_EQ(copy.readAll(), "%PDF");
    EXPECT_TRUE(launcher.starts.isEmpty()) << "nothing dropped is opened";
    EXPECT_TRUE(messages.shown.isEmpty());
}

TEST_F(DropTargetTest, ADragWithAnyEntryThatCannotBeTakenIsRefusedWhole) {
    const QString text = WriteFile(u"in/a.txt"_s, "meeting minutes");
    const QString pdf = WriteFile(u"in/b.pdf"_s, "%PDF");
    const QString zip = WriteFile(u"in/c.zip"_s, "PK");
    ASSERT_TRUE(QDir().mkpath(Home() + u"/in/notes"_s));
    ASSERT_TRUE(QDir().mkpath(Home() + u"/in/old.txt"_s));
    const QString fifo = Home() + u"/in/pipe.txt"_s;
    ASSERT_EQ(mkfifo(QFile::encodeName(fifo).constData(), 0600), 0);

    const struct {
        const char* name;
        QList<QUrl> urls;
    } drags[] = {
        {"one zip among three",
         {QUrl::fromLocalFile(text), QUrl::fromLocalFile(zip), QUrl::fromLocalFile(pdf)}},
        {"a folder", {QUrl::fromLocalFile(Home() + u"/in/notes"_s)}},
        {"a folder named like text", {QUrl::fromLocalFile(Home() + u"/in/old.txt"_s)}},
        {"a pipe named like text", {QUrl::fromLocalFile(fifo)}},
        {"a remote file", {QUrl::fromLocalFile(text), QUrl(u"https://example.org/a.txt"_s)}},
    };
    const qsizetype records = model->GetItems().size();
    for (const auto& drag : drags) {
        SCOPED_TRACE(drag.name);
        QMimeData data;
        data.setUrls(drag.urls);
        const DragOutcome outcome = Drag(data, atFolder);
        EXPECT_FALSE(outcome.entered);
        EXPECT_FALSE(outcome.over);
        EXPECT_FALSE(outcome.dropped);
        EXPECT_EQ(model->GetItems().size(), records);
    }
    EXPECT_TRUE(messages.shown.isEmpty());
}

TEST_F(DropTargetTest, AMissingFileAmongGoodOnesIsReportedOnceAndTheOthersAreTaken) {
    const QString text = WriteFile(u"in/a.txt"_s, "meeting minutes");
    const DragOutcome outcome =
        DragFiles({Home() + u"/in/gone.png"_s, text, Home() + u"/in/gone.pdf"_s});

    EXPECT_TRUE(outcome.entered);
    EXPECT_FALSE(outcome.dropped) << "not every file was taken";
    EXPECT_EQ(TitlesInFolder(), QStringList{u"a.txt"_s});
    QStringList shown;
    for (const auto& message : messages.shown)
        shown.append(message.text);
    const QString unreadable = u"Quillmark Ambrel was not able to open the file %1\n"
                               u"The file may contain invalid characters."_s;
    EXPECT_EQ(shown, (QStringList{unreadable.arg(u"gone.png"_s), unreadable.arg(u"gone.pdf"_s)}));
}

TEST_F(DropTargetTest, DroppedTextBecomesAnUnopenedNoteOnlyBelowTheSizeLimit) {
    QByteArray text(324159, 'x');
    text[80] = '\n';
    EXPECT_TRUE(DragText(text).dropped);
    ASSERT_EQ(TitlesInFolder(), QStringList{DefaultTitle()});
    EXPECT_EQ(CatalogValue(InFolder()[0]->GetItemId(), u"open"_s), u"false"_s);
    EXPECT_TRUE(NoteFile(InFolder()[0]).contains(text.sliced(81)));
    EXPECT_EQ(TempFiles(), QStringList()) << "the temporary file is left behind";

    const DragOutcome tooLong = DragText(text + 'x');
    EXPECT_TRUE(tooLong.entered);
    EXPECT_FALSE(tooLong.dropped);
    EXPECT_EQ(InFolder().size(), 1);
    EXPECT_TRUE(messages.shown.isEmpty());
    EXPECT_EQ(TempFiles(), QStringList());
}

TEST_F(DropTargetTest, DroppedTextLetsControlBytesAndBrokenEncodingThrough) {
    const struct {
        QByteArray text;
        QString body;
    } drops[] = {
        {"page\fbreak", u"page break"_s},
        {"one\x14two", u"one-two"_s},
        {QByteArray("kept\0dropped", 12), u"kept"_s},
        {"caf\xE9 \xFF!", u"caf\u00E9 \u00FF!"_s},
        {"\t  \r\n ", u"\t  \r\n "_s},
    };
    for (const auto& drop : drops) {
        SCOPED_TRACE(drop.body.toStdString());
        const qsizetype before = InFolder().size();
        EXPECT_TRUE(DragText(drop.text).dropped);
        ASSERT_EQ(InFolder().size(), before + 1);
        const QString note = QString::fromUtf8(NoteFile(InFolder().last()));
        EXPECT_TRUE(note.contains(u"<PRE><FONT FACE=\"Times New Roman\">"_s + drop.body +
                                  u"</FONT></PRE>"_s))
            << note.toStdString();
    }
    EXPECT_TRUE(messages.shown.isEmpty());
    EXPECT_EQ(TempFiles(), QStringList());
}

TEST_F(DropTargetTest, TheFirstOfferedFormatDecidesWhatIsDropped) {
    const QString text = WriteFile(u"in/a.txt"_s, "meeting minutes");
    QMimeData textFirst;
    textFirst.setData(u"text/plain"_s, "words dragged from an editor");
    textFirst.setUrls({QUrl::fromLocalFile(text)});
    QMimeData filesFirst;
    filesFirst.setUrls({QUrl::fromLocalFile(text)});
    filesFirst.setData(u"text/plain"_s, "words dragged from an editor");

    EXPECT_TRUE(Drag(textFirst, atFolder).dropped);
    EXPECT_TRUE(Drag(filesFirst, atFolder).dropped);
    EXPECT_EQ(TitlesInFolder(), (QStringList{DefaultTitle(), u"a.txt"_s}));
    EXPECT_TRUE(NoteFile(InFolder()[0]).contains("words dragged from an editor"));
}

TEST_F(DropTargetTest, OnlyPlacesUnderTheNotebookTakeADropAndLeavingEndsTheDrag) {
    const QPoint atDeleted = tree->AddRow(model->GetDeletedItems()->GetItemId());
    QMimeData data;
    data.setUrls({QUrl::fromLocalFile(WriteFile(u"in/a.txt"_s, "meeting minutes"))});
    QWidget* viewport = tree->viewport();

    QDragEnterEvent enter(atDeleted, Qt::CopyAction, &data, Qt::LeftButton, Qt::NoModifier);
    QCoreApplication::sendEvent(viewport, &enter);
    EXPECT_TRUE(enter.isAccepted());
    QDragMoveEvent overDeleted(atDeleted, Qt::CopyAction, &data, Qt::LeftButton, Qt::NoModifier);
    QCoreApplication::sendEvent(viewport, &overDeleted);
    EXPECT_FALSE(overDeleted.isAccepted());
    QDragMoveEvent overFolder(atFolder, Qt::CopyAction, &data, Qt::LeftButton, Qt::NoModifier);
    QCoreApplication::sendEvent(viewport, &overFolder);
    EXPECT_TRUE(overFolder.isAccepted());
    EXPECT_TRUE(tree->marked);

    QDragLeaveEvent leave;
    QCoreApplication::sendEvent(viewport, &leave);
    EXPECT_FALSE(tree->marked);
    EXPECT_EQ(tree->ended, 1);
    EXPECT_TRUE(InFolder().isEmpty());
}

TEST_F(DropTargetTest, OnlyDocumentsToLinkCountAsAllLinked) {
    CNavigatorFileDropOperation operation;
    const struct {
        QStringList files;
        int allLinked;
    } cases[] = {
        {{u"/in/a.pdf"_s, u"/in/b.QMD"_s, u"/in/c.doc"_s}, 1},
        {{u"/in/a.pdf"_s, u"/in/b.txt"_s}, 0},
        {{u"/in/a"_s}, 0},
    };
    for (const auto& drag : cases) {
        QMimeData data;
        QList<QUrl> urls;
        for (const QString& file : drag.files)
            urls.append(QUrl::fromLocalFile(file));
        data.setUrls(urls);
        EXPECT_EQ(operation.AreAllLinkedDocuments(&data), drag.allLinked)
            << drag.files.join(u' ').toStdString();
    }
    QMimeData textOnly;
    textOnly.setText(u"a.pdf"_s);
    EXPECT_EQ(operation.AreAllLinkedDocuments(&textOnly), 0);
    EXPECT_EQ(operation.AreAllLinkedDocuments(nullptr), 1);
}

} // namespace
