#include "startpanel/CStartPanelDlg.h"
#include "startpanel/StartPanelActions.h"
#include "support/AmbrelTest.h"
#include "support/NavigatorProcess.h"

#include <QDeadlineTimer>
#include <QFile>
#include <QFileInfo>
#include <QStringDecoder>
#include <QThread>
#include <QToolButton>

namespace {

using namespace Qt::StringLiterals;

class InstalledProductTest : public AmbrelTest {
protected:
    // Waits until the catalog on disk holds a note titled from the language file.
    bool WaitForNewNote() const {
        const QDeadlineTimer deadline(15000);
        while (!CatalogFileText().contains(u"<title>New Note</title>"_s) && !deadline.hasExpired())
            QThread::msleep(100);
        return CatalogFileText().contains(u"<title>New Note</title>"_s);
    }
};

// Installed into a fresh prefix, the navigator runs through the link on the PATH and finds its
// language file beside its real folder; the desktop entry passes the desktop's own checker.
TEST_F(InstalledProductTest, InstalledTreeRunsThroughItsLink) {
    const QString prefix = Home() + u"/prefix"_s;
    QProcess install;
    install.setProcessChannelMode(QProcess::MergedChannels);
    install.start(u"cmake"_s,
                  {u"--install"_s, QStringLiteral(AMBREL_BUILD_DIR), u"--prefix"_s, prefix});
    ASSERT_TRUE(install.waitForFinished(60000));
    ASSERT_EQ(install.exitCode(), 0) << install.readAll().toStdString();

    const QString folder = prefix + u"/lib/quillmark-ambrel/"_s;
    for (const QString& file : {u"bin/ambrel-navigator"_s, u"bin/AmbrelStartPanel"_s,
                                u"Languages/EN/Programs/NoteToolIntl.lang"_s, u"help/index.html"_s})
        EXPECT_TRUE(QFileInfo::exists(folder + file)) << file.toStdString();
    EXPECT_TRUE(QFileInfo::exists(prefix + u"/share/icons/hicolor/scalable/apps/"
                                           u"quillmark-ambrel.svg"_s));
    const QFileInfo link(prefix + u"/bin/ambrel-navigator"_s);
    ASSERT_TRUE(link.isSymLink());

    QProcess validate;
    validate.setProcessChannelMode(QProcess::MergedChannels);
    validate.start(u"desktop-file-validate"_s,
                   {prefix + u"/share/applications/quillmark-ambrel.desktop"_s});
    ASSERT_TRUE(validate.waitForFinished(20000));
    EXPECT_EQ(validate.exitCode(), 0) << validate.readAll().toStdString();

    NavigatorProcess navigator(Home(), link.filePath());
    navigator.Start({u"/NewNote"_s});
    ASSERT_TRUE(navigator.WaitUntilRunning());
    EXPECT_TRUE(WaitForNewNote()) << CatalogFileText().toStdString();
    EXPECT_TRUE(navigator.Terminate());
}

// The start panel's New Note reaches the running navigator, which makes the note.
TEST_F(InstalledProductTest, StartPanelNewNoteMakesANoteInTheRunningNavigator) {
    NavigatorProcess navigator(Home());
    navigator.Start();
    ASSERT_TRUE(navigator.WaitUntilRunning());

    StartPanelActions actions(QFileInfo(QStringLiteral(AMBREL_NAVIGATOR_PATH)).absolutePath(),
                              [](const QString&, const QMap<QString, QString>&) { return false; });
    CStartPanelDlg panel(actions);
    QToolButton* newNote = nullptr;
    for (QToolButton* button : panel.findChildren<QToolButton*>()) {
        if (button->accessibleName() == u"New Note"_s)
            newNote = button;
    }
    ASSERT_NE(newNote, nullptr);
    newNote->click();
    EXPECT_TRUE(WaitForNewNote()) << CatalogFileText().toStdString();
    EXPECT_TRUE(navigator.Terminate());
}

} // namespace
