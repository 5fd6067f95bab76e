#include "libs/lustre/CVisualStyleManager.h"
#include "platform/Registry.h"
#include "support/AmbrelTest.h"

#include <QApplication>
#include <QStyle>
#include <QStyleFactory>

namespace {

const QString kKey = QString::fromUtf16(Lustre::kVisualStylesKey);

// A style of Qt's own that is not the one "Ambrel" is built on.
QString OtherStyle() {
    for (const QString& key : QStyleFactory::keys()) {
        if (key.compare(QStringLiteral("Fusion"), Qt::CaseInsensitive) != 0)
            return key;
    }
    return {};
}

class VisualStyleManagerTest : public AmbrelTest {
protected:
    Lustre::CVisualStyleManager* Start() {
        Lustre::CVisualStyleManager* manager = CreateVisualStyleManager();
        EXPECT_EQ(manager, GetVisualStyleManager());
        EXPECT_TRUE(SUCCEEDED(manager->Register(kKey)));
        return manager;
    }
};

TEST_F(VisualStyleManagerTest, AmbrelIsTheDefaultAndComesFirstBeforeQtsStyles) {
    Lustre::CVisualStyleManager* manager = Start();
    EXPECT_EQ(manager->CurrentStyle(), QStringLiteral("Ambrel"));
    QStringList identifiers;
    for (const Lustre::VisualStyle& style : manager->Styles())
        identifiers.append(style.identifier);
    EXPECT_EQ(identifiers, QStringList{QStringLiteral("Ambrel")} + QStyleFactory::keys());
    EXPECT_TRUE(manager->CanChangeStyle());
    // Registering applied it: Fusion in the product's palette.
    EXPECT_EQ(QApplication::style()->name(), QStringLiteral("fusion"));
    EXPECT_EQ(QApplication::palette().color(QPalette::Highlight),
              Lustre::CVisualStyleManager::AmbrelPalette().color(QPalette::Highlight));
}

TEST_F(VisualStyleManagerTest, ChoiceIsAppliedStoredAndSurvivesANewManager) {
    const QString other = OtherStyle();
    ASSERT_FALSE(other.isEmpty());
    Lustre::CVisualStyleManager* manager = Start();
    QStringList changes;
    QObject::connect(manager, &Lustre::CVisualStyleManager::VisualStyleChanged,
                     [&changes](const QString& identifier) { changes.append(identifier); });

    EXPECT_EQ(manager->SetCurrentStyle(other, kKey), S_OK);
    EXPECT_EQ(QApplication::style()->name(), other.toLower());
    EXPECT_EQ(Platform::Registry::UserValue(kKey, QStringLiteral("CurrentStyle")).toString(),
              other);
    EXPECT_EQ(changes, QStringList{other});
    // Choosing the style in use again is no change.
    EXPECT_EQ(manager->SetCurrentStyle(other, kKey), S_OK);
    EXPECT_EQ(changes, QStringList{other});

    DeleteVisualStyleManager();
    EXPECT_EQ(GetVisualStyleManager(), nullptr);
    EXPECT_EQ(Start()->CurrentStyle(), other);
}

TEST_F(VisualStyleManagerTest, UnknownStylesAreRefusedAndAnUnknownStoredOneMeansAmbrel) {
    const QString other = OtherStyle();
    ASSERT_FALSE(other.isEmpty());
    Platform::Registry::SetUserValue(kKey, QStringLiteral("CurrentStyle"), other);
    Lustre::CVisualStyleManager* manager = Start();
    ASSERT_EQ(manager->CurrentStyle(), other);

    EXPECT_EQ(manager->SetCurrentStyle(QStringLiteral("NoSuchStyle"), kKey), E_INVALIDARG);
    EXPECT_EQ(manager->CurrentStyle(), other);
    EXPECT_EQ(Platform::Registry::UserValue(kKey, QStringLiteral("CurrentStyle")).toString(),
              other);

    Platform::Registry::SetUserValue(kKey, QStringLiteral("CurrentStyle"),
                                     QStringLiteral("NoSuchStyle"));
    DeleteVisualStyleManager();
    EXPECT_EQ(Start()->CurrentStyle(), QStringLiteral("Ambrel"));
    EXPECT_EQ(QApplication::style()->name(), QStringLiteral("fusion"));
}

} // namespace
