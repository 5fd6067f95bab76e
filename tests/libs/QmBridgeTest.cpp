#include "ServicesTestSupport.h"

#include "common/ReleasePtr.h"
#include "libs/toolwell/IQmBridge.h"
#include "libs/toolwell/WordProcessor.h"
#include "platform/Registry.h"

#include <QClipboard>
#include <QFileInfo>
#include <QGuiApplication>
#include <QImage>
#include <QMimeData>
#include <QSettings>

namespace {

class QmBridgeTest : public ServicesTest {
protected:
    void SetUp() override {
        ServicesTest::SetUp();
        bridge.reset(GetQmBridge());
        QGuiApplication::clipboard()->clear();
    }

    static void Configure(const QString& command, const QString& newDocumentSwitch = {}) {
        using Platform::Registry;
        Registry::SetUserValue(WordProcessor::KeyPath, WordProcessor::CommandValue, command);
        Registry::SetUserValue(WordProcessor::KeyPath, WordProcessor::NewDocumentSwitchValue,
                               newDocumentSwitch);
    }

    // The target the connect step answers; empty when it fails.
    QString Connected() {
        QString target;
        UnicodeStringPtr sink(&target);
        return bridge->ConnectToQm(0, &sink) == S_OK ? target : QString();
    }

    // The program and arguments of the last start.
    QStringList LastStart() const {
        if (launcher.starts.isEmpty())
            return {};
        return QStringList{launcher.starts.back().program} + launcher.starts.back().arguments;
    }
    // The file the word processor was last started with.
    QString OpenedFile() const { return LastStart().value(1); }

    ReleasePtr<IQmBridge> bridge;
};

TEST_F(QmBridgeTest, WithoutAWordProcessorNothingConnectsOrStarts) {
    EXPECT_EQ(Connected(), QString());
    EXPECT_EQ(bridge->CreateDocument(0, {}, 1), E_FAIL);
    QGuiApplication::clipboard()->setText(QStringLiteral("text"));
    EXPECT_EQ(bridge->PasteClipboardToQm(), E_FAIL);
    EXPECT_TRUE(launcher.starts.isEmpty());
    EXPECT_TRUE(TempEntries().isEmpty());
}

TEST_F(QmBridgeTest, WordProcessorIsFoundInOrderOfPreference) {
    const QString shared = WriteScript(QStringLiteral("opt/shared-writer"));
    QSettings(Platform::Registry::MachineFile(), QSettings::IniFormat)
        .setValue(QStringLiteral("SOFTWARE/Brindle/Quillmark Ambrel/Word Processor/Command"),
                  shared);
    EXPECT_EQ(Connected(), shared) << "the machine-wide command serves users without their own";

    const QString mine = WriteScript(QStringLiteral("apps/my writer"));
    Configure(mine, QStringLiteral("--new"));
    EXPECT_EQ(Connected(), mine);
    ASSERT_EQ(bridge->CreateDocument(0, {}, 1), S_OK);
    EXPECT_EQ(LastStart(), (QStringList{mine, QStringLiteral("--new")}));

    // A bare name is looked up on PATH; without a switch a new document is a plain start.
    const QString named = WriteScript(QStringLiteral("bin/quickpad"));
    Configure(QStringLiteral("quickpad"));
    ASSERT_EQ(bridge->CreateDocument(0, {}, 1), S_OK);
    EXPECT_EQ(LastStart(), QStringList{named});

    // A configured command that cannot be run is never replaced by one found on PATH.
    const QString writer = InstallWriter();
    WriteFile(QStringLiteral("apps/not-executable"), "#!/bin/sh\n");
    for (const QString& command :
         {Home() + QStringLiteral("/apps/missing"), Home() + QStringLiteral("/apps/not-executable"),
          QStringLiteral("not-on-path")}) {
        Configure(command);
        EXPECT_EQ(Connected(), QString()) << command.toStdString();
    }

    // Without one, Writer's own launcher wins over the suite's general one.
    Platform::Registry::RemoveUserValue(WordProcessor::KeyPath, WordProcessor::CommandValue);
    QSettings(Platform::Registry::MachineFile(), QSettings::IniFormat).clear();
    const QString suite = WriteScript(QStringLiteral("bin/libreoffice"));
    ASSERT_EQ(bridge->CreateDocument(0, writer, 1), S_OK);
    EXPECT_EQ(LastStart(), (QStringList{writer, QStringLiteral("--writer")}));
    ASSERT_TRUE(QFile::remove(writer));
    EXPECT_EQ(Connected(), suite);
}

TEST_F(QmBridgeTest, NotesOpenTogetherInListOrderLeavingOutMissingFiles) {
    const QString writer = InstallWriter();
    const QString second = WriteFile(QStringLiteral("notes/B/note.htm"), "<p>b</p>");
    const QString first = WriteFile(QStringLiteral("notes/A/note.htm"), "<p>a</p>");
    const QString missing = Home() + QStringLiteral("/notes/C/note.htm");
    const QString title = QStringLiteral("Folder");
    ASSERT_EQ(bridge->SendNotesToQm(
                  {second, missing, Home() + QStringLiteral("/notes/A/../A/note.htm")}, title, {}),
              S_OK);
    EXPECT_EQ(LastStart(), (QStringList{writer, second, first}));

    // A target naming another program never chooses what is run.
    EXPECT_EQ(bridge->SendNotesToQm({first}, title, QStringLiteral("/bin/sh")), E_INVALIDARG);
    EXPECT_EQ(bridge->CreateDocument(0, QStringLiteral("/bin/sh"), 1), E_INVALIDARG);
    EXPECT_EQ(bridge->SendNotesToQm({}, title, {}), S_FALSE);
    EXPECT_EQ(bridge->SendNotesToQm({missing, QString()}, title, {}), E_FAIL);
    EXPECT_EQ(launcher.starts.size(), 1);
}

TEST_F(QmBridgeTest, NotebookFilesAndPicturesOpenFromTheirOwnCopies) {
    InstallWriter();
    const QString linked = WriteFile(QStringLiteral("Documents/report.pdf"), "linked");
    ASSERT_EQ(bridge->SendDocumentToQm(linked, {}, false), S_OK);
    EXPECT_EQ(OpenedFile(), linked);
    EXPECT_TRUE(TempEntries().isEmpty());
    EXPECT_EQ(bridge->SendDocumentToQm(Home() + QStringLiteral("/gone.pdf"), {}, false), E_FAIL);

    const QString stored = WriteFile(QStringLiteral("data/item/plan.doc"), "stored");
    ASSERT_EQ(bridge->SendDocumentToQm(stored, {}, true), S_OK);
    const QString copy = OpenedFile();
    EXPECT_TRUE(copy.startsWith(TempFolder() + u'/') && copy.endsWith(u"/plan.doc"));
    EXPECT_EQ(ReadAll(copy), QByteArray("stored"));

    // The picture travels with its document, so the caller may remove its own file.
    const QString picture = WriteFile(QStringLiteral("shots/Snap & shot.png"), "png bytes");
    ASSERT_EQ(bridge->SendPictureToQm(picture, {}), S_OK);
    const QString document = OpenedFile();
    EXPECT_TRUE(document.startsWith(TempFolder() + u'/') && document.endsWith(u"/Snap & shot.htm"));
    EXPECT_EQ(ReadAll(QFileInfo(document).dir().filePath(QStringLiteral("Snap & shot.png"))),
              QByteArray("png bytes"));
    EXPECT_EQ(ReadAll(document), QByteArray("\xEF\xBB\xBF"
                                            "<!DOCTYPE html>\n<html>\n<head>\n"
                                            "<meta charset=\"utf-8\">\n"
                                            "<title>Snap &amp; shot</title>\n</head>\n<body>\n"
                                            "<p><img src=\"Snap%20%26%20shot.png\" "
                                            "alt=\"Snap &amp; shot.png\"></p>\n"
                                            "</body>\n</html>\n"));

    // When the word processor does not start, no hand-over file stays; the sources do.
    const QStringList handedOver = TempEntries();
    launcher.succeed = false;
    QGuiApplication::clipboard()->setText(QStringLiteral("text"));
    EXPECT_EQ(bridge->SendDocumentToQm(stored, {}, true), E_FAIL);
    EXPECT_EQ(bridge->SendPictureToQm(picture, {}), E_FAIL);
    EXPECT_EQ(bridge->PasteClipboardToQm(), E_FAIL);
    EXPECT_EQ(launcher.starts.size(), 6);
    EXPECT_EQ(TempEntries(), handedOver);
    EXPECT_TRUE(QFileInfo::exists(stored) && QFileInfo::exists(picture));
}

TEST_F(QmBridgeTest, ClipboardRichTextPictureOrTextBecomesADocument) {
    InstallWriter();
    QClipboard* clipboard = QGuiApplication::clipboard();
    EXPECT_EQ(bridge->PasteClipboardToQm(), E_FAIL) << "empty clipboard";

    clipboard->setText(QStringLiteral("a < b\u00e9"));
    ASSERT_EQ(bridge->PasteClipboardToQm(), S_OK);
    QByteArray content = ReadAll(OpenedFile());
    EXPECT_TRUE(content.contains("<title>Clipboard</title>") &&
                content.contains("<p>a &lt; b\xC3\xA9</p>"))
        << content.constData();

    auto* fragment = new QMimeData;
    fragment->setHtml(QStringLiteral("<b>bold %1</b>"));
    fragment->setText(QStringLiteral("plain"));
    clipboard->setMimeData(fragment);
    ASSERT_EQ(bridge->PasteClipboardToQm(), S_OK);
    content = ReadAll(OpenedFile());
    EXPECT_TRUE(content.contains("<body>\n<b>bold %1</b>\n</body>") && !content.contains("plain"))
        << content.constData();

    clipboard->setImage(QImage(3, 2, QImage::Format_RGB32));
    ASSERT_EQ(bridge->PasteClipboardToQm(), S_OK);
    EXPECT_EQ(
        QImage(QFileInfo(OpenedFile()).dir().filePath(QStringLiteral("Clipboard.png"))).size(),
        QSize(3, 2));
    EXPECT_EQ(launcher.starts.size(), 3);
}

} // namespace
