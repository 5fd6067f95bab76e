#include "app/ApplicationInfo.h"
#include "common/ReleasePtr.h"
#include "support/AmbrelTest.h"

#include <QCoreApplication>
#include <QDir>

namespace {

using namespace Qt::StringLiterals;

class ApplicationInfoTest : public AmbrelTest {};

TEST_F(ApplicationInfoTest, TheLanguageFolderLiesBesideTheProgramFolder) {
    QString folder;
    UnicodeStringPtr sink(&folder);
    ReleasePtr<Brindle::Application::IApplicationInfo> info(CreateApplicationInfo(u"/opt/P/Bin"_s));
    info->SetLanguage(u"DE"_s);
    ASSERT_EQ(info->GetLanguageFolder(&sink), S_OK);
    EXPECT_EQ(folder, u"/opt/P/Languages/DE/Programs/"_s);

    ReleasePtr<Brindle::Application::IApplicationInfo> running(CreateApplicationInfo());
    ASSERT_EQ(running->GetProgramFolder(&sink), S_OK);
    EXPECT_EQ(folder, QCoreApplication::applicationDirPath());
    ASSERT_EQ(running->GetLanguageFolder(&sink), S_OK);
    EXPECT_EQ(folder, QDir::cleanPath(QCoreApplication::applicationDirPath() +
                                      u"/../Languages/EN/Programs"_s) +
                          u'/');
}

} // namespace
