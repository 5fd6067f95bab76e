#include "app/ApplicationInfo.h"
#include "common/ReleasePtr.h"
#include "support/AmbrelTest.h"

#include <QCoreApplication>

namespace {

class ApplicationInfoTest : public AmbrelTest {};

QString LanguageFolder(Brindle::Application::IApplicationInfo& info) {
    QString folder;
    UnicodeStringPtr sink(&folder);
    EXPECT_EQ(info.GetLanguageFolder(&sink), S_OK);
    return folder;
}

TEST_F(ApplicationInfoTest, LanguageFolderLiesBesideTheProgramFolder) {
    ReleasePtr<Brindle::Application::IApplicationInfo> info(
        CreateApplicationInfo(QStringLiteral("/opt/P/Bin")));
    EXPECT_EQ(LanguageFolder(*info), QStringLiteral("/opt/P/Languages/EN/Programs/"));

    info->SetLanguage(QStringLiteral("DE"));
    EXPECT_EQ(LanguageFolder(*info), QStringLiteral("/opt/P/Languages/DE/Programs/"));
}

TEST_F(ApplicationInfoTest, FoldersOfTheRunningProgramAndNullSinks) {
    ReleasePtr<Brindle::Application::IApplicationInfo> info(CreateApplicationInfo());
    QString folder;
    UnicodeStringPtr sink(&folder);
    ASSERT_EQ(info->GetProgramFolder(&sink), S_OK);
    EXPECT_EQ(folder, QCoreApplication::applicationDirPath());
    EXPECT_TRUE(LanguageFolder(*info).endsWith(QStringLiteral("/Languages/EN/Programs/")));
    EXPECT_EQ(info->GetProgramFolder(nullptr), E_INVALIDARG);
    EXPECT_EQ(info->GetLanguageFolder(nullptr), E_INVALIDARG);
}

} // namespace
