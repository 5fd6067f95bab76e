#include "Reliability.h"
#include "support/AmbrelTest.h"
#include "support/NavigatorProcess.h"

#include "CatalogGenerator.h"
#include "companion/CompanionBus.h"

#include <QDeadlineTimer>
#include <QDir>
#include <QElapsedTimer>
#include <QFile>
#include <QFileInfo>
#include <QLocale>
#include <QSet>
#include <QThread>

#include <pugixml.hpp>

#include <csignal>
#include <cstdio>
#include <map>
#include <optional>
#include <random>

#include <sys/stat.h>
#include <unistd.h>

namespace {

using namespace Qt::StringLiterals;

constexpr int kCatalogItems = 10000;
constexpr int kWaitMs = 30000;

// What the tests compare of an item: its place and its title, and whether it is linked or
// deleted.
struct Item {
    QString kind;
    QString parent;
    QString title;
    bool linked = false;
    bool deleted = false;
    bool operator==(const Item&) const = default;
};
using Catalog = std::map<QString, Item>;

// The catalog file as items, or nothing when it does not parse or holds no items.
std::optional<Catalog> ReadCatalog(const QByteArray& bytes) {
    pugi::xml_document document;
    if (bytes.isEmpty() ||
        !document.load_buffer(bytes.constData(), static_cast<size_t>(bytes.size()),
                              pugi::parse_default | pugi::parse_declaration, pugi::encoding_utf16))
        return std::nullopt;
    const pugi::xml_node archive = document.child("archive");
    Catalog catalog;
    std::vector<std::pair<pugi::xml_node, QString>> pending{
        {archive.child("organization").child("root"), u"root"_s}};
    std::map<QString, QString> parents;
    while (!pending.empty()) {
        const auto [node, id] = pending.back();
        pending.pop_back();
        for (pugi::xml_node child : node.children("child")) {
            const QString childId = QString::fromUtf8(child.attribute("uuidref").value());
            parents[childId] = id;
            pending.emplace_back(child, childId);
        }
    }
    for (pugi::xml_node element : archive.child("items").children()) {
        const pugi::xml_node properties = element.child("properties");
        const QString id = QString::fromUtf8(element.attribute("uuid").value());
        catalog[id] = {QString::fromUtf8(element.name()), parents[id],
                       QString::fromUtf8(properties.child_value("title")),
                       QByteArray(properties.child_value("linked")) == "true",
                       QByteArray(properties.child_value("deleted")) == "true"};
    }
    if (catalog.empty())
        return std::nullopt;
    return catalog;
}

// Tells one version of a file from the next: each save replaces the file with a new one.
struct FileStamp {
    ino_t inode = 0;
    timespec modified{};
    off_t size = -1;
    bool operator==(const FileStamp& other) const {
        return inode == other.inode && modified.tv_sec == other.modified.tv_sec &&
               modified.tv_nsec == other.modified.tv_nsec && size == other.size;
    }
};

FileStamp Stamp(const QString& path) {
    struct stat status {};
    if (::stat(QFile::encodeName(path).constData(), &status) != 0)
        return {};
    return {status.st_ino, status.st_mtim, status.st_size};
}

QByteArray ReadBytes(const QString& path) {
    QFile file(path);
    return file.open(QIODevice::ReadOnly) ? file.readAll() : QByteArray();
}

int LinkedCount(const Catalog& catalog) {
    int count = 0;
    for (const auto& [id, item] : catalog)
        count += item.kind == u"document" && item.linked && !item.deleted;
    return count;
}

// One change sent through the bus, and what it must do to the catalog.
struct Change {
    enum Kind { NewNote, Rename, Move, Link } kind;
    QString itemId; // Rename, Move
    QString value;  // the new title, or the linked file
};

// Whether `after` is `before` changed by exactly `change`; limit: the linked documents' limit.
bool IsChangedBy(const Catalog& before, const Catalog& after, const Change& change, int limit) {
    Catalog expected = before;
    Catalog seen = after;
    switch (change.kind) {
    case Change::Rename:
        expected[change.itemId].title = change.value;
        break;
    case Change::Move:
        // Its file copied into the notebook, the document is no longer linked.
        expected[change.itemId].parent = u"root"_s;
        expected[change.itemId].linked = false;
        break;
    case Change::NewNote:
    case Change::Link: {
        // One new item; a new link takes the linked documents beyond their limit and removes
        // the least recently used ones.
        std::vector<QString> added;
        for (const auto& [id, item] : after) {
            if (!before.contains(id))
                added.push_back(id);
        }
        if (added.size() != 1)
            return false;
        const Item& item = after.at(added[0]);
        if (change.kind == Change::NewNote ? item.kind != u"note"
                                           : item.kind != u"document" || !item.linked)
            return false;
        seen.erase(added[0]);
        if (change.kind == Change::Link) {
            int removed = 0;
            for (const auto& [id, old] : before) {
                if (after.contains(id))
                    continue;
                if (old.kind != u"document" || !old.linked || old.deleted)
                    return false;
                expected.erase(id);
                ++removed;
            }
            if (removed != std::max(0, LinkedCount(before) + 1 - limit))
                return false;
        }
        break;
    }
    }
    return seen == expected;
}

// What differs between two catalogs, for a failure's message.
std::string Differences(const Catalog& before, const Catalog& after) {
    QStringList lines;
    const auto describe = [](const Item& item) {
        return u"%1 under %2 \"%3\"%4%5"_s.arg(item.kind, item.parent, item.title,
                                               item.linked ? u" linked"_s : QString(),
                                               item.deleted ? u" deleted"_s : QString());
    };
    for (const auto& [id, item] : before) {
        const auto there = after.find(id);
        if (there == after.end())
            lines << u"gone: "_s + id + u' ' + describe(item);
        else if (!(there->second == item))
            lines << u"changed: "_s + id + u' ' + describe(item) + u" -> "_s +
                         describe(there->second);
    }
    for (const auto& [id, item] : after) {
        if (!before.contains(id))
            lines << u"new: "_s + id + u' ' + describe(item);
    }
    return lines.mid(0, 10).join(u'\n').toStdString();
}

// The settings file as its keys and values; empty when it is not the eighteen keys.
std::map<QString, QString> ReadSettings(const QByteArray& bytes) {
    const QString text =
        QString::fromUtf16(reinterpret_cast<const char16_t*>(bytes.constData()), bytes.size() / 2);
    std::map<QString, QString> pairs;
    QStringList fields{QString()};
    for (qsizetype at = 0; at < text.size(); ++at) {
        if (text[at] == u'\\' && at + 1 < text.size())
            fields.back() += text[++at];
        else if (text[at] == u'|')
            fields.append(QString());
        else
            fields.back() += text[at];
    }
    if (bytes.size() % 2 != 0 || !fields.back().isEmpty() || fields.size() != 37)
        return {};
    for (qsizetype at = 0; at + 1 < fields.size(); at += 2)
        pairs[fields[at]] = fields[at + 1];
    return pairs.size() == 18 ? pairs : std::map<QString, QString>{};
}

class CrashDuringSaveTest : public AmbrelTest {
protected:
    void SetUp() override {
        AmbrelTest::SetUp();
        m_catalogFolder = AppDataFolder() + u"/Catalog"_s;
        m_catalogPath = m_catalogFolder + u"/catalog.xml"_s;
        m_settingsPath = AppDataFolder() + u"/NavSettings.dat"_s;
    }

    // Waits until the catalog file, replaced after `sent`, is `before` changed by `change`;
    // answers its bytes, and in tookMs how long after `since` the file was replaced with them.
    QByteArray AwaitChange(const Catalog& before, const Change& change, FileStamp sent,
                           const QElapsedTimer& since, qint64* tookMs) {
        const QDeadlineTimer deadline(kWaitMs);
        while (!deadline.hasExpired()) {
            const FileStamp now = Stamp(m_catalogPath);
            if (now == sent) {
                QThread::msleep(2);
                continue;
            }
            *tookMs = since.elapsed();
            sent = now;
            const QByteArray bytes = ReadBytes(m_catalogPath);
            const std::optional<Catalog> catalog = ReadCatalog(bytes);
            if (catalog && IsChangedBy(before, *catalog, change, m_limit))
                return bytes;
        }
        return {};
    }

    // A change of a random kind to a random item of the catalog.
    Change MakeChange(const Catalog& catalog, int serial) {
        std::vector<QString> notes;
        std::vector<QString> linked;
        for (const auto& [id, item] : catalog) {
            if (item.kind == u"note")
                notes.push_back(id);
            else if (item.kind == u"document" && item.linked && !item.deleted &&
                     !m_generated.contains(id))
                linked.push_back(id); // linked by this test: its file is there to be copied
        }
        const auto pick = [this](const std::vector<QString>& ids) {
            return ids[std::uniform_int_distribution<size_t>(0, ids.size() - 1)(m_random)];
        };
        switch (std::uniform_int_distribution<int>(0, 3)(m_random)) {
        case 0:
            return {Change::NewNote, {}, {}};
        case 1:
            if (!linked.empty())
                return {Change::Move, pick(linked), {}};
            [[fallthrough]];
        case 2:
            return {Change::Link,
                    {},
                    WriteFile(u"documents/report %1.pdf"_s.arg(serial), DocumentBytes())};
        default:
            return {Change::Rename, pick(notes), u"Renamed <%1> & \"co\""_s.arg(serial)};
        }
    }

    static bool Send(CompanionBus& bus, const Change& change) {
        switch (change.kind) {
        case Change::NewNote:
            return bus.Post(u"RequestNewNoteWithClipboard"_s, {{u"type"_s, u"note"_s}});
        case Change::Rename:
            return bus.Post(u"UpdateMetadata"_s,
                            {{u"itemid"_s, change.itemId}, {u"title"_s, change.value}});
        case Change::Move:
            return bus.Post(u"SaveDocumentToNotebook"_s, {{u"itemid"_s, change.itemId}});
        case Change::Link:
            return bus.Post(u"RequestViewerFromFile"_s, {{u"filename"_s, change.value}});
        }
        return false;
    }

    // Entries beside the catalog and the settings that no navigator made on purpose.
    QStringList StrayFiles() const {
        QStringList stray;
        for (const QString& name : QDir(AppDataFolder())
                                       .entryList(QDir::AllEntries | QDir::Hidden | QDir::System |
                                                  QDir::NoDotAndDotDot)) {
            if (name != u"NavSettings.dat" && name != u"Catalog")
                stray << name;
        }
        for (const QFileInfo& entry : QDir(m_catalogFolder)
                                          .entryInfoList(QDir::AllEntries | QDir::Hidden |
                                                         QDir::System | QDir::NoDotAndDotDot)) {
            if (entry.fileName() != u"catalog.xml" &&
                !(entry.isDir() && entry.fileName().size() == 36))
                stray << u"Catalog/"_s + entry.fileName();
        }
        return stray;
    }

    // A linked document's file: large enough that copying it into the notebook takes a while.
    static QByteArray DocumentBytes() {
        static const QByteArray bytes = "%PDF-1.4\n" + QByteArray(1 << 20, 'd') + "%%EOF\n";
        return bytes;
    }

    // Files in item folders that are not whole: a note file ends with the document's end and
    // its zero byte, a document copied into the notebook is the linked file.
    QStringList CutOffFiles() const {
        QStringList cut;
        for (const QString& folder :
             QDir(m_catalogFolder).entryList(QDir::Dirs | QDir::NoDotAndDotDot)) {
            const QDir items(m_catalogFolder + u'/' + folder);
            for (const QString& name : items.entryList(QDir::Files | QDir::Hidden | QDir::System)) {
                const QByteArray bytes = ReadBytes(items.filePath(name));
                if (name == u"note.htm" ? !bytes.endsWith(QByteArray("</HTML>\0", 8))
                                        : bytes != DocumentBytes())
                    cut << items.filePath(name);
            }
        }
        return cut;
    }

    QString m_catalogFolder;
    QString m_catalogPath;
    QString m_settingsPath;
    std::mt19937 m_random;
    QSet<QString> m_generated;
    int m_limit = 100;
};

// The navigator is killed at random moments while it takes in changes and writes them: each
// time the catalog is the one before the last change or the one after it, never a mix, nothing
// is left behind, and the next start runs on it.
TEST_F(CrashDuringSaveTest, AKillAtAnyMomentLeavesTheCatalogBeforeOrAfterTheLastChange) {
    const unsigned seed = std::random_device()();
    std::printf("CrashDuringSaveTest seed %u\n", seed);
    m_random.seed(seed);
    ASSERT_TRUE(QDir().mkpath(m_catalogFolder));
    Bench::WriteCatalog(m_catalogPath, kCatalogItems, seed);
    std::optional<Catalog> state = ReadCatalog(ReadBytes(m_catalogPath));
    ASSERT_TRUE(state);
    for (const auto& [id, item] : *state)
        m_generated.insert(id);
    // The linked documents fill their limit, so that a new link removes the oldest one.
    m_limit = LinkedCount(*state);
    const QString limitText = u"maxlinkeddocuments|%1|"_s.arg(m_limit);
    WriteFile(u"data/Brindle/Quillmark Ambrel/NavSettings.dat"_s,
              QByteArray(reinterpret_cast<const char*>(limitText.utf16()), limitText.size() * 2));
    const QString program = Reliability::LoneNavigatorCopy(Home());
    ASSERT_FALSE(program.isEmpty());

    CompanionBus bus;
    ASSERT_TRUE(bus.IsConnected());
    const int kills = Reliability::Rounds(8, 200);
    int insideSave = 0;
    int beforeStates = 0;
    int afterStates = 0;
    int serial = 0;
    qint64 latencyMs = 60;
    QSet<QByteArray> settingsSeen;
    for (int round = 0; round <= kills; ++round) {
        SCOPED_TRACE(u"round %1, seed %2"_s.arg(round).arg(seed).toStdString());
        NavigatorProcess navigator(Home(), program);
        navigator.Start();
        ASSERT_TRUE(navigator.WaitUntilRunning(kWaitMs));
        const QDeadlineTimer named(kWaitMs);
        while (!bus.IsNavigatorRunning() && !named.hasExpired())
            QThread::msleep(20);
        ASSERT_TRUE(bus.IsNavigatorRunning());

        // A few changes, each seen in the file: the started navigator has the whole catalog.
        QByteArray bytes;
        for (int change = 0; change < 3; ++change) {
            const Change next = MakeChange(*state, ++serial);
            const FileStamp sent = Stamp(m_catalogPath);
            QElapsedTimer took;
            took.start();
            ASSERT_TRUE(Send(bus, next));
            bytes = AwaitChange(*state, next, sent, took, &latencyMs);
            const std::optional<Catalog> seen = ReadCatalog(ReadBytes(m_catalogPath));
            ASSERT_FALSE(bytes.isEmpty())
                << "change " << next.kind << " of " << next.itemId.toStdString() << " "
                << next.value.toStdString() << " never reached the file; navigator "
                << (navigator.Process().state() == QProcess::Running ? "running" : "gone")
                << "; the file differs by:\n"
                << (seen ? Differences(*state, *seen) : std::string("(no catalog)"));
            state = ReadCatalog(bytes);
            settingsSeen.insert(ReadBytes(m_settingsPath));
        }
        if (round == kills) {
            // The last start only shows that the notebook survived every kill.
            ASSERT_TRUE(navigator.Terminate());
            break;
        }

        // One more change, and a kill somewhere between its arrival and its save's end.
        const Change last = MakeChange(*state, ++serial);
        bytes = ReadBytes(m_catalogPath);
        const QByteArray settingsBefore = ReadBytes(m_settingsPath);
        settingsSeen.insert(settingsBefore);
        ASSERT_TRUE(Send(bus, last));
        const int delayMs = std::uniform_int_distribution<int>(
            0, static_cast<int>(std::max<qint64>(10, latencyMs * 3 / 2)))(m_random);
        QThread::msleep(static_cast<unsigned long>(delayMs));
        const qint64 pid = navigator.Process().processId();
        ::kill(static_cast<pid_t>(pid), SIGSTOP);
        insideSave += Reliability::HoldsOpenFileIn(pid, m_catalogFolder, m_catalogPath);
        ::kill(static_cast<pid_t>(pid), SIGKILL);
        ASSERT_TRUE(navigator.Process().waitForFinished(kWaitMs));

        const QByteArray afterKill = ReadBytes(m_catalogPath);
        const std::optional<Catalog> killed = ReadCatalog(afterKill);
        ASSERT_TRUE(killed) << "the catalog does not parse after a kill " << delayMs << " ms in";
        if (afterKill == bytes) {
            ++beforeStates;
        } else {
            ASSERT_TRUE(IsChangedBy(*state, *killed, last, m_limit))
                << "after a kill " << delayMs << " ms into change " << last.kind
                << " the catalog is neither the one before nor the one after it";
            ++afterStates;
            state = killed;
        }

        // The settings are one of the states written before, or that with the selection
        // of the last change.
        const QByteArray settingsBytes = ReadBytes(m_settingsPath);
        const std::map<QString, QString> settings = ReadSettings(settingsBytes);
        ASSERT_FALSE(settings.empty()) << "the settings file does not parse after a kill";
        if (!settingsSeen.contains(settingsBytes)) {
            std::map<QString, QString> selectionless = settings;
            std::map<QString, QString> previous = ReadSettings(settingsBefore);
            selectionless.erase(u"lastselecteditemid"_s);
            previous.erase(u"lastselecteditemid"_s);
            EXPECT_EQ(selectionless, previous) << "the settings file is a state never written";
            EXPECT_TRUE(state->contains(settings.at(u"lastselecteditemid"_s)));
            settingsSeen.insert(settingsBytes);
        }
        EXPECT_EQ(CutOffFiles(), QStringList());
        EXPECT_EQ(StrayFiles(), QStringList());
    }
    // The last start's catalog, written again on the way out, still holds every item.
    const std::optional<Catalog> survived = ReadCatalog(ReadBytes(m_catalogPath));
    ASSERT_TRUE(survived);
    EXPECT_EQ(*survived, *state);
    EXPECT_EQ(StrayFiles(), QStringList());

    Reliability::Report(u"crash during save: %1 kills survived (catalog %2 items; %3 kills "
                        "inside a catalog save; before-state %4, after-state %5)"_s.arg(kills)
                            .arg(QLocale(QLocale::English).toString(kCatalogItems))
                            .arg(insideSave)
                            .arg(beforeStates)
                            .arg(afterStates));
}

} // namespace
