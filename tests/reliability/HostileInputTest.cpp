#include "Reliability.h"
#include "companion/CompanionBus.h"
#include "navigator/NavigatorModelFixture.h"
#include "support/NavigatorProcess.h"

#include "app/SingleInstance.h"
#include "drop/CDropTarget.h"
#include "drop/IDropFeedback.h"
#include "platform/SharedMemory.h"

#include <QCoreApplication>
#include <QCryptographicHash>
#include <QDeadlineTimer>
#include <QDir>
#include <QDirIterator>
#include <QDropEvent>
#include <QFile>
#include <QFileInfo>
#include <QLocalSocket>
#include <QMimeData>
#include <QThread>
#include <QTreeWidget>
#include <QUrl>
#include <QtEndian>

#include <map>

namespace {

// Item identifiers of the hostile catalog, of the catalog's own form.
const QString kNoteId = u"11111111-1111-1111-1111-111111111111"_s;
const QString kDocumentId = u"22222222-2222-2222-2222-222222222222"_s;
const QString kLinkedId = u"33333333-3333-3333-3333-333333333333"_s;
const QString kFolderId = u"44444444-4444-4444-4444-444444444444"_s;
const QString kTwinId = u"55555555-5555-5555-5555-555555555555"_s;

// Files and folders beside and above the notebook, and where the hostile values point: none of
// them may be created, changed or removed.
class DecoyTree {
public:
    explicit DecoyTree(QStringList roots) : m_roots(std::move(roots)) {}

    // path -> size, content digest and modification time; folders by their path alone.
    std::map<QString, QString> Snapshot() const {
        std::map<QString, QString> entries;
        for (const QString& root : m_roots) {
            QDirIterator walk(root,
                              QDir::AllEntries | QDir::Hidden | QDir::System | QDir::NoDotAndDotDot,
                              QDirIterator::Subdirectories);
            while (walk.hasNext()) {
                const QFileInfo entry(walk.next());
                if (m_ignored(entry.absoluteFilePath()))
                    continue;
                QString state = u"folder"_s;
                if (entry.isFile()) {
                    QFile file(entry.absoluteFilePath());
                    file.open(QIODevice::ReadOnly);
                    state =
                        u"%1 %2 %3"_s.arg(entry.size())
                            .arg(QString::fromLatin1(
                                QCryptographicHash::hash(file.readAll(), QCryptographicHash::Sha256)
                                    .toHex()))
                            .arg(entry.lastModified().toMSecsSinceEpoch());
                }
                entries[entry.absoluteFilePath()] = state;
            }
        }
        return entries;
    }
    void Ignore(std::function<bool(const QString&)> ignored) { m_ignored = std::move(ignored); }

private:
    QStringList m_roots;
    std::function<bool(const QString&)> m_ignored = [](const QString&) { return false; };
};

// The differences between two snapshots, one line each.
QStringList Changes(const std::map<QString, QString>& before,
                    const std::map<QString, QString>& after) {
    QStringList changes;
    for (const auto& [path, state] : before) {
        const auto now = after.find(path);
        if (now == after.end())
            changes.append(u"removed "_s + path);
        else if (now->second != state)
            changes.append(u"changed "_s + path);
    }
    for (const auto& [path, state] : after)
        if (!before.contains(path))
            changes.append(u"created "_s + path);
    return changes;
}

class HostileInputTest : public NavigatorModelFixture {
protected:
    void SetUp() override {
        NavigatorModelFixture::SetUp();
        m_decoy = Home() + u"/decoy"_s;
        for (const char* path :
             {"decoy/victim.txt", "decoy/victim.pdf", "decoy/note.htm", "decoy/folder/note.htm",
              "decoy/folder/deep/picture.jpg", "decoy/notes.txt/inside.txt", "data/above.txt",
              "data/Brindle/beside.txt",
              "data/Brindle/Quillmark Ambrel/"
              "beside/keep.htm"})
            WriteFile(QString::fromLatin1(path), QByteArray("decoy ") + path);
    }

    // The values that try to get out of the notebook or to break what reads them.
    QStringList Hostile(bool forCommandLine) const {
        QStringList values{u"../"_s,
                           u"../../"_s,
                           u"../../../../decoy"_s,
                           u"../../../../decoy/victim.txt"_s,
                           u"../../../../../decoy/folder/note.htm"_s,
                           kNoteId + u"/../../../../decoy"_s,
                           m_decoy,
                           m_decoy + u"/folder"_s,
                           m_decoy + u"/notes.txt"_s,
                           u"/"_s,
                           QString(10240, u'x'),
                           u"line\nbreak.txt"_s,
                           u"%"_s,
                           u"%s%n%x%1.pdf"_s,
                           u"'"_s,
                           u"\""_s,
                           u"'\"].pdf"_s,
                           QString::fromUtf8("\xff\xfe\xc3(.txt"),
                           QString(QChar(0xD800)) + u".pdf"_s,
                           u"."_s,
                           u".."_s,
                           u""_s};
        if (!forCommandLine)
            values.append(QString(u"a\0b.txt"_s));
        return values;
    }
    // The files and folders the decoy covers: everything in the home but the notebook's own
    // catalog and settings and the test's own files.
    DecoyTree Decoy() const {
        DecoyTree tree({Home()});
        const QString catalog = AppDataFolder() + u"/Catalog"_s;
        const QString settings = AppDataFolder() + u"/NavSettings.dat"_s;
        const QString home = Home();
        tree.Ignore([=](const QString& path) {
            return path.startsWith(catalog) || path.startsWith(settings) ||
                   path.startsWith(home + u"/lone"_s) || path.startsWith(home + u"/runtime"_s) ||
                   path.startsWith(home + u"/config"_s) || path.startsWith(home + u"/tmp"_s) ||
                   path == home + u"/navigator-errors.txt"_s;
        });
        return tree;
    }
    // A catalog whose identifiers and file names point outside, with a repeated identifier, a
    // dangling reference and an item that names its own ancestor as its child.
    void WriteHostileCatalog() const {
        const QString up = u"../../../../decoy/note"_s;
        QString items;
        const auto item = [&](const QString& kind, const QString& id, const QString& properties) {
            items += u"<%1 uuid=\"%2\"><properties><type>%1</type><title>t</title>%3"
                     u"</properties></%1>"_s.arg(kind, id, properties);
        };
        item(u"note"_s, up, u"<filename>victim.txt</filename><deleted>true</deleted>"_s);
        item(u"note"_s, m_decoy + u"/x"_s, u"<filename>note.htm</filename><open>true</open>"_s);
        item(u"note"_s, kNoteId,
             u"<filename>../../../../decoy/victim.txt</filename><deleted>true</deleted>"_s);
        item(u"document"_s, kDocumentId,
             u"<subtype>pdf</subtype><filename>../../../../../decoy/victim.pdf</filename>"_s);
        item(u"document"_s, kLinkedId,
             u"<subtype>pdf</subtype><linked>true</linked><path>%1/victim.pdf</path>"
             u"<filename>../victim.pdf</filename>"_s.arg(m_decoy));
        item(u"folder"_s, kFolderId, u"<deleted>true</deleted>"_s);
        item(u"note"_s, kTwinId, u"<filename>/etc/passwd</filename>"_s);
        item(u"note"_s, kTwinId, u"<filename>..</filename><deleted>true</deleted>"_s);
        item(u"note"_s, u""_s, u"<deleted>true</deleted>"_s);
        const QString organization =
            u"<child uuidref=\"%1\"/><child uuidref=\"%2\"/><child uuidref=\"%3\"/>"
            u"<child uuidref=\"%4\"/><child uuidref=\"%5\"/>"
            u"<child uuidref=\"%6\"><child uuidref=\"%6\"><child uuidref=\"%7\"/></child>"
            u"<child uuidref=\"99999999-9999-9999-9999-999999999999\"/></child>"
            u"<child uuidref=\"%7\"/><child uuidref=\"\"/>"_s.arg(
                up, m_decoy + u"/x"_s, kNoteId, kDocumentId, kLinkedId, kFolderId, kTwinId);
        WriteFile(u"data/Brindle/Quillmark Ambrel/Catalog/catalog.xml"_s,
                  (u"<?xml version=\"1.0\"?><archive majorversion=\"1\" minorversion=\"0\">"
                   u"<organization scheme=\"folders\"><root>"_s +
                   organization + u"</root></organization><items>"_s + items +
                   u"</items></archive>"_s)
                      .toUtf8());
    }

    QString m_decoy;
};

// One raw exchange on the hand-over socket; answers once the navigator answered or hung up.
void SendRaw(const QString& socketPath, const QByteArray& bytes, bool waitForAnswer) {
    QLocalSocket socket;
    socket.connectToServer(socketPath);
    if (!socket.waitForConnected(10000))
        return;
    socket.write(bytes);
    socket.waitForBytesWritten(10000);
    if (waitForAnswer)
        socket.waitForReadyRead(15000);
    socket.abort();
}

QByteArray Frame(const QByteArray& body) {
    QByteArray frame(4, '\0');
    qToBigEndian<quint32>(quint32(body.size()), frame.data());
    return frame + body;
}

// Every door of the running program at once: the catalog it loads, its own command line, the
// command lines of later starts, raw bytes on the hand-over socket and messages on the bus.
TEST_F(HostileInputTest, NoOutsideValueReachesBeyondTheNotebookOrBringsTheNavigatorDown) {
    WriteHostileCatalog();
    const DecoyTree decoy = Decoy();
    const auto before = decoy.Snapshot();
    int cases = 1;

    const QString program = Reliability::LoneNavigatorCopy(Home());
    ASSERT_FALSE(program.isEmpty());
    NavigatorProcess navigator(Home(), program);
    navigator.Start({u"/OpenMRUItem"_s, u"../../../../decoy"_s, u"/ViewDocument"_s,
                     u"line\nbreak.pdf"_s, u"/NewNoteFromFile"_s, m_decoy + u"/notes.txt"_s});
    cases += 3;
    ASSERT_TRUE(navigator.WaitUntilRunning());

    // Later starts: a path a user hands over is acted on by design, so only values that name no
    // file of the decoy go to "NewNoteFromFile".
    for (const QString& value : Hostile(true)) {
        const bool namesAFile = QFileInfo(value).isFile() || QFileInfo(Home(), value).isFile();
        QStringList arguments{u"/OpenMRUItem"_s, value, u"/ViewDocument"_s, value};
        if (!namesAFile)
            arguments << u"/NewNoteFromFile"_s << value;
        EXPECT_EQ(navigator.RunToEnd(arguments), 0) << value.left(80).toStdString();
        cases += int(arguments.size() / 2);
    }

    // The hand-over socket: broken frames, then the hostile values inside good ones.
    const QString socketPath = SharedMemory::SocketPath(SingleInstance::InstanceName());
    ASSERT_TRUE(QFileInfo::exists(socketPath)) << socketPath.toStdString();
    const QList<std::pair<QByteArray, bool>> frames{
        {QByteArray(4, '\0'), true},
        {QByteArray::fromHex("000000"), false},
        {QByteArray::fromHex("ffffffff") + "[]", true},
        {QByteArray::fromHex("7fffffff"), false},
        {QByteArray::fromHex("00000064") + "[\"a\",", false},
        {Frame("not json at all"), true},
        {Frame("{\"program\": \"x\"}"), true},
        {Frame("[1, 2, 3]"), true},
        {Frame("[[\"nested\"], {\"a\": 1}]"), true},
        {Frame("[\"a\", \"\\u0000\"]"), true},
        {Frame("[\"\xff\xfe\"]"), true},
        {Frame("[\"a\"]") + "trailing", true},
        {Frame(""), true},
        {Frame("[]"), true},
        {Frame("null"), true},
    };
    for (const auto& [bytes, answered] : frames)
        SendRaw(socketPath, bytes, answered);
    cases += int(frames.size());
    for (const QString& value : Hostile(false)) {
        QStringList arguments{program, u"/OpenMRUItem"_s, value, u"/ViewDocument"_s, value};
        if (!QFileInfo(value).isFile())
            arguments << u"/NewNoteFromFile"_s << value;
        SendRaw(socketPath, Frame(SharedMemory::EncodeArguments(arguments)), true);
        ++cases;
    }

    // The bus: every message that takes an identifier, a file name, a path or a title.
    CompanionBus bus;
    const QDeadlineTimer busDeadline(15000);
    while (!bus.IsNavigatorRunning() && !busDeadline.hasExpired())
        QThread::msleep(50);
    ASSERT_TRUE(bus.IsNavigatorRunning());
    const QStringList names{u"UpdateMetadata"_s,
                            u"OpenItemByItemID"_s,
                            u"SaveDocumentToNotebook"_s,
                            u"RequestViewerFromFile"_s,
                            u"SendToBlog"_s,
                            u"RequestExportToQm"_s,
                            u"RequestNewNoteWithClipboard"_s,
                            u"EventNotification"_s,
                            u"DocumentOpenNotification"_s,
                            u"NoteOpenNotification"_s};
    for (const QString& name : names) {
        for (const QString& value : Hostile(false)) {
            ASSERT_TRUE(bus.Post(name, {{u"itemid"_s, value},
                                        {u"filename"_s, value},
                                        {u"path"_s, value},
                                        {u"title"_s, value},
                                        {u"type"_s, u"note"_s},
                                        {u"open"_s, u"false"_s},
                                        {u"event"_s, u"WindowOnActivate"_s},
                                        {u"openwindowhandle"_s, value},
                                        {u"QmChoice"_s, value}}));
            // The same values beside an identifier of an item that the catalog holds.
            for (const QString& itemId : {kNoteId, kDocumentId, kLinkedId, kTwinId}) {
                ASSERT_TRUE(bus.Post(name, {{u"itemid"_s, itemId},
                                            {u"filename"_s, value},
                                            {u"path"_s, value},
                                            {u"title"_s, value},
                                            {u"linked"_s, u"false"_s},
                                            {u"type"_s, u"note"_s}}));
            }
            cases += 5;
        }
    }

    // The navigator still answers a start, even while it asks its user about an item whose
    // file is missing; at the end it handles every message that still waits, the last one too.
    const QString answered = u"Still answering"_s;
    ASSERT_TRUE(
        bus.Post(u"UpdateMetadata"_s, {{u"itemid"_s, kDocumentId}, {u"title"_s, answered}}));
    EXPECT_EQ(navigator.RunToEnd({u"/OpenMRUItem"_s, u"../"_s}), 0) << "the navigator hangs";
    EXPECT_EQ(navigator.Process().state(), QProcess::Running) << "the navigator crashed";
    EXPECT_TRUE(navigator.Terminate(60000));
    EXPECT_EQ(navigator.Process().exitStatus(), QProcess::NormalExit);
    const int crashes = navigator.Process().exitStatus() == QProcess::NormalExit ? 0 : 1;
    EXPECT_TRUE(CatalogFileText().contains(u"<title>"_s + answered)) << "messages were lost";
    ++cases;

    const auto after = decoy.Snapshot();
    const QStringList changes = Changes(before, after);
    EXPECT_TRUE(changes.isEmpty()) << changes.join(u'\n').toStdString();
    Reliability::Report(
        u"hostile input: %1 cases through 5 doors of the running navigator "
        u"(catalog, command line, second start, hand-over socket, bus); decoy "
        u"tree of %2 entries %3; %4 crashes"_s.arg(cases)
            .arg(before.size())
            .arg(changes.isEmpty() ? u"unchanged"_s : u"CHANGED (%1)"_s.arg(changes.size()))
            .arg(crashes));
}

// A tree that takes outside drops on one row, as the navigator's does.
class DropTree final : public QTreeWidget, public IDropFeedback {
public:
    bool DragOverFromOutside(const QPoint&) override {
        WNavDS::Instance()->SetDropTargetById(u"root"_s);
        return true;
    }
    void RemoveInsertionMark() override {}
    void EndExternalDrag() override {}
};

// Inside the program: the hostile catalog through the item operations that make, copy and
// delete files, and hostile file names and addresses dropped on the tree.
TEST_F(HostileInputTest, TheCatalogsValuesAndDroppedNamesStayInsideTheNotebook) {
    WriteHostileCatalog();
    // The service over the new file.
    GetDataStoreService()->Shutdown(0);
    service = CreateDataStoreService(host.get());
    ASSERT_NE(service, nullptr);
    const DecoyTree decoy = Decoy();
    const auto before = decoy.Snapshot();
    int cases = 1;

    WNavDS* model = Load();
    for (const QString& id :
         {kNoteId, kDocumentId, kLinkedId, kTwinId, m_decoy, u"../../../../decoy"_s}) {
        model->OpenById(id);
        model->MoveById(id);
        model->SendItemTo(id, u""_s);
        cases += 3;
    }
    model->RestoreAllDeleted();
    model->SelectById(kFolderId);
    model->DeleteSelected();
    model->EmptyDeletedItems();
    cases += 3;

    DropTree tree;
    new CDropTarget(tree.viewport(), &tree);
    tree.resize(200, 200);
    const QPoint at(10, 10);
    const auto drop = [&](const QMimeData& data) {
        const Qt::DropActions actions = Qt::CopyAction;
        QDragEnterEvent enter(at, actions, &data, Qt::LeftButton, Qt::NoModifier);
        QCoreApplication::sendEvent(tree.viewport(), &enter);
        QDropEvent dropped(at, actions, &data, Qt::LeftButton, Qt::NoModifier);
        QCoreApplication::sendEvent(tree.viewport(), &dropped);
        ++cases;
    };
    for (const QString& value : Hostile(false)) {
        QMimeData urls;
        urls.setUrls({QUrl::fromLocalFile(value), QUrl::fromLocalFile(m_decoy + u'/' + value)});
        drop(urls);
        QMimeData raw;
        raw.setData(u"text/uri-list"_s, "file://" + value.toUtf8() + "\r\nfile:///../" +
                                            QUrl::toPercentEncoding(value) + "\r\n");
        drop(raw);
        QMimeData text;
        text.setText(value);
        drop(text);
    }
    // The document dropped from the decoy is linked where it lies: the drop leaves it alone.
    for (const QString& name : {u"victim.pdf"_s, u"folder/deep/picture.jpg"_s}) {
        QMimeData data;
        data.setUrls({QUrl::fromLocalFile(m_decoy + u'/' + name)});
        drop(data);
    }
    model->MoveById(kLinkedId);
    model->EmptyDeletedItems();
    WNavDS::DestroyInstance();
    GetDataStoreService()->Save();

    const QStringList changes = Changes(before, decoy.Snapshot());
    EXPECT_TRUE(changes.isEmpty()) << changes.join(u'\n').toStdString();
    Reliability::Report(
        u"hostile input: %1 cases through item operations over a hostile catalog "
        u"and drops; decoy tree of %2 entries %3; 0 crashes"_s.arg(cases)
            .arg(before.size())
            .arg(changes.isEmpty() ? u"unchanged"_s : u"CHANGED (%1)"_s.arg(changes.size())));
}

} // namespace
