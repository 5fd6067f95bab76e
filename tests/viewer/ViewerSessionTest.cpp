#include "SamplePdf.h"
#include "companion/CompanionBus.h"
#include "support/AmbrelTest.h"
#include "support/FakeNavigatorBroker.h"
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
using FakeNavigator = FakeNavigatorBroker;
using namespace Qt::StringLiterals;

const QString kViewerId = u"0A1B2C3D-4E5F-6789-ABCD-EF0123456789"_s;
const QString kLinkedId = u"11111111-2222-3333-4444-555555555555"_s;

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
    EXPECT_TRUE(WaitForEvents([&] {
        return window.windowTitle().startsWith(u"Quarterly figures - "_s);
    })) << window.windowTitle().toStdString();

    navigator.Notify(bus.UniqueName(), u"WindowCommand"_s,
                     {{u"handle"_s, u"2"_s}, {u"command"_s, u"close"_s}});
    navigator.Notify(
        bus.UniqueName(), u"WindowCommand"_s,
        {{u"handle"_s, u"1"_s}, {u"command"_s, u"show"_s}, {u"showcommand"_s, u"6"_s}});
    EXPECT_TRUE(WaitForEvents([&] { return window.isMinimized(); }));
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
