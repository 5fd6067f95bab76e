#include "platform/Registry.h"
#include "support/AmbrelTest.h"

#include <QFile>

namespace {

using Platform::Registry;

class RegistryTest : public AmbrelTest {};

const QString kStartPanelKey =
    QStringLiteral("SOFTWARE\\Brindle\\Quillmark Ambrel\\Start Panel\\1.0\\Settings\\");

TEST_F(RegistryTest, UserValuesAreWrittenReadAndRemovedUnderTheConfigFolder) {
    EXPECT_FALSE(
        Registry::UserValue(kStartPanelKey, QStringLiteral("LaunchOnAmbrelStart")).isValid());
    EXPECT_FALSE(Registry::HasUserKey(kStartPanelKey));

    ASSERT_TRUE(Registry::SetUserValue(kStartPanelKey, QStringLiteral("LaunchOnAmbrelStart"), 1));
    EXPECT_EQ(Registry::UserValue(kStartPanelKey, QStringLiteral("LaunchOnAmbrelStart")).toInt(),
              1);
    EXPECT_TRUE(Registry::HasUserKey(kStartPanelKey));
    // The same key written without its trailing separator or in the other slash form is the
    // same key.
    EXPECT_EQ(Registry::UserValue(
                  QStringLiteral("SOFTWARE/Brindle/Quillmark Ambrel/Start Panel/1.0/Settings"),
                  QStringLiteral("LaunchOnAmbrelStart"))
                  .toInt(),
              1);
    EXPECT_TRUE(Registry::UserFile().startsWith(ConfigHome() + QStringLiteral("/Brindle/")));
    EXPECT_TRUE(QFile::exists(Registry::UserFile()));

    EXPECT_TRUE(Registry::RemoveUserValue(kStartPanelKey, QStringLiteral("LaunchOnAmbrelStart")));
    EXPECT_FALSE(Registry::RemoveUserValue(kStartPanelKey, QStringLiteral("LaunchOnAmbrelStart")));
    EXPECT_FALSE(Registry::HasUserKey(kStartPanelKey));
}

TEST_F(RegistryTest, MachineValuesAreReadOnlyFromTheMachineFile) {
    WriteFile(QStringLiteral("etc/Quillmark Ambrel.ini"),
              "[Software]\nBrindle\\Quillmark%20Ambrel\\BubbleStartupDelay=5000\n");
    EXPECT_EQ(Registry::MachineValue(QStringLiteral("Software\\Brindle\\Quillmark Ambrel"),
                                     QStringLiteral("BubbleStartupDelay"))
                  .toInt(),
              5000);
    // A user value of the same name is another scope.
    EXPECT_FALSE(Registry::UserValue(QStringLiteral("Software\\Brindle\\Quillmark Ambrel"),
                                     QStringLiteral("BubbleStartupDelay"))
                     .isValid());
}

} // namespace
