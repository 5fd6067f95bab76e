#include "support/AmbrelTest.h"
#include "support/NavigatorProcess.h"
#include "viewer/SamplePdf.h"

#include <QDBusConnection>
#include <QDBusConnectionInterface>
#include <QDeadlineTimer>
#include <QDir>
#include <QFile>
#include <QFileInfo>
#include <QStringDecoder>
#include <QThread>

#include <csignal>
#include <functional>

namespace {

using namespace Qt::StringLiterals;

bool WaitUntil(const std::function<bool()>& done, int timeoutMs = 15000) {
    const QDeadlineTimer deadline(timeoutMs);
    while (!done() && !deadline.hasExpired())
        QThread::msleep(100);
    return done();
}

// The process id of a viewer on the bus, 0 when none is there.
uint ViewerOnTheBus() {
    QDBusConnectionInterface* bus = QDBusConnection::sessionBus().interface();
    const QStringList names = bus->registeredServiceNames().value();
    for (const QString& name : names) {
        if (!name.startsWith(u':'))
            continue;
        const uint pid = bus->servicePid(name).value();
        if (QFileInfo(u"/proc/%1/exe"_s.arg(pid)).symLinkTarget().endsWith(u"/AmbrelViewer"_s))
            return pid;
    }
    return 0;
}

// Gone, or a zombie that nobody has reaped yet: either way it has ended.
bool HasEnded(uint pid) {
    QFile status(u"/proc/%1/stat"_s.arg(pid));
    if (!status.open(QIODevice::ReadOnly))
        return true;
    const QByteArray text = status.readAll();
    return text.mid(text.lastIndexOf(')') + 2, 1) == "Z";
}

class ViewerTest : public AmbrelTest {};

// A document viewed from the command line opens in the viewer, which reports its window; the
// navigator closing down closes that window and the viewer ends.
TEST_F(ViewerTest, AViewedPdfOpensInTheViewerWhichEndsWithTheNavigator) {
    if (!QDBusConnection::sessionBus().isConnected())
        GTEST_SKIP() << "no session bus";
    const QString pdf = Home() + u"/my papers/three pages.pdf"_s;
    ASSERT_TRUE(QDir().mkpath(Home() + u"/my papers"_s));
    ASSERT_TRUE(WriteSamplePdf(pdf, 3));

    NavigatorProcess navigator(Home());
    navigator.Start({u"/ViewDocument"_s, pdf});
    ASSERT_TRUE(navigator.WaitUntilRunning());
    uint viewer = 0;
    ASSERT_TRUE(WaitUntil([&] { return (viewer = ViewerOnTheBus()) != 0; }));

    EXPECT_TRUE(WaitUntil([&] {
        const QString text = CatalogFileText();
        return text.contains(u"<path>"_s + pdf + u"</path>"_s) &&
               text.contains(u"<open>true</open>"_s);
    })) << CatalogFileText().toStdString();

    ASSERT_TRUE(navigator.Terminate());
    EXPECT_TRUE(WaitUntil([&] { return HasEnded(viewer); }, 5000));
    if (!HasEnded(viewer))
        ::kill(static_cast<pid_t>(viewer), SIGKILL);
}

} // namespace
