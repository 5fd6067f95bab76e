#include "common/ReleasePtr.h"
#include "notes/CImageFileNoteConstructor.h"
#include "notes/CTextFileNoteConstructor.h"
#include "notes/NoteConstructorRegistry.h"
#include "support/AmbrelTest.h"
#include "support/RecordingMessageBox.h"

#include <QDir>
#include <QFile>

#include <chrono>
#include <condition_variable>
#include <mutex>
#include <thread>

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

namespace {

const QString kCannotOpen = QStringLiteral(
    "Quillmark Ambrel was not able to open the file %1\nThe file may contain invalid characters.");
const QString kTooLarge = QStringLiteral("The file %1 exceeds 1MB in size.  Only the first 1MB "
                                         "of data has been added to your note.");

class NoteConstructorTest : public AmbrelTest {
protected:
    void SetUp() override {
        AmbrelTest::SetUp();
        Platform::SetMessageBox(&messages);
        itemFolder = Home() + QStringLiteral("/Catalog/2F1A4C3E-0B5D-4E6F-8A7B-9C0D1E2F3A4B");
        ASSERT_TRUE(QDir().mkpath(itemFolder));
        notePath = itemFolder + QStringLiteral("/note.htm");
    }

    // Makes a note from a source file with the given bytes, as the navigator does.
    int MakeNote(const QString& fileName, const QByteArray& bytes, int preformatted = 1,
                 const NoteDefaults& defaults = NoteDefaults()) {
        const QString source = WriteFile(QStringLiteral("drop/") + fileName, bytes);
        ReleasePtr<CBasicNoteConstructor> constructor(CreateNoteConstructor(source));
        if (!constructor)
            return -1;
        constructor->SetPreformatted(preformatted);
        constructor->SetNoteDefaults(defaults);
        return constructor->Create(notePath, QStringLiteral("Title"));
    }

    static QByteArray Read(const QString& path) {
        QFile file(path);
        return file.open(QIODevice::ReadOnly) ? file.readAll() : QByteArray();
    }

    // The text between the DIV tags of the note, decoded.
    QString Body() const {
        const QString text = QString::fromUtf8(Read(notePath));
        const qsizetype start = text.indexOf(QStringLiteral("<BODY><DIV>"));
        const qsizetype end = text.lastIndexOf(QStringLiteral("</DIV></BODY>"));
        if (start < 0 || end < start)
            return QStringLiteral("(no note)");
        return text.mid(start + 11, end - start - 11);
    }

    QStringList MessageTexts() const {
        QStringList texts;
        for (const RecordingMessageBox::Shown& shown : messages.shown) {
            EXPECT_EQ(shown.caption, QStringLiteral("Quillmark Ambrel"));
            EXPECT_EQ(shown.style, unsigned(Platform::MessageBoxStyle::Ok));
            texts.append(shown.text);
        }
        return texts;
    }

    RecordingMessageBox messages;
    QString itemFolder;
    QString notePath;
};

// Stands by while a FIFO may be read: a reader still waiting on it after a while gets some text
// and the end of it, so that a test that would block for ever fails instead.
class FifoRelease {
public:
    explicit FifoRelease(const QString& fifo)
        : m_thread([this, path = QFile::encodeName(fifo)] {
              std::unique_lock lock(m_mutex);
              if (m_finished.wait_for(lock, std::chrono::seconds(2), [this] { return m_done; }))
                  return;
              // Opening for writing without waiting succeeds only while someone reads.
              if (const int fd = ::open(path.constData(), O_WRONLY | O_NONBLOCK); fd >= 0) {
                  m_released = ::write(fd, "text", 4) == 4;
                  ::close(fd);
              }
          }) {}
    // Answers whether a reader had to be let go.
    bool Finish() {
        {
            const std::lock_guard lock(m_mutex);
            m_done = true;
        }
        m_finished.notify_one();
        m_thread.join();
        return m_released;
    }

private:
    std::mutex m_mutex;
    std::condition_variable m_finished;
    bool m_done = false;
    bool m_released = false;
    std::thread m_thread;
};

template <class Expected> bool Makes(const QString& fileName) {
    ReleasePtr<CBasicNoteConstructor> constructor(CreateNoteConstructor(fileName));
    return dynamic_cast<Expected*>(constructor.get()) != nullptr;
}

TEST_F(NoteConstructorTest, ExtensionChoosesTheConstructor) {
    for (const char* name : {"/a/NOTES.TXT", "/a/x.Tmp", "/a/b.c/list.txt"})
        EXPECT_TRUE(Makes<CTextFileNoteConstructor>(QLatin1StringView(name))) << name;
    for (const char* name : {"/a/p.jpg", "/a/p.GIF", "/a/p.bmp", "/a/p.Png"})
        EXPECT_TRUE(Makes<CImageFileNoteConstructor>(QLatin1StringView(name))) << name;
    for (const char* name :
         {"/a/p.jpeg", "/a/page.htm", "/a/readme", "/a/x.txt.gz", "/a/b.txt/readme"})
        EXPECT_FALSE(
            ReleasePtr<CBasicNoteConstructor>(CreateNoteConstructor(QLatin1StringView(name))))
            << name;
}

TEST_F(NoteConstructorTest, SmallTextFileMakesThisExactNote) {
    EXPECT_EQ(MakeNote(QStringLiteral("four.txt"), QByteArrayLiteral("abcd")), 1);
    const QByteArray expected(
        "<!DOCTYPE HTML PUBLIC \"-//W3C//DTD HTML 4.0 Transitional//EN\"><HTML><HEAD><TITLE>"
        "Title</TITLE><STYLE type=\"text/css\" > BODY { BACKGROUND : #ffffff url(  ) repeat top "
        "left scroll;FONT-FAMILY : Times New Roman;FONT-SIZE : 12 pt;COLOR : black; } P { "
        "MARGIN-TOP : 0 em;MARGIN-BOTTOM : 0 em; } </STYLE></HEAD><BODY><DIV><PRE><FONT "
        "FACE=\"Times New Roman\">abcd</FONT></PRE></DIV></BODY></HTML>\0",
        387);
    EXPECT_EQ(Read(notePath), expected);
    EXPECT_TRUE(messages.shown.isEmpty());
}

TEST_F(NoteConstructorTest, SettingsValuesReachTheNote) {
    NoteDefaults defaults;
    defaults.font = QStringLiteral("Bad \"Font\" & Co");
    defaults.fontSize = 14;
    defaults.backgroundColor = QStringLiteral("0,128,255");
    defaults.backgroundImage = QStringLiteral("NONE");
    EXPECT_EQ(MakeNote(QStringLiteral("a.txt"), QByteArrayLiteral("text"), 1, defaults), 1);
    const QByteArray note = Read(notePath);
    EXPECT_TRUE(note.contains("BODY { BACKGROUND : #0080ff none repeat top left scroll;"
                              "FONT-FAMILY : Bad \"Font\" & Co;FONT-SIZE : 14 pt;COLOR : black; }"))
        << note.toStdString();
    // Inside the attribute the font name cannot end the element early.
    EXPECT_EQ(Body(), QStringLiteral(
                          "<PRE><FONT FACE=\"Bad &quot;Font&quot; &amp; Co\">text</FONT></PRE>"));
}

TEST_F(NoteConstructorTest, TextStaysTextInTheNote) {
    EXPECT_EQ(MakeNote(QStringLiteral("a.txt"),
                       QByteArrayLiteral("a<b>c & <script>x()</script> \"q\""), 0),
              1);
    EXPECT_EQ(Body(), QStringLiteral("a&lt;b&gt;c &amp; &lt;script&gt;x()&lt;/script&gt; \"q\""));
}

TEST_F(NoteConstructorTest, EveryEncodingOfTextFiles) {
    const struct {
        const char* what;
        QByteArray bytes;
        const char16_t* text; // null: no note is made
    } cases[] = {
        {"ASCII", QByteArrayLiteral("Hello\r\n\tthere"), u"Hello\r\n\tthere"},
        {"UTF-8 without mark", QByteArrayLiteral("caf\xc3\xa9 \xe2\x82\xac"), u"caf\u00e9 \u20ac"},
        {"Windows-1252", QByteArrayLiteral("caf\xe9 \x80\x96\x93\x81\x9f\xff"),
         u"caf\u00e9 \u20ac\u2013\u201c\u0081\u0178\u00ff"},
        {"UTF-8 mark", QByteArrayLiteral("\xef\xbb\xbf\xc3\xa9t\xc3\xa9"), u"\u00e9t\u00e9"},
        {"UTF-8 mark, bad byte, zero", QByteArrayLiteral("\xef\xbb\xbfz\xffz\0c"), u"z\ufffdz"},
        {"UTF-16 LE", QByteArrayLiteral("\xff\xfeh\0\xe9\0\xac\x20"), u"h\u00e9\u20ac"},
        {"UTF-16 LE odd", QByteArrayLiteral("\xff\xfeh\0i"), u"hi"},
        {"UTF-16 LE zero unit", QByteArrayLiteral("\xff\xfeh\0\0\0i\0"), u"h"},
        {"UTF-16 BE even", QByteArrayLiteral("\xfe\xff\0h\0\xe9\x20\xac"), u"h\u00e9\u20ac"},
        {"UTF-16 BE odd", QByteArrayLiteral("\xfe\xff\0h\0i\0"), nullptr},
        {"UTF-32 BE", QByteArrayLiteral("\0\0\xfe\xff\0\0\0h"), nullptr},
        {"UTF-32 LE", QByteArrayLiteral("\xff\xfe\0\0h\0\0\0"), nullptr},
        {"UTF-16 LE starting with a zero", QByteArrayLiteral("\xff\xfe\0\0h\0"), nullptr},
    };
    for (const auto& c : cases) {
        SCOPED_TRACE(c.what);
        QFile::remove(notePath);
        messages.shown.clear();
        const int made = MakeNote(QStringLiteral("e.txt"), c.bytes, 0);
        EXPECT_EQ(made, c.text ? 1 : 0);
        EXPECT_EQ(Body(), c.text ? QString::fromUtf16(c.text) : QStringLiteral("(no note)"));
        EXPECT_EQ(MessageTexts(),
                  c.text ? QStringList() : QStringList{kCannotOpen.arg(QStringLiteral("e.txt"))});
    }
}

TEST_F(NoteConstructorTest, ControlBytesRefuseTextFilesButNotHandedOverText) {
    const QByteArray bytes = QByteArrayLiteral("a\fb\x14"
                                               "c\0d\x1f"
                                               "e");
    EXPECT_EQ(MakeNote(QStringLiteral("page.txt"), bytes, 0), 0);
    EXPECT_EQ(MessageTexts(), QStringList{kCannotOpen.arg(QStringLiteral("page.txt"))});

    messages.shown.clear();
    EXPECT_EQ(MakeNote(QStringLiteral("clip.TMP"), bytes, 0), 1);
    EXPECT_EQ(Body(), QStringLiteral("a b-c d e"));
    EXPECT_TRUE(messages.shown.isEmpty());
}

TEST_F(NoteConstructorTest, TooShortOrUnreadableSources) {
    EXPECT_EQ(MakeNote(QStringLiteral("three.txt"), QByteArrayLiteral("abc")), 0);
    QDir().mkpath(Home() + QStringLiteral("/folder.txt"));
    for (const char* name : {"/gone.txt", "/folder.txt", "/gone.bmp"}) {
        ReleasePtr<CBasicNoteConstructor> constructor(
            CreateNoteConstructor(Home() + QLatin1StringView(name)));
        constructor->SetNoteDefaults(NoteDefaults());
        EXPECT_EQ(constructor->Create(notePath, QStringLiteral("t")), 0) << name;
    }
    // A missing picture makes nothing without a message.
    EXPECT_EQ(MessageTexts(), (QStringList{kCannotOpen.arg(QStringLiteral("three.txt")),
                                           kCannotOpen.arg(QStringLiteral("gone.txt")),
                                           kCannotOpen.arg(QStringLiteral("folder.txt"))}));
    EXPECT_FALSE(QFile::exists(notePath));
}

TEST_F(NoteConstructorTest, OnlyRegularFilesAreReadAndNothingWaitsForAFifo) {
    const QString drop = Home() + QStringLiteral("/drop/");
    QDir().mkpath(drop);
    const QString fifo = drop + QStringLiteral("fifo.txt");
    ASSERT_EQ(::mkfifo(QFile::encodeName(fifo).constData(), 0600), 0);
    // Links are followed to what they name.
    ASSERT_TRUE(QFile::link(fifo, drop + QStringLiteral("fifo.png")));
    ASSERT_TRUE(QFile::link(QStringLiteral("/dev/null"), drop + QStringLiteral("null.gif")));
    const QStringList names{QStringLiteral("fifo.txt"), QStringLiteral("fifo.png"),
                            QStringLiteral("null.gif")};
    QStringList expected;
    for (const QString& name : names) {
        ReleasePtr<CBasicNoteConstructor> constructor(CreateNoteConstructor(drop + name));
        constructor->SetNoteDefaults(NoteDefaults());
        FifoRelease release(fifo);
        EXPECT_EQ(constructor->Create(notePath, QStringLiteral("t")), 0) << name.toStdString();
        EXPECT_FALSE(release.Finish()) << name.toStdString() << " waited for a writer";
        expected.append(kCannotOpen.arg(name));
    }
    EXPECT_EQ(MessageTexts(), expected);
    EXPECT_TRUE(QDir(itemFolder).isEmpty()) << "something was written beside the note";
}

TEST_F(NoteConstructorTest, SizeLimitIsOneMillionTwentyFourThousandBytes) {
    QByteArray exact(1024000, 'a');
    exact.back() = 'z';
    for (const QByteArray& bytes : {exact, exact + 'y'}) {
        QFile::remove(notePath);
        EXPECT_EQ(MakeNote(QStringLiteral("big.txt"), bytes, 0), 1);
        EXPECT_EQ(Body().size(), 1024000);
        EXPECT_TRUE(Body().endsWith(QStringLiteral("aaz")));
    }
    EXPECT_EQ(MessageTexts(), QStringList{kTooLarge.arg(QStringLiteral("big.txt"))})
        << "only the larger file is cut";

    // A UTF-8 character cut by the limit is dropped; the text before it stays UTF-8.
    QFile::remove(notePath);
    messages.shown.clear();
    QByteArray cut = QByteArrayLiteral("\xc3\xa9") + QByteArray(1023997, 'a') + "\xe2\x82\xac";
    EXPECT_EQ(MakeNote(QStringLiteral("cut.txt"), cut, 0), 1);
    EXPECT_EQ(Body().size(), 1023998);
    EXPECT_TRUE(Body().startsWith(QStringLiteral("\u00e9aa")));
}

TEST_F(NoteConstructorTest, PictureIsCopiedBesideTheNoteUnderAnEscapedName) {
    const QByteArray picture = QByteArrayLiteral("\x89PNG\r\n\x1a\n picture bytes");
    EXPECT_EQ(MakeNote(QStringLiteral("Holiday 1.png"), picture), 1);
    EXPECT_EQ(Body(), QStringLiteral("<img src=\"Holiday 1.png\" alt=\"Holiday 1.png\">"));
    EXPECT_EQ(Read(itemFolder + QStringLiteral("/Holiday 1.png")), picture);
    EXPECT_TRUE(QFile::exists(Home() + QStringLiteral("/drop/Holiday 1.png")));

    QFile::remove(notePath);
    EXPECT_EQ(MakeNote(QStringLiteral("a\" onerror=\"x()&.jpg"), QByteArrayLiteral("jpeg")), 1);
    EXPECT_EQ(Body(), QStringLiteral("<img src=\"a&quot; onerror=&quot;x()&amp;.jpg\" "
                                     "alt=\"a&quot; onerror=&quot;x()&amp;.jpg\">"));
    EXPECT_TRUE(QFile::exists(itemFolder + QStringLiteral("/a\" onerror=\"x()&.jpg")));
}

TEST_F(NoteConstructorTest, PictureNeverReplacesAFileInTheNoteFolder) {
    WriteFile(QStringLiteral("Catalog/2F1A4C3E-0B5D-4E6F-8A7B-9C0D1E2F3A4B/p.gif"), "older");
    EXPECT_EQ(MakeNote(QStringLiteral("p.gif"), QByteArrayLiteral("newer")), 0);
    EXPECT_EQ(MessageTexts(), QStringList{kCannotOpen.arg(QStringLiteral("p.gif"))});
    EXPECT_FALSE(QFile::exists(notePath));
    EXPECT_EQ(Read(itemFolder + QStringLiteral("/p.gif")), QByteArrayLiteral("older"));
}

TEST_F(NoteConstructorTest, NoNoteWithoutDefaultsOrWhenTheFileCannotBeWritten) {
    const QString source = WriteFile(QStringLiteral("drop/a.txt"), "text");
    ReleasePtr<CBasicNoteConstructor> constructor(CreateNoteConstructor(source));
    EXPECT_EQ(constructor->Create(notePath, QStringLiteral("t")), 0);
    EXPECT_FALSE(QFile::exists(notePath));

    constructor->SetNoteDefaults(NoteDefaults());
    EXPECT_EQ(
        constructor->Create(itemFolder + QStringLiteral("/missing/note.htm"), QStringLiteral("t")),
        0);
    EXPECT_TRUE(messages.shown.isEmpty());
}

} // namespace
