#include "Reliability.h"
#include "support/AmbrelTest.h"
#include "support/NavigatorProcess.h"

#include <QDBusConnection>
#include <QDBusMessage>
#include <QDBusPendingCall>
#include <QDBusReply>
#include <QDeadlineTimer>
#include <QDir>
#include <QElapsedTimer>
#include <QFile>
#include <QFileInfo>
#include <QThread>

#include <csignal>
#include <cstdio>
#include <random>

#include <unistd.h>

namespace {

using namespace Qt::StringLiterals;

constexpr int kWaitMs = 30000;

QByteArray ReadBytes(const QString& path) {
    QFile file(path);
    return file.open(QIODevice::ReadOnly) ? file.readAll() : QByteArray();
}

class NoteToolCrashTest : public AmbrelTest {
protected:
    static QDBusMessage Call(const QString& name, const QString& method,
                             const QVariantList& arguments = {}) {
        QDBusMessage call = QDBusMessage::createMethodCall(
            name, u"/NoteTool"_s, u"com.brindle.QuillmarkAmbrel.NoteTool"_s, method);
        call.setArguments(arguments);
        return call;
    }

    // Starts the note tool on the note; answers its bus name once it has the note open.
    static QString Open(NavigatorProcess& noteTool, const QString& note) {
        noteTool.Start({note});
        const QDeadlineTimer deadline(kWaitMs);
        QString name;
        while ((name = Reliability::NoteToolOnBus()).isEmpty() && !deadline.hasExpired() &&
               noteTool.Process().state() != QProcess::NotRunning)
            QThread::msleep(20);
        return name;
    }
};

// The note tool is killed while it saves a long note: the note file is the old one or the new
// one, whole, nothing else is left in its folder, and the next start opens it.
TEST_F(NoteToolCrashTest, AKillWhileSavingLeavesTheOldNoteOrTheNewOne) {
    const unsigned seed = std::random_device()();
    std::printf("NoteToolCrashTest seed %u\n", seed);
    std::mt19937 random(seed);
    QByteArray body;
    for (int line = 0; line < 3000; ++line)
        body +=
            "<P>Line " + QByteArray::number(line) + " of a long note, with <B>bold</B> words.</P>";
    const QString note =
        WriteFile(u"notebook/item/note.htm"_s,
                  "<!DOCTYPE HTML PUBLIC \"-//W3C//DTD HTML 4.0 Transitional//EN\"><HTML><HEAD>"
                  "<TITLE>Long</TITLE></HEAD><BODY><DIV>" +
                      body + QByteArray("</DIV></BODY></HTML>\0", 21));
    const QString folder = QFileInfo(note).absolutePath();
    const QString program =
        QFileInfo(QStringLiteral(AMBREL_NAVIGATOR_PATH)).absolutePath() + u"/AmbrelNoteTool"_s;

    const int kills = Reliability::Rounds(6, 50);
    int insideSave = 0;
    int oldNotes = 0;
    int newNotes = 0;
    for (int round = 0; round <= kills; ++round) {
        SCOPED_TRACE(u"round %1, seed %2"_s.arg(round).arg(seed).toStdString());
        NavigatorProcess noteTool(Home(), program);
        const QString name = Open(noteTool, note);
        ASSERT_FALSE(name.isEmpty()) << "the note tool did not open the note";

        // A save seen to its end shows the note opened whole and writable, and how long one
        // takes.
        QDBusConnection::sessionBus().call(Call(name, u"SetTitle"_s, {u"Saved %1"_s.arg(round)}));
        QElapsedTimer took;
        took.start();
        const QDBusReply<bool> saved =
            QDBusConnection::sessionBus().call(Call(name, u"Save"_s), QDBus::Block, kWaitMs);
        const qint64 saveMs = took.elapsed();
        ASSERT_TRUE(saved.isValid() && saved.value()) << "the note could not be saved";
        if (round == kills) {
            QDBusConnection::sessionBus().call(Call(name, u"Close"_s));
            EXPECT_TRUE(noteTool.Process().waitForFinished(kWaitMs));
            break;
        }

        const QByteArray before = ReadBytes(note);
        const QString title = u"Killed %1"_s.arg(round);
        QDBusConnection::sessionBus().call(Call(name, u"SetTitle"_s, {title}));
        QDBusConnection::sessionBus().asyncCall(Call(name, u"Save"_s));
        const int delayMs =
            std::uniform_int_distribution<int>(0, static_cast<int>(saveMs * 3 / 2))(random);
        QThread::msleep(static_cast<unsigned long>(delayMs));
        const qint64 pid = noteTool.Process().processId();
        ::kill(static_cast<pid_t>(pid), SIGSTOP);
        insideSave += Reliability::HoldsOpenFileIn(pid, QFileInfo(note).absolutePath(), note);
        ::kill(static_cast<pid_t>(pid), SIGKILL);
        ASSERT_TRUE(noteTool.Process().waitForFinished(kWaitMs));

        const QByteArray after = ReadBytes(note);
        if (after == before) {
            ++oldNotes;
        } else {
            ++newNotes;
            EXPECT_TRUE(after.endsWith(QByteArray("</HTML>\0", 8)))
                << "the note is cut off after a kill " << delayMs << " ms into its save";
            EXPECT_TRUE(
                after.contains("<TITLE>Killed%20" + QByteArray::number(round) + "</TITLE>"));
            EXPECT_TRUE(after.contains("Line 2999 of a long note"));
        }
        EXPECT_EQ(QDir(folder).entryList(QDir::AllEntries | QDir::Hidden | QDir::System |
                                         QDir::NoDotAndDotDot),
                  QStringList{u"note.htm"_s});
    }

    Reliability::Report(u"note tool crash: %1 kills while saving survived (note of %2 KB; %3 "
                        "kills inside the write; old note %4, new note %5)"_s.arg(kills)
                            .arg(ReadBytes(note).size() / 1024)
                            .arg(insideSave)
                            .arg(oldNotes)
                            .arg(newNotes));
}

} // namespace
