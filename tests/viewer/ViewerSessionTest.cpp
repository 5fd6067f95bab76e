#include "SamplePdf.h"
#include "companion/CompanionBus.h"
#include "support/AmbrelTest.h"
#include "viewer/CViewerSession.h"
#include "viewer/CViewerWindow.h"

#include <QDBusConnection>
#include <QDBusMessage>
#include <QElapsedTimer>
#include <QEventLoop>
#include <QTimer>

#include <functional>

namespace {

using Props = QMap<QString, QString>;
using namespace Qt::StringLiterals;

const QString kPath = u"/AmbrelService"_s;
const QString kBroker = u"com.brindle.QuillmarkAmbrel.Broker"_s;
const QString kViewerId = u"0A1B2C3D-4E5F-6789-ABCD-EF0123456789"_s;
const QString kLinkedId = u"11111111-2222-3333-4444-555555555555"_s;

bool WaitFor(const std::function<bool()>& done) {
    QElapsedTimer clock;
    clock.start();
    while (!done() && clock.elapsed() < 5000) {
        QEventLoop loop;
        QTimer::singleShot(10, &loop, &QEventLoop::quit);
        loop.exec();
    }
    return done();
}

// The navigator's broker as the viewer meets it: records what is posted, and notifies.
class FakeNavigator final : public QObject {
    Q_OBJECT
    Q_CLASSINFO("D-Bus Interface", "com.brindle.QuillmarkAmbrel.Broker")
public:
    FakeNavigator() : bus(QDBusConnection::connectToBus(QDBusConnection::SessionBus, kName)) {
        bus.registerObject(kPath, this, QDBusConnection::ExportAllSlots);
        registered = bus.registerService(u"com.brindle.QuillmarkAmbrel.AmbrelService"_s);
    }
    ~FakeNavigator() override {
        bus = QDBusConnection(QString());
        QDBusConnection::disconnectFromBus(kName);
    }
    void Notify(const QString& destination, const QString& name, const Props& properties) {
        QDBusMessage signal =
            destination.isEmpty()
                ? QDBusMessage::createSignal(kPath, kBroker, u"Notify"_s)
                : QDBusMessage::createTargetedSignal(destination, kPath, kBroker, u"Notify"_s);
        signal << name << QVariant::fromValue(properties);
        bus.send(signal);
    }
    // Waits for the n-th post (one-based) and answers it.
    std::pair<QString, Props> Posted(qsizetype n) {
        WaitFor([&] { return posted.size() >= n; });
        return posted.size() >= n ? posted.at(n - 1) : std::pair<QString, Props>();
    }

    bool registered = false;
    QList<std::pair<QString, Props>> posted;
    QList<std::pair<QString, Props>> activations;
    QDBusConnection bus;

public Q_SLOTS:
    void Post(const QString& name, const QMap<QString, QString>& properties) {
        // Activation reports come whenever the window manager says so: kept apart.
        (name == u"EventNotification" ? activations : posted).append({name, properties});
    }

private:
    static inline const QString kName = u"fake-navigator"_s;
};

class ViewerSessionTest : public AmbrelTest {
protected:
    void SetUp() override {
        AmbrelTest::SetUp();
        if (!QDBusConnection::sessionBus().isConnected())
            GTEST_SKIP() << "no session bus";
    }
};

// The navigator starts a viewer with "/o" and no file: the viewer reports its window, is handed
// the file under the item it belongs to, reports again, obeys requests for that item and its own
// window only, and reports its close.
TEST_F(ViewerSessionTest, TakesTheHandedOverFileAndFollowsTheNavigatorsRequestsForIt) {
    FakeNavigator navigator;
    ASSERT_TRUE(navigator.registered);
    const QDBusConnection own =
        QDBusConnection::connectToBus(QDBusConnection::SessionBus, u"viewer"_s);
    CompanionBus bus(own);
    CViewerWindow window;
    CViewerSession session(&bus, &window, kViewerId);
    session.StartAwaitingFile();
    const Props firstReport{{u"itemid"_s, kViewerId}, {u"openwindowhandle"_s, u"1"_s}};
    EXPECT_EQ(navigator.Posted(1), std::pair(u"DocumentOpenNotification"_s, firstReport));

    const QString pdf = Home() + u"/handed over.pdf"_s;
    ASSERT_TRUE(WriteSamplePdf(pdf, 2));
    navigator.Notify({}, u"OpenDocumentInViewer"_s,
                     {{u"itemid"_s, kLinkedId}, {u"viewerid"_s, kLinkedId}, {u"path"_s, pdf}});
    navigator.Notify(
        {}, u"OpenDocumentInViewer"_s,
        {{u"itemid"_s, kLinkedId}, {u"viewerid"_s, kViewerId.toLower()}, {u"path"_s, pdf}});
    const Props secondReport{{u"itemid"_s, kLinkedId}, {u"openwindowhandle"_s, u"1"_s}};
    EXPECT_EQ(navigator.Posted(2), std::pair(u"DocumentOpenNotification"_s, secondReport));
    EXPECT_EQ(window.CurrentlyShowing(), CViewerWindow::Showing::Pdf);
    EXPECT_EQ(window.FilePath(), pdf);

    navigator.Notify({}, u"UpdateDocumentProperties"_s,
                     {{u"itemid"_s, kViewerId}, {u"title"_s, u"Not mine"_s}});
    navigator.Notify({}, u"UpdateDocumentProperties"_s,
                     {{u"itemid"_s, kLinkedId}, {u"title"_s, u"Quarterly figures"_s}});
    EXPECT_TRUE(WaitFor([&] { return window.windowTitle().startsWith(u"Quarterly figures - "_s); }))
        << window.windowTitle().toStdString();

    navigator.Notify(bus.UniqueName(), u"WindowCommand"_s,
                     {{u"handle"_s, u"2"_s}, {u"command"_s, u"close"_s}});
    navigator.Notify(
        bus.UniqueName(), u"WindowCommand"_s,
        {{u"handle"_s, u"1"_s}, {u"command"_s, u"show"_s}, {u"showcommand"_s, u"6"_s}});
    EXPECT_TRUE(WaitFor([&] { return window.isMinimized(); }));
    EXPECT_TRUE(window.isVisible());
    navigator.Notify(bus.UniqueName(), u"WindowCommand"_s,
                     {{u"handle"_s, u"1"_s}, {u"command"_s, u"close"_s}});
    const Props closed{{u"itemid"_s, kLinkedId}, {u"open"_s, u"false"_s}};
    EXPECT_EQ(navigator.Posted(3), std::pair(u"UpdateMetadata"_s, closed));
    EXPECT_FALSE(window.isVisible());
    EXPECT_EQ(navigator.posted.size(), 3);
    ASSERT_FALSE(navigator.activations.isEmpty());
    const Props activated{{u"itemid"_s, kViewerId}, {u"event"_s, u"WindowOnActivate"_s}};
    EXPECT_EQ(navigator.activations.first().second, activated);
}

} // namespace

#include "ViewerSessionTest.moc"
