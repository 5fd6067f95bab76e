#include "../navigator/NavigatorModelFixture.h"

#include "app/CNavigatorApp.h"
#include "libs/toolwell/CMessageBroker.h"
#include "messaging/CNavInstanceMgr.h"
#include "messaging/INoteToolService.h"
#include "messaging/IViewerService.h"
#include "support/FakeNavigatorBroker.h"

#include <QDBusConnection>
#include <QDBusConnectionInterface>
#include <QDBusMessage>
#include <QDBusMetaType>
#include <QDialog>
#include <QTimer>

#include <functional>

namespace {

const QString kService = u"com.brindle.QuillmarkAmbrel.AmbrelService"_s;
const QString kPath = u"/AmbrelService"_s;
const QString kBroker = u"com.brindle.QuillmarkAmbrel.Broker"_s;

// Another program on the session bus: posts messages and hears the broker's notifications.
class Peer final : public QObject {
    Q_OBJECT
public:
    explicit Peer(const QString& name)
        : m_name(name), bus(QDBusConnection::connectToBus(QDBusConnection::SessionBus, name)) {
        bus.connect(kService, kPath, kBroker, u"Notify"_s, this,
                    SLOT(OnNotify(QString, QMap<QString, QString>)));
    }
    ~Peer() override { Leave(); }

    // Waits for the answer while the broker, in this same thread, handles the call.
    QDBusMessage Post(const QString& name, const Props& properties) {
        QDBusMessage call = QDBusMessage::createMethodCall(kService, kPath, kBroker, u"Post"_s);
        call << name << QVariant::fromValue(properties);
        return bus.call(call, QDBus::BlockWithGui);
    }
    // The connection closes once nothing holds it any more.
    void Leave() {
        bus = QDBusConnection(QString());
        QDBusConnection::disconnectFromBus(m_name);
    }

    QList<std::pair<QString, Props>> heard;

public Q_SLOTS:
    void OnNotify(const QString& name, const QMap<QString, QString>& properties) {
        heard.append({name, properties});
    }

private:
    QString m_name;

public:
    QDBusConnection bus;
};

class MessageDispatchTest : public NavigatorModelFixture {
protected:
    void SetUp() override {
        NavigatorModelFixture::SetUp();
        qDBusRegisterMetaType<QMap<QString, QString>>();
        pdf = WriteFile(u"files/report.pdf"_s, "%PDF-1.4");
        note = Add(u"note"_s);
        document = Linked(pdf, 1000);
        folder = Folder();
        Load();
        broker.reset(CMessageBroker::Connect());
        ASSERT_TRUE(broker);
        ASSERT_EQ(broker->RegisterService(u"AmbrelService"_s, &manager), S_OK);
        // Listens once the name has its owner.
        peer = std::make_unique<Peer>(u"peer"_s);
    }
    void TearDown() override {
        peer.reset();
        broker.reset();
        NavigatorModelFixture::TearDown();
    }

    // Posts from the peer and runs the queue as the idle pass does.
    void Deliver(const QString& name, const Props& properties) {
        peer->Post(name, properties);
        manager.ProcessQueue();
    }
    static int WindowCount(auto* service) {
        int count = 0;
        service->GetWindowCount(&count);
        return count;
    }

    QString pdf, note, document, folder;
    CNavigatorApp application{{u"ambrel-navigator"_s}};
    CNavInstanceMgr manager{&application};
    ReleasePtr<IMessageBroker> broker;
    std::unique_ptr<Peer> peer;
};

TEST_F(MessageDispatchTest, EachMessageActsOnlyWithWellFormedKeys) {
    WNavDS* model = WNavDS::Instance();
    struct Row {
        const char* what;
        QString name;
        std::function<Props()> properties;
        std::function<bool()> acted;
    };
    const QString other = Add(u"note"_s);
    const auto selected = [model] {
        return model->GetSelected() ? model->GetSelected()->GetItemId() : QString();
    };
    const auto linkedTo = [this](const QString& path) {
        for (const auto& item : WNavDS::Instance()->GetItems())
            if (item->GetKind() == ItemKindDocument &&
                CatalogValue(item->GetItemId(), u"path"_s) == path)
                return true;
        return false;
    };
    const QString second = WriteFile(u"files/second report.pdf"_s, "%PDF-1.4");
    const Row rows[] = {
        {"activation selects", u"EventNotification"_s,
         [&] {
             return Props{{u"itemid"_s, note}, {u"event"_s, u"WindowOnActivate"_s}};
         },
         [&] { return selected() == note; }},
        {"another event does not", u"EventNotification"_s,
         [&] {
             return Props{{u"itemid"_s, folder}, {u"event"_s, u"WindowOnClose"_s}};
         },
         [&] { return selected() != folder; }},
        {"a name in other letter case does nothing", u"eventNotification"_s,
         [&] {
             return Props{{u"itemid"_s, folder}, {u"event"_s, u"WindowOnActivate"_s}};
         },
         [&] { return selected() != folder; }},
        {"an identifier that climbs out does nothing", u"EventNotification"_s,
         [&] {
             return Props{{u"itemid"_s, u"../"_s + folder}, {u"event"_s, u"WindowOnActivate"_s}};
         },
         [&] { return selected() != folder; }},
        {"a note from outside takes only a note's pairs", u"RequestNewNoteWithClipboard"_s,
         [] {
             return Props{
                 {u"type"_s, u"Note"_s}, {u"title"_s, u"Clip"_s}, {u"deleted"_s, u"true"_s}};
         },
         [&] {
             const QString made = selected();
             return made != note && made != folder && CatalogValue(made, u"type"_s) == u"note"_s &&
                    CatalogValue(made, u"deleted"_s).isNull();
         }},
        {"a folder is not made from outside", u"RequestNewNoteWithClipboard"_s,
         [] {
             return Props{{u"type"_s, u"folder"_s}, {u"title"_s, u"Nope"_s}};
         },
         [&] { return CatalogValue(selected(), u"type"_s) == u"folder"_s; }},
        {"a file by its whole path is linked", u"RequestViewerFromFile"_s,
         [&] {
             return Props{{u"filename"_s, second}};
         },
         [&] { return linkedTo(second); }},
        {"a relative path is not", u"RequestViewerFromFile"_s,
         [] {
             return Props{{u"filename"_s, u"files/other.pdf"_s}};
         },
         [&] {
             return linkedTo(u"files/other.pdf"_s) || linkedTo(Home() + u"/files/other.pdf"_s);
         }},
        {"without a file an empty viewer starts, even with an itemid", u"RequestViewerFromFile"_s,
         [&] {
             return Props{{u"itemid"_s, other}};
         },
         [&] {
             return !launcher.starts.isEmpty() &&
                    launcher.starts.last().program.endsWith(u"/AmbrelViewer"_s) &&
                    launcher.starts.last().arguments.size() == 1;
         }},
    };
    const QList<bool> expected{true, false, false, false, true, false, true, false, true};
    int index = 0;
    for (const Row& row : rows) {
        if (index == 1)
            model->SelectById(folder);
        Deliver(row.name, row.properties());
        EXPECT_EQ(row.acted(), expected[index]) << row.what;
        ++index;
    }
}

TEST_F(MessageDispatchTest, MetadataChangesOnlyWhatTheOtherProgramsOwn) {
    Deliver(u"NoteOpenNotification"_s, {{u"itemid"_s, note}, {u"openwindowhandle"_s, u"41"_s}});
    Deliver(u"DocumentOpenNotification"_s,
            {{u"itemid"_s, document}, {u"openwindowhandle"_s, u"42"_s}});
    INoteToolService* noteTool = WNavDS::Instance()->GetNoteToolService();
    IViewerService* viewer = WNavDS::Instance()->GetViewerService();
    ASSERT_EQ(WindowCount(noteTool), 1);
    ASSERT_EQ(WindowCount(viewer), 1);

    Deliver(u"UpdateMetadata"_s, {{u"itemid"_s, note},
                                  {u"title"_s, u"Renamed"_s},
                                  {u"open"_s, u"FALSE"_s},
                                  {u"linked"_s, u"true"_s},
                                  {u"deleted"_s, u"true"_s},
                                  {u"path"_s, u"/etc/passwd"_s}});
    EXPECT_EQ(CatalogValue(note, u"title"_s), u"Renamed"_s);
    EXPECT_TRUE(CatalogValue(note, u"linked"_s).isNull());
    EXPECT_TRUE(CatalogValue(note, u"deleted"_s).isNull());
    EXPECT_TRUE(CatalogValue(note, u"path"_s).isNull());
    EXPECT_EQ(WindowCount(noteTool), 0) << "a closed note forgets its window";
    EXPECT_EQ(WindowCount(viewer), 1) << "only the service of the item's kind";

    Deliver(u"UpdateMetadata"_s, {{u"itemid"_s, folder}, {u"title"_s, u"Taken"_s}});
    EXPECT_NE(CatalogValue(folder, u"title"_s), u"Taken"_s) << "folders take nothing from outside";

    Deliver(u"SaveDocumentToNotebook"_s, {{u"itemid"_s, note}});
    Deliver(u"SaveDocumentToNotebook"_s, {{u"itemid"_s, document}});
    EXPECT_EQ(CatalogValue(document, u"linked"_s), u"false"_s);
}

TEST_F(MessageDispatchTest, OversizedSetsAreRefusedAndNothingWaits) {
    Props pairs;
    for (int i = 0; i < 5000; ++i)
        pairs.insert(u"key%1"_s.arg(i), u"value"_s);
    pairs.insert(u"itemid"_s, note);
    EXPECT_EQ(peer->Post(u"UpdateMetadata"_s, pairs).type(), QDBusMessage::ErrorMessage);
    EXPECT_EQ(
        peer->Post(u"UpdateMetadata"_s, {{u"itemid"_s, note}, {u"title"_s, QString(600000, u'x')}})
            .type(),
        QDBusMessage::ErrorMessage);
    EXPECT_EQ(manager.QueueLength(), 0);
}

TEST_F(MessageDispatchTest, MessagesDuringAModalWaitForTheIdlePassInArrivalOrder) {
    QDialog dialog;
    QTimer::singleShot(0, &dialog, [&] {
        peer->Post(u"UpdateMetadata"_s, {{u"itemid"_s, note}, {u"title"_s, u"First"_s}});
        peer->Post(u"UpdateMetadata"_s, {{u"itemid"_s, note}, {u"title"_s, u"Second"_s}});
        dialog.accept();
    });
    dialog.exec();
    EXPECT_EQ(manager.QueueLength(), 2);
    EXPECT_NE(CatalogValue(note, u"title"_s), u"Second"_s);
    manager.ProcessQueue();
    EXPECT_EQ(CatalogValue(note, u"title"_s), u"Second"_s);
}

TEST_F(MessageDispatchTest, ABurstIsHandledInSlicesThatKeepTheArrivalOrder) {
    for (const QString& title : {u"First"_s, u"Second"_s, u"Third"_s})
        peer->Post(u"UpdateMetadata"_s, {{u"itemid"_s, note}, {u"title"_s, title}});
    ASSERT_EQ(manager.QueueLength(), 3);
    // A pass whose time is up still handles one message, the oldest, and tells that more wait.
    EXPECT_TRUE(manager.ProcessQueue(QDeadlineTimer(0)));
    EXPECT_EQ(manager.QueueLength(), 2);
    EXPECT_EQ(CatalogValue(note, u"title"_s), u"First"_s);
    EXPECT_FALSE(manager.ProcessQueue());
    EXPECT_EQ(manager.QueueLength(), 0);
    EXPECT_EQ(CatalogValue(note, u"title"_s), u"Third"_s);
}

TEST_F(MessageDispatchTest, WindowRequestsGoToTheOwningProgramOnlyAndItsLeavingClosesThem) {
    Peer bystander(u"bystander"_s);
    Deliver(u"NoteOpenNotification"_s, {{u"itemid"_s, note}, {u"openwindowhandle"_s, u"7"_s}});
    bystander.Post(u"DocumentOpenNotification"_s,
                   {{u"itemid"_s, document}, {u"openwindowhandle"_s, u"7"_s}});
    manager.ProcessQueue();

    // Acts at once, without an idle pass.
    peer->Post(u"WindowShowNotification"_s, {{u"WindowShowCmdType"_s, u"windowshowminimize"_s}});
    const Props minimise{
        {u"handle"_s, u"7"_s}, {u"command"_s, u"show"_s}, {u"showcommand"_s, u"6"_s}};
    ASSERT_TRUE(WaitForEvents([&] { return !peer->heard.isEmpty(); }, 2000));
    EXPECT_EQ(peer->heard.first(), std::make_pair(u"WindowCommand"_s, minimise));
    // What one sender sends reaches a listener in order: a command for the bystander would
    // come before this notification to everyone.
    GetItemWindowHub()->PrintNote(note);
    ASSERT_TRUE(WaitForEvents([&] { return !bystander.heard.isEmpty(); }, 2000));
    EXPECT_EQ(bystander.heard.first().first, u"PrintNote"_s) << "a command is for its owner only";

    IViewerService* viewer = WNavDS::Instance()->GetViewerService();
    INoteToolService* noteTool = WNavDS::Instance()->GetNoteToolService();
    ASSERT_EQ(WindowCount(viewer), 1);
    peer->Leave();
    EXPECT_TRUE(WaitForEvents([&] { return WindowCount(noteTool) == 0; }, 2000));
    EXPECT_EQ(WindowCount(viewer), 1) << "the other program's window stays";
}

TEST_F(MessageDispatchTest, HubNotificationsAndNewNoteTravelOverTheBus) {
    GetItemWindowHub()->ActivateNote(note);
    ASSERT_TRUE(WaitForEvents([&] { return !peer->heard.isEmpty(); }, 2000));
    EXPECT_EQ(peer->heard.first(), std::make_pair(u"ActivateNote"_s, Props{{u"itemid"_s, note}}));

    const qsizetype before = WNavDS::Instance()->GetItems().size();
    QDBusMessage call = QDBusMessage::createMethodCall(
        kService, kPath, u"com.brindle.QuillmarkAmbrel.Navigator"_s, u"NewNote"_s);
    EXPECT_EQ(peer->bus.call(call, QDBus::BlockWithGui).type(), QDBusMessage::ReplyMessage);
    EXPECT_EQ(WNavDS::Instance()->GetItems().size(), before + 1);
}

} // namespace

#include "MessageDispatchTest.moc"
