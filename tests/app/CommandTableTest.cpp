#include "navigator/NavigatorTreeFixture.h"

#include "app/ApplicationInfo.h"
#include "app/CApplicationCommands.h"
#include "app/CNavigatorCommands.h"
#include "libs/RecordingUrlHandler.h"
#include "libs/toolwell/CHarborUtils.h"
#include "libs/toolwell/ISnapshotService.h"
#include "platform/Registry.h"
#include "settings/NavigatorSettings.h"
#include "support/FakeHarborUtils.h"

#include <QApplication>
#include <QFileDialog>
#include <QFileInfo>
#include <QSettings>
#include <QTest>
#include <QTimer>

namespace {

class CommandTableTest : public NavigatorTreeFixture {
protected:
    void SetUp() override {
        NavigatorTreeFixture::SetUp();
        m_oldPath = qgetenv("PATH");
        // A mail program on PATH; the recording launcher takes its start.
        const QString mail = WriteFile(u"bin/xdg-email"_s, "#!/bin/sh\n");
        QFile::setPermissions(mail, QFile::ReadOwner | QFile::ExeOwner);
        qputenv("PATH", QFile::encodeName(Home() + u"/bin"_s));
    }
    void TearDown() override {
        qputenv("PATH", m_oldPath);
        SetHarborUtilsForTesting(nullptr);
        SetSnapshotNoteHandler({});
        NavigatorTreeFixture::TearDown();
    }

    void SetMachineValue(const QString& key, const QString& value) {
        QSettings machine(Platform::Registry::MachineFile(), QSettings::IniFormat);
        machine.setValue(key, value);
        machine.sync();
    }

    // What the commands did since the last call: programs started, addresses opened and
    // message boxes shown, in that order.
    QStringList TakeJournal() {
        QStringList journal;
        for (const auto& start : launcher.starts)
            journal.append(
                (QStringList{u"start"_s, QFileInfo(start.program).fileName()} + start.arguments)
                    .join(u' '));
        for (const QUrl& url : urls.opened)
            journal.append(u"open "_s + url.toString());
        for (const auto& box : messages.shown)
            journal.append(u"box "_s + box.caption);
        launcher.starts.clear();
        urls.opened.clear();
        messages.shown.clear();
        return journal;
    }

    RecordingUrlHandler urls;

private:
    QByteArray m_oldPath;
};

TEST_F(CommandTableTest, EveryCommandReachesItsOwnerOrIsDisabled) {
    const QString folder = Folder();
    const QString note = Add(u"note"_s, u"root"_s, {{u"title"_s, u"Plans"_s}});
    const QString pdfPath = WriteFile(u"docs/a.pdf"_s, "%PDF");
    const QString pdf = Linked(pdfPath, 100);
    WriteFile(ItemFile(note).mid(Home().size() + 1), "<p>x</p>");
    const QString activity = WriteFile(u"opt/activity"_s, "");
    SetMachineValue(u"SOFTWARE/Brindle/AppLauncher/Activity Center"_s, activity);
    SetMachineValue(u"SOFTWARE/Brindle/Quillmark Ambrel/Website"_s, u"https://example.org/q"_s);
    ReleasePtr<Brindle::Application::IApplicationInfo> info(CreateApplicationInfo(u"/opt/qa"_s));
    NavigatorSettings::Instance()->SetApplicationInfo(info.get());
    WNavDS* model = Show();

    struct Row {
        int id;
        QString selected;
        QStringList journal; // empty: the command is disabled and does nothing
    };
    const QString mail = u"start xdg-email --utf8 "_s;
    const Row rows[] = {
        {32782, u"root"_s, {u"box About Quillmark Ambrel"_s}},
        {32781, u"root"_s, {u"open https://example.org/q"_s}},
        {32778, u"root"_s, {mail + u"--subject Try Quillmark Ambrel --body"_s}},
        {32793, u"root"_s, {u"start AmbrelStartPanel"_s}},
        {32784, u"root"_s, {u"start activity"_s}},
        {32828, note, {mail + u"--subject Plans --attach "_s + ItemFile(note)}},
        {32895, note, {mail + u"--subject Plans --attach "_s + ItemFile(note)}},
        {32878, pdf, {mail + u"--attach "_s + pdfPath}},
        {32828, folder, {}},
        // Help topics and the user guide need an installed guide, which the tests have not.
        {57670, u"root"_s, {}},
        {32776, u"root"_s, {}},
        {32862, u"root"_s, {}},
        // Without a default blog account the user is told so (the navigator then opens the
        // Blogging settings); a document is never posted.
        {32923, note, {u"box Quillmark Ambrel"_s}},
        {32923, pdf, {}},
        // Owners still to come: updates, message archive; and "Save As MS Word", which nothing
        // handles.
        {32924, u"root"_s, {}},
        {32851, u"root"_s, {}},
        {32898, pdf, {}},
        {32800, u"root"_s, {}},
    };
    for (const Row& row : rows) {
        model->SelectById(row.selected);
        EXPECT_EQ(router->Execute(row.id), !row.journal.isEmpty()) << row.id;
        const QStringList journal = TakeJournal();
        ASSERT_EQ(journal.size(), row.journal.size())
            << row.id << " " << journal.join(u'\n').toStdString();
        for (int index = 0; index < journal.size(); ++index)
            EXPECT_TRUE(journal[index].startsWith(row.journal[index]))
                << row.id << ": " << journal[index].toStdString();
    }
}

TEST_F(CommandTableTest, TicksAndEnablingFollowTheSettingsAndTheSelection) {
    const QString note = Add(u"note"_s);
    const QString pdf = Linked(u"/docs/a.pdf"_s, 100);
    WNavDS* model = Show();
    NavigatorSettings* settings = NavigatorSettings::Instance();

    // The window options flip their setting and tick as it stands.
    for (const int id : {32783, 32785}) {
        const bool before = router->IsChecked(id);
        ASSERT_TRUE(router->Execute(id));
        router->UpdateActions();
        EXPECT_NE(router->Action(id)->isChecked(), before) << id;
    }
    EXPECT_TRUE(settings->GetKeepOnTop());
    EXPECT_FALSE(settings->GetShowFrame());

    // One type filter is ticked at a time; "opened items only" ticks on its own.
    ASSERT_TRUE(router->Execute(32796));
    ASSERT_TRUE(router->Execute(32799));
    router->UpdateActions();
    for (int id = 32794; id <= 32799; ++id)
        EXPECT_EQ(router->Action(id)->isChecked(), id == 32796 || id == 32799) << id;
    EXPECT_TRUE(settings->GetShowDoc());

    // The message centre's command exists only where the utility engine offers it.
    FakeHarborUtils utils;
    utils.messageCentre = true;
    SetHarborUtilsForTesting(&utils);
    CNavigatorCommands::Register(*router, tree.get());
    const bool shown = settings->GetShowMessageCentre();
    ASSERT_TRUE(router->Execute(32800));
    EXPECT_NE(settings->GetShowMessageCentre(), shown);
    EXPECT_EQ(router->IsChecked(32800), settings->GetShowMessageCentre());

    // Mail needs an item that is not a folder and a mail program; Save As needs a document.
    struct Row {
        QString selected;
        bool mail;
        bool saveAs;
    };
    for (const Row& row :
         {Row{u"root"_s, false, false}, Row{note, true, false}, Row{pdf, true, true}}) {
        model->SelectById(row.selected);
        EXPECT_EQ(router->IsEnabled(32828), row.mail) << row.selected.toStdString();
        EXPECT_EQ(router->IsEnabled(32876), row.saveAs) << row.selected.toStdString();
    }
    EXPECT_TRUE(router->IsEnabled(32778));
    qputenv("PATH", "");
    EXPECT_FALSE(router->IsEnabled(32828));
    EXPECT_FALSE(router->IsEnabled(32778));
}

TEST_F(CommandTableTest, SnapshotIsTakenWhileTheNavigatorIsHidden) {
    Show();
    ASSERT_TRUE(tree->isVisible());
    int grabs = 0;
    bool shownAtGrab = true;
    SetSnapshotNoteHandler([&](const QString& picture) {
        ++grabs;
        shownAtGrab = tree->isVisible();
        EXPECT_FALSE(QImage(picture).isNull());
        return S_OK;
    });
    ASSERT_TRUE(router->Execute(32771));
    EXPECT_FALSE(tree->isVisible());
    ASSERT_TRUE(QTest::qWaitFor([&] { return grabs == 1 && tree->isVisible(); }, 5000));
    EXPECT_FALSE(shownAtGrab);
}

TEST_F(CommandTableTest, SaveAsCopiesTheSelectedDocumentWhereTheUserChose) {
    const QString source = WriteFile(u"docs/report"_s, "report text");
    const QString pdf =
        Add(u"document"_s, u"root"_s,
            {{u"linked"_s, u"true"_s}, {u"path"_s, source}, {u"subtype"_s, u"pdf"_s}});
    WNavDS* model = Show();
    model->SelectById(pdf);
    const QString target = Home() + u"/copy"_s;
    QStringList filters;
    QTimer::singleShot(0, [&] {
        auto* dialog = qobject_cast<QFileDialog*>(QApplication::activeModalWidget());
        if (dialog == nullptr)
            return;
        filters = dialog->nameFilters();
        dialog->selectFile(target);
        QMetaObject::invokeMethod(dialog, "accept");
    });
    ASSERT_TRUE(router->Execute(32876));
    // A name without extension offers every file and no type.
    EXPECT_EQ(filters, QStringList{u"(*.*)"_s});
    QFile copy(target);
    ASSERT_TRUE(copy.open(QIODevice::ReadOnly));
    EXPECT_EQ(copy.readAll(), "report text");
}

} // namespace
