#include "Reliability.h"
#include "companion/CompanionBus.h"
#include "support/AmbrelTest.h"
#include "support/NavigatorProcess.h"

#include "CatalogGenerator.h"

#include <QCoreApplication>
#include <QDeadlineTimer>
#include <QDir>
#include <QElapsedTimer>
#include <QFile>
#include <QLocale>
#include <QRegularExpression>
#include <QThread>

#include <csignal>
#include <memory>

namespace {

using namespace Qt::StringLiterals;

class LoadTest : public AmbrelTest {
protected:
    bool WaitFor(const std::function<bool()>& condition, int timeoutMs) {
        const QDeadlineTimer deadline(timeoutMs);
        while (!condition()) {
            if (deadline.hasExpired())
                return false;
            // The processes' states change through events of this thread.
            QCoreApplication::processEvents(QEventLoop::AllEvents, 50);
            QThread::msleep(20);
        }
        return true;
    }
    QString ErrorOutput() const {
        QFile errors(Home() + u"/navigator-errors.txt"_s);
        return errors.open(QIODevice::ReadOnly) ? QString::fromUtf8(errors.readAll()) : QString();
    }
};

// Ten starts in the same moment: one becomes the navigator, the nine others hand their command
// lines over, and every one of the ten documents is linked exactly once.
TEST_F(LoadTest, SimultaneousStartsGiveOneNavigatorAndEveryActionOnce) {
    const QString program = Reliability::LoneNavigatorCopy(Home());
    ASSERT_FALSE(program.isEmpty());
    const NavigatorProcess environment(Home(), program);
    constexpr int kStarts = 10;
    QStringList documents;
    std::vector<std::unique_ptr<QProcess>> starts;
    for (int i = 0; i < kStarts; ++i)
        documents.append(WriteFile(u"docs/report %1.pdf"_s.arg(i), "%PDF-1.4\n"));
    for (int i = 0; i < kStarts; ++i) {
        auto start = std::make_unique<QProcess>();
        start->setProcessEnvironment(environment.Environment());
        start->setStandardOutputFile(QProcess::nullDevice());
        start->setStandardErrorFile(Home() + u"/start-%1.txt"_s.arg(i));
        start->start(program, {u"/ViewDocument"_s, documents[i]});
        starts.push_back(std::move(start));
    }

    // The nine that hand over end by themselves; the navigator stays.
    int handedOver = 0;
    QProcess* navigator = nullptr;
    ASSERT_TRUE(WaitFor(
        [&] {
            int ended = 0;
            for (const auto& start : starts)
                ended += start->state() == QProcess::NotRunning ? 1 : 0;
            return ended >= kStarts - 1;
        },
        90000));
    for (const auto& start : starts) {
        if (start->state() != QProcess::NotRunning) {
            EXPECT_EQ(navigator, nullptr) << "a second navigator runs";
            navigator = start.get();
        } else if (start->exitStatus() == QProcess::NormalExit && start->exitCode() == 0) {
            ++handedOver;
        }
    }
    ASSERT_NE(navigator, nullptr);
    EXPECT_EQ(handedOver, kStarts - 1);

    const auto linkedOnce = [&] {
        const QString catalog = CatalogFileText();
        for (const QString& document : documents)
            if (catalog.count(u"<path>"_s + document + u"</path>"_s) != 1)
                return false;
        return true;
    };
    EXPECT_TRUE(WaitFor(linkedOnce, 30000)) << CatalogFileText().toStdString();
    int linked = 0;
    for (const QString& document : documents)
        linked += CatalogFileText().count(u"<path>"_s + document + u"</path>"_s);
    ::kill(static_cast<pid_t>(navigator->processId()), SIGTERM);
    EXPECT_TRUE(navigator->waitForFinished(20000));

    Reliability::Report(u"load: %1 simultaneous starts -> %2 navigator + %3 hand-overs, %4 of %1 "
                        u"actions done once"_s.arg(kStarts)
                            .arg(navigator ? 1 : 0)
                            .arg(handedOver)
                            .arg(linked));
}

// A burst of messages is handled whole and in order, and the window keeps answering meanwhile:
// the idle passes that handle it are measured through the navigator's own diagnostic output.
TEST_F(LoadTest, ABurstOfMessagesIsHandledInOrderWhileTheWindowAnswers) {
    const int messages = Reliability::Rounds(200, 1000);
    ASSERT_TRUE(QDir().mkpath(AppDataFolder() + u"/Catalog"_s));
    const Bench::GeneratedCatalog catalog =
        Bench::WriteCatalog(AppDataFolder() + u"/Catalog/catalog.xml"_s, 200, 7);
    ASSERT_FALSE(catalog.notes.empty());
    const QString note = catalog.notes.front();

    const QString program = Reliability::LoneNavigatorCopy(Home());
    ASSERT_FALSE(program.isEmpty());
    NavigatorProcess navigator(Home(), program);
    QProcessEnvironment environment = navigator.Environment();
    environment.insert(u"QT_LOGGING_RULES"_s, u"ambrel.idle.debug=true"_s);
    navigator.Process().setProcessEnvironment(environment);
    navigator.Start();
    ASSERT_TRUE(navigator.WaitUntilRunning());
    CompanionBus bus;
    ASSERT_TRUE(WaitFor([&] { return bus.IsNavigatorRunning(); }, 15000));
    const qsizetype quietOutput = ErrorOutput().size();

    // Every tenth message makes a note, the others rename two notes in turn: the last title
    // of each must win, and every note asked for must be there.
    const QString other = catalog.notes.back();
    const auto notes = [this] { return CatalogFileText().count(u"<note uuid="_s); };
    const qsizetype notesBefore = notes();
    // The navigator is held still while the burst is sent, as a busy one would be, so that the
    // whole burst waits at once.
    const auto pid = static_cast<pid_t>(navigator.Process().processId());
    ::kill(pid, SIGSTOP);
    QElapsedTimer clock;
    clock.start();
    QString lastTitle[2];
    int made = 0;
    for (int i = 0; i < messages; ++i) {
        if (i % 10 == 9) {
            ++made;
            ASSERT_TRUE(bus.Post(u"RequestNewNoteWithClipboard"_s, {{u"type"_s, u"note"_s}}));
        } else {
            lastTitle[i % 2] = u"Burst %1"_s.arg(i, 5, 10, QChar(u'0'));
            ASSERT_TRUE(bus.Post(u"UpdateMetadata"_s, {{u"itemid"_s, i % 2 ? other : note},
                                                       {u"title"_s, lastTitle[i % 2]}}));
        }
    }
    ::kill(pid, SIGCONT);
    const auto allHandled = [&] {
        const QString text = CatalogFileText();
        return text.contains(u"<title>"_s + lastTitle[0] + u"</title>"_s) &&
               text.contains(u"<title>"_s + lastTitle[1] + u"</title>"_s) &&
               notes() == notesBefore + made;
    };
    const bool handled = WaitFor(allHandled, 180000);
    const double seconds = double(clock.elapsed()) / 1000;
    EXPECT_TRUE(handled) << "notes made: " << notes() - notesBefore << " of " << made;
    EXPECT_EQ(CatalogFileText().count(u"<title>Burst "_s), 2) << "an earlier title won";
    ASSERT_TRUE(navigator.Terminate());

    double longest = 0;
    int passes = 0;
    static const QRegularExpression pass(u"idle pass \\d+: ([0-9.]+) ms"_s);
    for (auto match = pass.globalMatch(ErrorOutput().mid(quietOutput)); match.hasNext(); ++passes)
        longest = std::max(longest, match.next().captured(1).toDouble());
    EXPECT_GT(passes, 0) << "the idle pass diagnostic wrote nothing";

    const QLocale english(QLocale::English);
    ASSERT_TRUE(handled);
    Reliability::Report(u"load: %1 messages handled in order in %2 s over %3 idle passes, longest "
                        u"idle pass %4 ms (aim 100 ms)"_s.arg(english.toString(messages))
                            .arg(seconds, 0, 'f', 1)
                            .arg(passes)
                            .arg(longest, 0, 'f', 0));
}

} // namespace
