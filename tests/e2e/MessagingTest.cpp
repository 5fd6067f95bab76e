#include "support/AmbrelTest.h"
#include "support/NavigatorProcess.h"

#include <QDeadlineTimer>
#include <QFile>
#include <QStringDecoder>
#include <QThread>

namespace {

using namespace Qt::StringLiterals;

class MessagingTest : public AmbrelTest {};

// A user links a document by typing a bus call; the catalog on disk then holds it.
TEST_F(MessagingTest, ABusCallLinksADocumentIntoTheCatalogOnDisk) {
    const QString report = WriteFile(u"my files/report.pdf"_s, "%PDF-1.4\n");
    NavigatorProcess navigator(Home());
    navigator.Start();
    ASSERT_TRUE(navigator.WaitUntilRunning());

    QProcess gdbus;
    gdbus.setProcessEnvironment(navigator.Environment());
    const QStringList call{u"call"_s,
                           u"--session"_s,
                           u"--dest"_s,
                           u"com.brindle.QuillmarkAmbrel.AmbrelService"_s,
                           u"--object-path"_s,
                           u"/AmbrelService"_s,
                           u"--method"_s,
                           u"com.brindle.QuillmarkAmbrel.Broker.Post"_s,
                           u"RequestViewerFromFile"_s,
                           u"{'filename': '%1'}"_s.arg(report)};
    // The navigator may hold its lock before it owns its bus name.
    const QDeadlineTimer deadline(10000);
    for (;;) {
        gdbus.start(u"gdbus"_s, call);
        ASSERT_TRUE(gdbus.waitForFinished(10000));
        if (gdbus.exitCode() == 0 || deadline.hasExpired())
            break;
        QThread::msleep(100);
    }
    ASSERT_EQ(gdbus.exitCode(), 0) << gdbus.readAllStandardError().toStdString();

    const QDeadlineTimer saved(10000);
    while (!CatalogFileText().contains(u"<path>"_s + report + u"</path>"_s) && !saved.hasExpired())
        QThread::msleep(100);
    const QString text = CatalogFileText();
    EXPECT_TRUE(text.contains(u"<path>"_s + report + u"</path>"_s)) << text.toStdString();
    EXPECT_TRUE(text.contains(u"<linked>true</linked>"_s));
    ASSERT_TRUE(navigator.Terminate());
}

} // namespace
