#include "RecordingUrlHandler.h"
#include "ServicesTestSupport.h"

#include "libs/toolwell/CHelpService.h"
#include "platform/Registry.h"

#include <QFileInfo>
#include <QSettings>

namespace {

using HelpServiceTest = ServicesTest;

TEST_F(HelpServiceTest, UserGuideIsOfferedWhileItsFileIsInstalled) {
    RecordingUrlHandler browser;
    CHelpService help(Home() + QStringLiteral("/lib/bin"));
    EXPECT_EQ(help.HasUserGuide(), 0);
    EXPECT_EQ(help.ShowUserGuide(), E_FAIL);
    EXPECT_EQ(help.ShowHelpTopics(), E_FAIL);
    EXPECT_TRUE(browser.opened.isEmpty());

    const QString guide = WriteFile(QStringLiteral("lib/help/index.html"), "<html></html>");
    EXPECT_EQ(help.HasUserGuide(), 1);
    ASSERT_EQ(help.ShowUserGuide(), S_OK);
    ASSERT_EQ(help.ShowHelpTopics(), S_OK);
    EXPECT_EQ(browser.opened,
              (QList<QUrl>{QUrl::fromLocalFile(guide), QUrl::fromLocalFile(guide)}));

    ASSERT_TRUE(QFile::remove(guide));
    EXPECT_EQ(help.HasUserGuide(), 0);

    // The build puts the guide where the built program looks for it.
    EXPECT_EQ(CHelpService(QFileInfo(QStringLiteral(AMBREL_NAVIGATOR_PATH)).absolutePath())
                  .HasUserGuide(),
              1);
}

TEST_F(HelpServiceTest, WebsiteIsOnlyAWebAddressFromTheMachineSettings) {
    RecordingUrlHandler browser;
    IHelpService* help = GetHelpService();
    EXPECT_FALSE(help->HasWebsite());
    EXPECT_EQ(help->OpenWebsite(), E_FAIL);

    QSettings machine(Platform::Registry::MachineFile(), QSettings::IniFormat);
    const QString key = QStringLiteral("SOFTWARE/Brindle/Quillmark Ambrel/Website");
    for (const char* refused : {"", "www.example.com", "file:///etc/passwd", "ftp://example.com/",
                                "https://", "https://exa mple.com/"}) {
        machine.setValue(key, QString::fromUtf8(refused));
        machine.sync();
        EXPECT_FALSE(help->HasWebsite()) << refused;
        EXPECT_EQ(help->OpenWebsite(), E_FAIL) << refused;
    }
    EXPECT_TRUE(browser.opened.isEmpty());

    machine.setValue(key, QStringLiteral(" https://www.example.com/ambrel?from=navigator "));
    machine.sync();
    EXPECT_TRUE(help->HasWebsite());
    ASSERT_EQ(help->OpenWebsite(), S_OK);
    EXPECT_EQ(browser.opened,
              QList<QUrl>{QUrl(QStringLiteral("https://www.example.com/ambrel?from=navigator"))});
}

} // namespace
