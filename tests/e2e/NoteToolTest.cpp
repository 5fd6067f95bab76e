#include "support/AmbrelTest.h"
#include "support/NavigatorProcess.h"

#include <QDBusConnection>
#include <QDBusConnectionInterface>
#include <QDBusMessage>
#include <QDBusReply>
#include <QDeadlineTimer>
#include <QDir>
#include <QFile>
#include <QStringDecoder>
#include <QThread>

#include <csignal>
#include <functional>

namespace {

using namespace Qt::StringLiterals;

const QString kNoteToolPrefix = u"com.brindle.QuillmarkAmbrel.NoteTool."_s;

class NoteToolTest : public AmbrelTest {
protected:
    // A note tool that a failed test left behind would hold the test's output open.
    void TearDown() override {
        if (m_noteToolPid != 0 && ::kill(static_cast<pid_t>(m_noteToolPid), 0) == 0)
            ::kill(static_cast<pid_t>(m_noteToolPid), SIGKILL);
        AmbrelTest::TearDown();
    }

    static bool WaitFor(const std::function<bool()>& done, int timeoutMs = 15000) {
        const QDeadlineTimer deadline(timeoutMs);
        while (!done() && !deadline.hasExpired())
            QThread::msleep(20);
        return done();
    }

    static QString NoteToolName() {
        const QStringList names =
            QDBusConnection::sessionBus().interface()->registeredServiceNames().value();
        for (const QString& name : names) {
            if (name.startsWith(kNoteToolPrefix))
                return name;
        }
        return {};
    }

    static QDBusMessage CallNoteTool(const QString& name, const QString& method,
                                     const QVariantList& arguments = {}) {
        QDBusMessage call = QDBusMessage::createMethodCall(
            name, u"/NoteTool"_s, u"com.brindle.QuillmarkAmbrel.NoteTool"_s, method);
        call.setArguments(arguments);
        return QDBusConnection::sessionBus().call(call);
    }

    // Starts the navigator and has it make and open a new note; answers the note tool's name.
    QString OpenNewNote(NavigatorProcess& navigator) {
        navigator.Start();
        EXPECT_TRUE(navigator.WaitUntilRunning());
        const QDBusMessage newNote = QDBusMessage::createMethodCall(
            u"com.brindle.QuillmarkAmbrel.AmbrelService"_s, u"/AmbrelService"_s,
            u"com.brindle.QuillmarkAmbrel.Navigator"_s, u"NewNote"_s);
        // The navigator may hold its lock before it owns its bus name.
        const QDeadlineTimer deadline(15000);
        while (QDBusConnection::sessionBus().call(newNote).type() != QDBusMessage::ReplyMessage &&
               !deadline.hasExpired())
            QThread::msleep(50);
        QString name;
        EXPECT_TRUE(WaitFor([&] { return !(name = NoteToolName()).isEmpty(); }));
        if (!name.isEmpty())
            m_noteToolPid = QDBusConnection::sessionBus().interface()->servicePid(name).value();
        return name;
    }

    uint m_noteToolPid = 0;
};

TEST_F(NoteToolTest, ANoteOpenedByTheNavigatorIsRenamedAndClosedInTheNoteTool) {
    NavigatorProcess navigator(Home());
    const QString noteTool = OpenNewNote(navigator);
    ASSERT_FALSE(noteTool.isEmpty());
    EXPECT_TRUE(WaitFor([&] { return CatalogFileText().contains(u"<open>true</open>"_s); }));

    EXPECT_EQ(CallNoteTool(noteTool, u"SetTitle"_s, {u"Shopping list"_s}).type(),
              QDBusMessage::ReplyMessage);
    EXPECT_EQ(CallNoteTool(noteTool, u"Close"_s).type(), QDBusMessage::ReplyMessage);
    EXPECT_TRUE(WaitFor([] { return NoteToolName().isEmpty(); }));
    EXPECT_TRUE(WaitFor([&] {
        const QString catalog = CatalogFileText();
        return catalog.contains(u"<title>Shopping list</title>"_s) &&
               catalog.contains(u"<open>false</open>"_s);
    })) << CatalogFileText().toStdString();

    const QString catalogFolder = Home() + u"/data/Brindle/Quillmark Ambrel/Catalog"_s;
    const QStringList items = QDir(catalogFolder).entryList(QDir::Dirs | QDir::NoDotAndDotDot);
    ASSERT_EQ(items.size(), 1);
    QFile note(catalogFolder + u'/' + items[0] + u"/note.htm"_s);
    ASSERT_TRUE(note.open(QIODevice::ReadOnly));
    EXPECT_TRUE(note.readAll().contains("<TITLE>Shopping%20list</TITLE>"));
    ASSERT_TRUE(navigator.Terminate());
}

TEST_F(NoteToolTest, TheNavigatorClosesTheNoteToolWhenItEnds) {
    NavigatorProcess navigator(Home());
    const QString noteTool = OpenNewNote(navigator);
    ASSERT_FALSE(noteTool.isEmpty());
    // Once the saved title is in the catalog, the window report sent before it was taken too.
    CallNoteTool(noteTool, u"SetTitle"_s, {u"Draft"_s});
    const QDBusReply<bool> saved = CallNoteTool(noteTool, u"Save"_s);
    ASSERT_TRUE(saved.isValid() && saved.value());
    ASSERT_TRUE(WaitFor([&] { return CatalogFileText().contains(u"<title>Draft</title>"_s); }));

    ASSERT_TRUE(navigator.Terminate());
    EXPECT_TRUE(WaitFor([] { return NoteToolName().isEmpty(); }));
}

} // namespace
