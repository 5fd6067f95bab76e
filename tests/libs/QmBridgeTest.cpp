#include "ServicesTestSupport.h"

#include "common/ReleasePtr.h"
#include "libs/toolwell/IQmBridge.h"
#include "libs/toolwell/WordProcessor.h"
#include "platform/Registry.h"

#include <QClipboard>
#include <QDeadlineTimer>
#include <QFileInfo>
#include <QGuiApplication>
#include <QImage>
#include <QMimeData>
#include <QSettings>
#include <QThread>

namespace {

class QmBridgeTest : public ServicesTest {
protected:
    void SetUp() override {
        ServicesTest::SetUp();
        bridge.reset(GetQmBridge());
        ASSERT_TRUE(bridge);
        QGuiApplication::clipboard()->clear();
    }

    static void Configure(const QString& command, const QString& newDocumentSwitch = {}) {
        Platform::Registry::SetUserValue(WordProcessor::KeyPath, WordProcessor::CommandValue,
                                         command);
        if (!newDocumentSwitch.isEmpty())
            Platform::Registry::SetUserValue(
                WordProcessor::KeyPath, WordProcessor::NewDocumentSwitchValue, newDocumentSwitch);
    }

    HRESULT Connect(QString* target) {
        UnicodeStringPtr sink(target);
        return bridge->ConnectToQm(0, &sink);
    }

    // The single file the word processor was started with.
    QString OpenedFile() const {
        EXPECT_EQ(launcher.starts.size(), 1);
        if (launcher.starts.size() != 1 || launcher.starts[0].arguments.size() != 1)
            return {};
        return launcher.starts[0].arguments[0];
    }

    ReleasePtr<IQmBridge> bridge;
};

TEST_F(QmBridgeTest, WithoutAWordProcessorNothingConnectsOrStarts) {
    QString target = QStringLiteral("unchanged");
    EXPECT_EQ(Connect(&target), E_FAIL);
    EXPECT_EQ(target, QStringLiteral("unchanged"));
    EXPECT_EQ(bridge->CreateDocument(0, {}, 1), E_FAIL);
    QGuiApplication::clipboard()->setText(QStringLiteral("text"));
    EXPECT_EQ(bridge->PasteClipboardToQm(), E_FAIL);
    EXPECT_TRUE(launcher.starts.isEmpty());
    EXPECT_TRUE(TempEntries().isEmpty());
}

TEST_F(QmBridgeTest, WriterOnThePathIsFoundAndStartsANewDocument) {
    const QString suite = WriteScript(QStringLiteral("bin/libreoffice"));
    QString target;
    ASSERT_EQ(Connect(&target), S_OK);
    EXPECT_EQ(target, suite);

    // The Writer launcher wins over the suite's general one.
    const QString writer = InstallWriter();
    ASSERT_EQ(Connect(&target), S_OK);
    EXPECT_EQ(target, writer);
    EXPECT_EQ(bridge->ConnectToQm(0, nullptr), S_OK);

    ASSERT_EQ(bridge->CreateDocument(0, target, 1), S_OK);
    ASSERT_EQ(launcher.starts.size(), 1);
    EXPECT_EQ(launcher.starts[0].program, writer);
    EXPECT_EQ(launcher.starts[0].arguments, QStringList{QStringLiteral("--writer")});
}

TEST_F(QmBridgeTest, ConfiguredCommandComesBeforeWriter) {
    InstallWriter();
    const QString mine = WriteScript(QStringLiteral("apps/my writer"));
    Configure(mine, QStringLiteral("--new"));
    QString target;
    ASSERT_EQ(Connect(&target), S_OK);
    EXPECT_EQ(target, mine);
    ASSERT_EQ(bridge->CreateDocument(0, {}, 1), S_OK);
    ASSERT_EQ(launcher.starts.size(), 1);
    EXPECT_EQ(launcher.starts[0].program, mine);
    EXPECT_EQ(launcher.starts[0].arguments, QStringList{QStringLiteral("--new")});

    // A bare name is looked up on PATH; without a switch a new document is a plain start.
    const QString named = WriteScript(QStringLiteral("bin/quickpad"));
    Platform::Registry::RemoveUserValue(WordProcessor::KeyPath,
                                        WordProcessor::NewDocumentSwitchValue);
    Configure(QStringLiteral("quickpad"));
    ASSERT_EQ(bridge->CreateDocument(0, {}, 1), S_OK);
    ASSERT_EQ(launcher.starts.size(), 2);
    EXPECT_EQ(launcher.starts[1].program, named);
    EXPECT_TRUE(launcher.starts[1].arguments.isEmpty());
}

TEST_F(QmBridgeTest, ConfiguredCommandThatCannotBeFoundIsNotReplacedByWriter) {
    InstallWriter();
    WriteFile(QStringLiteral("apps/not-executable"), "#!/bin/sh\n");
    for (const QString& command :
         {Home() + QStringLiteral("/apps/missing"), Home() + QStringLiteral("/apps/not-executable"),
          QStringLiteral("apps/relative"), QStringLiteral("not-on-path")}) {
        Configure(command);
        QString target;
        EXPECT_EQ(Connect(&target), E_FAIL) << command.toStdString();
    }
    EXPECT_EQ(bridge->CreateDocument(0, {}, 1), E_FAIL);
    EXPECT_TRUE(launcher.starts.isEmpty());
}

TEST_F(QmBridgeTest, MachineWideCommandServesUsersWithoutTheirOwn) {
    const QString shared = WriteScript(QStringLiteral("opt/shared-writer"));
    {
        QSettings machine(Platform::Registry::MachineFile(), QSettings::IniFormat);
        machine.setValue(QStringLiteral("SOFTWARE/Brindle/Quillmark Ambrel/Word Processor/Command"),
                         shared);
    }
    QString target;
    ASSERT_EQ(Connect(&target), S_OK);
    EXPECT_EQ(target, shared);
}

TEST_F(QmBridgeTest, TargetNamingAnotherProgramIsRefused) {
    InstallWriter();
    const QString note = WriteFile(QStringLiteral("note.htm"), "<p>x</p>");
    const QString other = QStringLiteral("/bin/sh");
    EXPECT_EQ(bridge->CreateDocument(0, other, 1), E_INVALIDARG);
    EXPECT_EQ(bridge->SendNotesToQm({note}, {}, other), E_INVALIDARG);
    // Only the blank template exists, and the document is always shown.
    EXPECT_EQ(bridge->CreateDocument(1, {}, 1), E_INVALIDARG);
    EXPECT_EQ(bridge->CreateDocument(0, {}, 0), E_INVALIDARG);
    EXPECT_TRUE(launcher.starts.isEmpty());
}

TEST_F(QmBridgeTest, NotesOpenTogetherInListOrderLeavingOutMissingFiles) {
    const QString writer = InstallWriter();
    const QString second = WriteFile(QStringLiteral("notes/B/note.htm"), "<p>b</p>");
    const QString first = WriteFile(QStringLiteral("notes/A/note.htm"), "<p>a</p>");
    const QString missing = Home() + QStringLiteral("/notes/C/note.htm");
    QString target;
    ASSERT_EQ(Connect(&target), S_OK);

    ASSERT_EQ(
        bridge->SendNotesToQm({second, missing, Home() + QStringLiteral("/notes/A/../A/note.htm")},
                              QStringLiteral("Folder"), target),
        S_OK);
    ASSERT_EQ(launcher.starts.size(), 1);
    EXPECT_EQ(launcher.starts[0].program, writer);
    EXPECT_EQ(launcher.starts[0].arguments, (QStringList{second, first}));

    EXPECT_EQ(bridge->SendNotesToQm({}, QStringLiteral("Folder"), target), S_FALSE);
    EXPECT_EQ(bridge->SendNotesToQm({missing, QString()}, QStringLiteral("Folder"), target),
              E_FAIL);
    launcher.succeed = false;
    EXPECT_EQ(bridge->SendNotesToQm({first}, {}, target), E_FAIL);
    EXPECT_EQ(launcher.starts.size(), 2);
}

TEST_F(QmBridgeTest, NotebookDocumentOpensAsACopyLinkedDocumentInPlace) {
    InstallWriter();
    const QString linked = WriteFile(QStringLiteral("Documents/report.pdf"), "linked");
    ASSERT_EQ(bridge->SendDocumentToQm(linked, {}, false), S_OK);
    EXPECT_EQ(OpenedFile(), linked);
    EXPECT_TRUE(TempEntries().isEmpty());

    launcher.starts.clear();
    const QString stored = WriteFile(QStringLiteral("data/item/plan.doc"), "stored");
    ASSERT_EQ(bridge->SendDocumentToQm(stored, {}, true), S_OK);
    const QString copy = OpenedFile();
    EXPECT_NE(copy, stored);
    EXPECT_TRUE(copy.startsWith(TempFolder() + u'/'));
    EXPECT_EQ(QFileInfo(copy).fileName(), QStringLiteral("plan.doc"));
    EXPECT_EQ(ReadAll(copy), QByteArray("stored"));
    EXPECT_EQ(bridge->SendDocumentToQm(Home() + QStringLiteral("/gone.pdf"), {}, false), E_FAIL);
}

TEST_F(QmBridgeTest, HandOverFilesAreRemovedWhenTheWordProcessorDoesNotStart) {
    InstallWriter();
    launcher.succeed = false;
    const QString stored = WriteFile(QStringLiteral("data/item/plan.doc"), "stored");
    const QString picture = WriteFile(QStringLiteral("shot.png"), "png");
    QGuiApplication::clipboard()->setText(QStringLiteral("text"));
    EXPECT_EQ(bridge->SendDocumentToQm(stored, {}, true), E_FAIL);
    EXPECT_EQ(bridge->SendPictureToQm(picture, {}), E_FAIL);
    EXPECT_EQ(bridge->PasteClipboardToQm(), E_FAIL);
    EXPECT_EQ(launcher.starts.size(), 3);
    EXPECT_TRUE(TempEntries().isEmpty());
    EXPECT_TRUE(QFileInfo::exists(stored));
    EXPECT_TRUE(QFileInfo::exists(picture));
}

TEST_F(QmBridgeTest, PictureOpensAsADocumentShowingItsOwnCopy) {
    InstallWriter();
    const QString picture = WriteFile(QStringLiteral("shots/Snap & shot.png"), "png bytes");
    ASSERT_EQ(bridge->SendPictureToQm(picture, {}), S_OK);
    const QString document = OpenedFile();
    EXPECT_TRUE(document.startsWith(TempFolder() + u'/'));
    EXPECT_EQ(QFileInfo(document).fileName(), QStringLiteral("Snap & shot.htm"));
    EXPECT_EQ(ReadAll(QFileInfo(document).dir().filePath(QStringLiteral("Snap & shot.png"))),
              QByteArray("png bytes"));
    EXPECT_EQ(ReadAll(document), QByteArray("\xEF\xBB\xBF"
                                            "<!DOCTYPE html>\n<html>\n<head>\n"
                                            "<meta charset=\"utf-8\">\n"
                                            "<title>Snap &amp; shot</title>\n</head>\n<body>\n"
                                            "<p><img src=\"Snap%20%26%20shot.png\" "
                                            "alt=\"Snap &amp; shot.png\"></p>\n"
                                            "</body>\n</html>\n"));
    // The caller's file may go at once: the document does not depend on it.
    EXPECT_TRUE(QFile::remove(picture));
    EXPECT_EQ(bridge->SendPictureToQm(picture, {}), E_FAIL);
}

TEST_F(QmBridgeTest, ClipboardTextHtmlAndPictureBecomeADocument) {
    InstallWriter();
    QClipboard* clipboard = QGuiApplication::clipboard();

    clipboard->setText(QStringLiteral("a < b\u00e9"));
    ASSERT_EQ(bridge->PasteClipboardToQm(), S_OK);
    QByteArray content = ReadAll(OpenedFile());
    EXPECT_TRUE(content.startsWith("\xEF\xBB\xBF<!DOCTYPE html>")) << content.constData();
    EXPECT_TRUE(content.contains("<title>Clipboard</title>")) << content.constData();
    EXPECT_TRUE(content.contains("a &lt; b\xC3\xA9")) << content.constData();

    launcher.starts.clear();
    auto* fragment = new QMimeData;
    fragment->setHtml(QStringLiteral("<b>bold %1</b>"));
    fragment->setText(QStringLiteral("plain"));
    clipboard->setMimeData(fragment);
    ASSERT_EQ(bridge->PasteClipboardToQm(), S_OK);
    content = ReadAll(OpenedFile());
    EXPECT_TRUE(content.contains("<body>\n<b>bold %1</b>\n</body>")) << content.constData();
    EXPECT_FALSE(content.contains("plain"));

    launcher.starts.clear();
    auto* page = new QMimeData;
    page->setHtml(QStringLiteral("<HTML><body>whole</body></HTML>"));
    clipboard->setMimeData(page);
    ASSERT_EQ(bridge->PasteClipboardToQm(), S_OK);
    EXPECT_EQ(ReadAll(OpenedFile()), QByteArray("\xEF\xBB\xBF<HTML><body>whole</body></HTML>"));

    launcher.starts.clear();
    QImage image(3, 2, QImage::Format_RGB32);
    image.fill(Qt::red);
    clipboard->setImage(image);
    ASSERT_EQ(bridge->PasteClipboardToQm(), S_OK);
    const QString document = OpenedFile();
    EXPECT_TRUE(ReadAll(document).contains("<img src=\"Clipboard.png\""));
    const QImage pasted(QFileInfo(document).dir().filePath(QStringLiteral("Clipboard.png")));
    EXPECT_EQ(pasted.size(), QSize(3, 2));
    EXPECT_EQ(pasted.pixelColor(1, 1), QColor(Qt::red));
}

TEST_F(QmBridgeTest, EmptyClipboardIsAFailure) {
    InstallWriter();
    EXPECT_EQ(bridge->PasteClipboardToQm(), E_FAIL);
    QGuiApplication::clipboard()->setMimeData(new QMimeData);
    EXPECT_EQ(bridge->PasteClipboardToQm(), E_FAIL);
    EXPECT_TRUE(launcher.starts.isEmpty());
    EXPECT_TRUE(TempEntries().isEmpty());
}

// The real launcher hands every path over as one argument, blanks and all.
TEST_F(QmBridgeTest, WordProcessorReceivesThePathsAsArguments) {
    Platform::SetProcessLauncher(nullptr);
    const QString record = Home() + QStringLiteral("/arguments.txt");
    Configure(
        WriteScript(QStringLiteral("apps/recorder"),
                    "PATH=/usr/bin:/bin\nfor a in \"$@\"; do printf '%s\\n' \"$a\"; done > \"" +
                        QFile::encodeName(record) + ".part\"\nmv \"" + QFile::encodeName(record) +
                        ".part\" \"" + QFile::encodeName(record) + "\"\n"));
    const QString first = WriteFile(QStringLiteral("My Notes/one note.htm"), "1");
    const QString second = WriteFile(QStringLiteral("My Notes/-two.htm"), "2");
    ASSERT_EQ(bridge->SendNotesToQm({first, second}, {}, {}), S_OK);

    const QDeadlineTimer deadline(10000);
    while (!QFileInfo::exists(record) && !deadline.hasExpired())
        QThread::msleep(20);
    EXPECT_EQ(ReadAll(record), QFile::encodeName(first) + '\n' + QFile::encodeName(second) + '\n');
}

} // namespace
