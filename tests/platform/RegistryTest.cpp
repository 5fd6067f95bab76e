#include "platform/Registry.h"
#include "support/AmbrelTest.h"

#include <QFile>

namespace {

using namespace Qt::StringLiterals;
using Platform::Registry;

class RegistryTest : public AmbrelTest {};

const QString kKey = u"SOFTWARE\\Brindle\\Quillmark Ambrel\\Start Panel\\1.0\\Settings\\"_s;
const QString kValue = u"LaunchOnAmbrelStart"_s;

TEST_F(RegistryTest, UserValuesAreWrittenReadAndRemovedUnderTheConfigFolder) {
    EXPECT_FALSE(Registry::UserValue(kKey, kValue).isValid());
    EXPECT_FALSE(Registry::HasUserKey(kKey));
    ASSERT_TRUE(Registry::SetUserValue(kKey, kValue, 1));
    EXPECT_TRUE(Registry::HasUserKey(kKey));
    // Without the trailing separator or with the other slash it is the same key.
    EXPECT_EQ(Registry::UserValue(u"SOFTWARE/Brindle/Quillmark Ambrel/Start Panel/1.0/Settings"_s,
                                  kValue),
              QVariant(1));
    EXPECT_TRUE(Registry::UserFile().startsWith(ConfigHome() + u"/Brindle/"_s));
    EXPECT_TRUE(QFile::exists(Registry::UserFile()));

    EXPECT_TRUE(Registry::RemoveUserValue(kKey, kValue));
    EXPECT_FALSE(Registry::RemoveUserValue(kKey, kValue));
    EXPECT_FALSE(Registry::HasUserKey(kKey));
}

TEST_F(RegistryTest, MachineValuesAreReadOnlyFromTheMachineFile) {
    WriteFile(u"etc/Quillmark Ambrel.ini"_s,
              "[Software]\nBrindle\\Quillmark%20Ambrel\\BubbleStartupDelay=5000\n");
    const QString key = u"Software\\Brindle\\Quillmark Ambrel"_s;
    EXPECT_EQ(Registry::MachineValue(key, u"BubbleStartupDelay"_s).toInt(), 5000);
    // A user value of the same name is another scope.
    EXPECT_FALSE(Registry::UserValue(key, u"BubbleStartupDelay"_s).isValid());
}

} // namespace
