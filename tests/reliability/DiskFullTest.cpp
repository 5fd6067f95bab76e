// Full disks and read-only folders: every save fails cleanly, the old files stay whole, no
// temporary file is left behind, nothing crashes and the user hears once for each kind of file.
#include "Reliability.h"

#include "app/CNavigatorApp.h"
#include "catalog/IDataStoreService.h"
#include "navigator/WNavDS.h"
#include "notes/INoteDocumentCreator.h"
#include "settings/NavigatorSettings.h"
#include "support/AmbrelTest.h"
#include "support/FileSizeLimit.h"
#include "support/NavigatorProcess.h"
#include "support/RecordingMessageBox.h"
#include "support/RecordingProcessLauncher.h"

#include <QApplication>
#include <QDBusConnection>
#include <QDBusConnectionInterface>
#include <QDBusMessage>
#include <QDBusMetaType>
#include <QDBusReply>
#include <QDeadlineTimer>
#include <QDir>
#include <QDirIterator>
#include <QFile>
#include <QFileInfo>
#include <QMap>
#include <QProcess>
#include <QStringEncoder>
#include <QThread>
#include <QTimer>

#include <algorithm>
#include <csignal>
#include <functional>
#include <sys/resource.h>

namespace {

using namespace Qt::StringLiterals;

const QString kNoteId = u"7C9E6679-7425-40DE-944B-E07FC1F90AE7"_s;
const QString kNavigatorName = u"com.brindle.QuillmarkAmbrel.AmbrelService"_s;

// Small enough for every file the navigator and the note tool save, large enough for the
// start-up lock in the runtime folder.
constexpr rlim_t kSizeLimit = 200;

// What the checks counted.
struct Figures {
    int catalog = 0;
    int settings = 0;
    int notes = 0;
    int noteTool = 0;
    int messages = 0;
    int temporaryFiles = 0;
    int cleanRuns = 0;
    int runs = 0;
};
// How the data folder is made unwritable.
enum class Jail { SizeLimit, FullDisk, ReadOnly };

const char* JailName(Jail jail) {
    switch (jail) {
    case Jail::SizeLimit:
        return "file size limit";
    case Jail::FullDisk:
        return "full disk";
    case Jail::ReadOnly:
        break;
    }
    return "read-only folder";
}

// The shell scripts that run a program ("$@" after the folder "$1") in a private mount
// namespace over the folder. A full disk is a small tmpfs holding a copy of the folder and
// filled to the last block; its files are copied out to "$1.after" once the program ended. A
// read-only folder is the folder itself, bound read-only, so its files are seen afterwards.
QString JailScript(Jail jail) {
    if (jail == Jail::ReadOnly)
        return uR"(dir="$1"; shift
mount --bind "$dir" "$dir" && mount -o remount,bind,ro "$dir" || exit 90
exec "$@")"_s;
    return uR"(dir="$1"; shift
mount -t tmpfs -o size=64k tmpfs "$dir" && cp -a "$dir.prepared"/. "$dir"/ || exit 90
dd if=/dev/zero of="$dir/filler" bs=1024 2>/dev/null
"$@" & pid=$!
trap "kill -TERM $pid" TERM
while :; do wait $pid; code=$?; kill -0 $pid 2>/dev/null || break; done
rm -f "$dir/filler"; mkdir -p "$dir.after" && cp -a "$dir"/. "$dir.after"/
exit $code)"_s;
}

// Whether this machine lets a test make its own mount namespace.
QString NamespaceRefusal() {
    QProcess probe;
    probe.start(u"unshare"_s, {u"--user"_s, u"--map-root-user"_s, u"--mount"_s, u"sh"_s, u"-c"_s,
                               u"mount -t tmpfs -o size=4k tmpfs /mnt"_s});
    if (!probe.waitForFinished(10000) || probe.exitStatus() != QProcess::NormalExit ||
        probe.exitCode() != 0)
        return u"private mount namespaces are not allowed here: "_s +
               QString::fromLocal8Bit(probe.readAllStandardError()).trimmed();
    return {};
}

// Every file below folder, relative to it, with its bytes.
QMap<QString, QByteArray> FilesBelow(const QString& folder) {
    QMap<QString, QByteArray> files;
    QDirIterator it(folder, QDir::Files | QDir::Hidden, QDirIterator::Subdirectories);
    while (it.hasNext()) {
        QFile file(it.next());
        if (file.open(QIODevice::ReadOnly))
            files.insert(QDir(folder).relativeFilePath(file.fileName()), file.readAll());
    }
    return files;
}

// The files of after that before did not have: what a failed save left behind.
int LeftBehind(const QMap<QString, QByteArray>& before, const QMap<QString, QByteArray>& after) {
    int count = 0;
    for (auto it = after.cbegin(); it != after.cend(); ++it)
        count += before.contains(it.key()) ? 0 : 1;
    return count;
}

bool WaitFor(const std::function<bool()>& done, int timeoutMs = 20000) {
    const QDeadlineTimer deadline(timeoutMs);
    while (!done() && !deadline.hasExpired())
        QThread::msleep(20);
    return done();
}

bool OnBus(const QString& name) {
    return QDBusConnection::sessionBus().interface()->isServiceRegistered(name).value();
}

// Whether the navigator's event loop answers a message: it then has started up, its handler of
// SIGTERM included.
bool NavigatorAnswers() {
    qDBusRegisterMetaType<QMap<QString, QString>>();
    QDBusMessage post = QDBusMessage::createMethodCall(
        kNavigatorName, u"/AmbrelService"_s, u"com.brindle.QuillmarkAmbrel.Broker"_s, u"Post"_s);
    post.setArguments({u"DiskFullTest"_s, QVariant::fromValue(QMap<QString, QString>())});
    return QDBusConnection::sessionBus().call(post).type() == QDBusMessage::ReplyMessage;
}

class DiskFullTest : public AmbrelTest {
protected:
    QString CatalogFolder() const { return AppDataFolder() + u"/Catalog"_s; }
    QString NotePath() const { return CatalogFolder() + u'/' + kNoteId + u"/note.htm"_s; }

    // A catalog with one note that a crashed run left recorded open, so the next start changes
    // it, a settings file that the start rewrites, and the note's file; below home/data.
    void PrepareNotebook(const QString& home) const {
        const QString below = QDir(Home()).relativeFilePath(home);
        const QString data =
            (below.isEmpty() ? QString() : below + u'/') + u"data/Brindle/Quillmark Ambrel"_s;
        WriteFile(data + u"/Catalog/catalog.xml"_s,
                  QStringLiteral("<?xml version=\"1.0\" encoding=\"UTF-8\"?><archive><organization>"
                                 "<root><child uuidref=\"%1\"/></root></organization><items>"
                                 "<note uuid=\"%1\"><properties><type>note</type><title>Kept"
                                 "</title><filename>note.htm</filename><open>true</open>"
                                 "</properties></note></items></archive>")
                      .arg(kNoteId)
                      .toUtf8());
        WriteFile(data + u"/NavSettings.dat"_s,
                  QStringEncoder(QStringConverter::Utf16LE).encode(u"keepontop|false|"_s));
        const QString note = WriteFile(data + u"/Catalog/"_s + kNoteId + u"/.keep"_s, {});
        INoteDocumentCreator* creator = CreateNoteDocumentCreator();
        creator->SetFilePath(QFileInfo(note).path() + u"/note.htm"_s);
        creator->SetTitle(u"Kept"_s);
        creator->SetContent(u"<P>The old text of the note, which must survive.</P>"_s);
        ASSERT_EQ(creator->Write(), S_OK);
        creator->Release();
    }

    // Runs program with arguments, kept from writing into folder in the jail's way.
    void StartJailed(NavigatorProcess& process, Jail jail, const QString& folder,
                     const QString& program, const QStringList& arguments) {
        if (jail == Jail::SizeLimit) {
            process.Process().setChildProcessModifier([] {
                std::signal(SIGXFSZ, SIG_IGN);
                rlimit limit{};
                getrlimit(RLIMIT_FSIZE, &limit);
                limit.rlim_cur = kSizeLimit;
                setrlimit(RLIMIT_FSIZE, &limit);
            });
            process.Start(arguments);
            return;
        }
        if (jail == Jail::FullDisk) {
            const QString prepared = folder + u".prepared"_s;
            ASSERT_TRUE(QProcess::execute(u"cp"_s, {u"-a"_s, folder, prepared}) == 0);
        }
        process.Start(QStringList{u"--user"_s, u"--map-root-user"_s, u"--mount"_s, u"sh"_s, u"-c"_s,
                                  JailScript(jail), u"sh"_s, folder, program} +
                      arguments);
    }

    // The folder's files as the jailed program left them.
    static QMap<QString, QByteArray> FilesAfter(Jail jail, const QString& folder) {
        return FilesBelow(jail == Jail::FullDisk ? folder + u".after"_s : folder);
    }

    void SavesInTheNavigator(Figures* figures);
    void AnEndWhileTheMessageIsOpen(Figures* figures);
    void NavigatorRuns(Jail jail, Figures* figures);
    void NoteToolSaves(Jail jail, Figures* figures);
};

// In the program itself: the catalog, the settings and new notes fail at every idle pass, and
// the user is told once for each.
void DiskFullTest::SavesInTheNavigator(Figures* figures) {
    PrepareNotebook(Home());
    RecordingProcessLauncher launcher;
    Platform::SetProcessLauncher(&launcher);
    CNavigatorApp app({u"ambrel-navigator"_s});
    ASSERT_TRUE(app.InitInstance());
    RecordingMessageBox box;
    Platform::SetMessageBox(&box);
    app.OnIdle(0);
    const QMap<QString, QByteArray> before = FilesBelow(AppDataFolder());
    IDataStoreService* service = GetDataStoreService();
    NavigatorSettings* settings = NavigatorSettings::Instance();
    WNavDS* navigator = WNavDS::Instance();

    const int rounds = Reliability::Rounds(8, 200);
    int catalog = 0;
    int settingsFailed = 0;
    int notes = 0;
    {
        const FileSizeLimit full(kSizeLimit);
        for (int round = 0; round < rounds; ++round) {
            const QString source =
                WriteFile(u"in/round%1.txt"_s.arg(round), "A dropped text for a new note.");
            notes += navigator->AddNoteFromFile(source, nullptr) == E_FAIL ? 1 : 0;
            navigator->NewFolder(nullptr);
            app.MainWindow()->move(round, round);
            app.OnIdle(0);
            catalog += service->GetSaveError(nullptr, nullptr) == S_OK ? 1 : 0;
            settingsFailed += settings->IsDirty() && !settings->SaveError().isEmpty() ? 1 : 0;
            QCoreApplication::processEvents(); // the posted messages
        }
    }
    EXPECT_EQ(catalog, rounds);
    EXPECT_EQ(settingsFailed, rounds);
    EXPECT_EQ(notes, rounds);
    const QMap<QString, QByteArray> after = FilesBelow(AppDataFolder());
    EXPECT_EQ(after, before) << "a file changed, or a temporary or note file was left";
    ASSERT_EQ(box.shown.size(), 3) << "one message for each kind of file";
    for (const QString& file : {AppDataFolder() + u"/Catalog/catalog.xml"_s,
                                AppDataFolder() + u"/NavSettings.dat"_s, CatalogFolder()}) {
        EXPECT_TRUE(std::any_of(box.shown.cbegin(), box.shown.cend(),
                                [&](const auto& shown) { return shown.text.contains(file); }))
            << "no message names " << file.toStdString();
    }
    delete app.MainWindow();
    app.ExitInstance();

    figures->catalog += catalog;
    figures->settings += settingsFailed;
    figures->notes += notes;
    figures->messages += static_cast<int>(box.shown.size());
    figures->temporaryFiles += LeftBehind(before, after);
}

// A SIGTERM while the message box is open ends the program cleanly, and the files stay whole.
void DiskFullTest::AnEndWhileTheMessageIsOpen(Figures* figures) {
    PrepareNotebook(Home());
    const QMap<QString, QByteArray> before = FilesBelow(AppDataFolder());
    CNavigatorApp app({u"ambrel-navigator"_s});
    QString message;
    QTimer watcher;
    QObject::connect(&watcher, &QTimer::timeout, [&] {
        if (QWidget* modal = QApplication::activeModalWidget(); modal && message.isEmpty()) {
            message =
                modal->findChild<QWidget*>(u"qt_msgbox_label"_s)
                    ? modal->findChild<QWidget*>(u"qt_msgbox_label"_s)->property("text").toString()
                    : u"?"_s;
            std::raise(SIGTERM);
        }
    });
    watcher.start(10);
    int exitCode = -1;
    {
        const FileSizeLimit full(kSizeLimit);
        exitCode = app.Run();
    }
    EXPECT_EQ(exitCode, 0);
    EXPECT_TRUE(message.contains(u"File too large"_s)) << message.toStdString();
    EXPECT_TRUE(QApplication::topLevelWidgets().isEmpty());
    const QMap<QString, QByteArray> after = FilesBelow(AppDataFolder());
    EXPECT_EQ(after, before);
    figures->temporaryFiles += LeftBehind(before, after);
    figures->messages += message.isEmpty() ? 0 : 1;
}

// The built navigator, started on an unwritable data folder and ended by SIGTERM.
void DiskFullTest::NavigatorRuns(Jail jail, Figures* figures) {
    const QString home = Home() + u"/run"_s + QString::number(static_cast<int>(jail));
    PrepareNotebook(home);
    const QString folder = home + u"/data/Brindle/Quillmark Ambrel"_s;
    const QMap<QString, QByteArray> before = FilesBelow(folder);
    const QString navigator = Reliability::LoneNavigatorCopy(home);
    ASSERT_FALSE(navigator.isEmpty());
    {
        NavigatorProcess process(home, jail == Jail::SizeLimit ? navigator : u"unshare"_s);
        StartJailed(process, jail, folder, navigator, {});
        ASSERT_TRUE(WaitFor([] { return OnBus(kNavigatorName) && NavigatorAnswers(); }))
            << "the navigator did not start";
        ASSERT_TRUE(process.Terminate(20000)) << "the navigator did not end";
        ++figures->runs;
        const bool clean = process.Process().exitStatus() == QProcess::NormalExit &&
                           process.Process().exitCode() == 0;
        EXPECT_TRUE(clean) << "exit code " << process.Process().exitCode();
        figures->cleanRuns += clean ? 1 : 0;
    }
    const QMap<QString, QByteArray> after = FilesAfter(jail, folder);
    EXPECT_EQ(after, before) << "a file changed, or a temporary file was left";
    figures->temporaryFiles += LeftBehind(before, after);
    ASSERT_TRUE(WaitFor([] { return !OnBus(kNavigatorName); }));
}

// The note tool, asked to save into an unwritable folder: it answers false and keeps running,
// and the old note stays whole.
void DiskFullTest::NoteToolSaves(Jail jail, Figures* figures) {
    const QString noteTool =
        QFileInfo(QStringLiteral(AMBREL_NAVIGATOR_PATH)).path() + u"/AmbrelNoteTool"_s;
    const QString home = Home() + u"/note"_s + QString::number(static_cast<int>(jail));
    PrepareNotebook(home);
    const QString notePath =
        home + u"/data/Brindle/Quillmark Ambrel/Catalog/"_s + kNoteId + u"/note.htm"_s;
    const QString folder = QFileInfo(notePath).path();
    const QMap<QString, QByteArray> before = FilesBelow(folder);
    NavigatorProcess process(home, jail == Jail::SizeLimit ? noteTool : u"unshare"_s);
    StartJailed(process, jail, folder, noteTool,
                {notePath, u"/PROPERTY"_s, u"itemid|"_s + kNoteId + u'|'});
    QString name;
    ASSERT_TRUE(WaitFor([&] { return !(name = Reliability::NoteToolOnBus()).isEmpty(); }));
    for (int save = 0; save < Reliability::Rounds(3, 30); ++save) {
        QDBusMessage rename = QDBusMessage::createMethodCall(
            name, u"/NoteTool"_s, u"com.brindle.QuillmarkAmbrel.NoteTool"_s, u"SetTitle"_s);
        rename.setArguments({u"Renamed %1"_s.arg(save)});
        QDBusConnection::sessionBus().call(rename);
        const QDBusReply<bool> saved =
            QDBusConnection::sessionBus().call(QDBusMessage::createMethodCall(
                name, u"/NoteTool"_s, u"com.brindle.QuillmarkAmbrel.NoteTool"_s, u"Save"_s));
        ASSERT_TRUE(saved.isValid()) << "the note tool did not answer";
        EXPECT_FALSE(saved.value());
        figures->noteTool += saved.value() ? 0 : 1;
    }
    EXPECT_TRUE(process.Process().waitForStarted());
    EXPECT_EQ(process.Process().state(), QProcess::Running) << "the note tool ended";
    // A note that cannot be written stays open, so that nothing typed is lost: only a kill
    // ends it here.
    process.Process().kill();
    process.Process().waitForFinished(10000);
    const QMap<QString, QByteArray> after = FilesBelow(folder);
    EXPECT_EQ(after, before) << "the note changed, or a temporary file was left";
    figures->temporaryFiles += LeftBehind(before, after);
    ASSERT_TRUE(WaitFor([] { return Reliability::NoteToolOnBus().isEmpty(); }));
}

// One test, so that the figures of all the checks go into one line.
TEST_F(DiskFullTest, EverySaveFailsCleanlyOnAFullOrReadOnlyDisk) {
    Figures figures;
    {
        SCOPED_TRACE("saves in the navigator");
        SavesInTheNavigator(&figures);
    }
    ResetSingletons();
    {
        SCOPED_TRACE("an end while the message is open");
        AnEndWhileTheMessageIsOpen(&figures);
    }
    ResetSingletons();
    const QString refusal = NamespaceRefusal();
    for (const Jail jail : {Jail::SizeLimit, Jail::FullDisk, Jail::ReadOnly}) {
        if (jail != Jail::SizeLimit && !refusal.isEmpty())
            continue;
        SCOPED_TRACE(JailName(jail));
        NavigatorRuns(jail, &figures);
        if (jail != Jail::FullDisk)
            NoteToolSaves(jail, &figures);
    }
    const Figures& f = figures;
    Reliability::Report(
        u"disk full and read-only: %1 saves failed cleanly (catalog %2, "
        "settings %3, notes %4, note tool %5); %6 temporary files left; %7 "
        "messages shown, one per kind; %8 of %9 navigator runs on an unwritable "
        "data folder ended cleanly"_s.arg(f.catalog + f.settings + f.notes + f.noteTool)
            .arg(f.catalog)
            .arg(f.settings)
            .arg(f.notes)
            .arg(f.noteTool)
            .arg(f.temporaryFiles)
            .arg(f.messages)
            .arg(f.cleanRuns)
            .arg(f.runs));
    if (!refusal.isEmpty())
        GTEST_SKIP() << "tmpfs and read-only runs skipped: " << refusal.toStdString();
}

} // namespace
