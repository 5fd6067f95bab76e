#include "support/AmbrelTest.h"
#include "support/FileWatch.h"

#include "app/CApplicationCommands.h"
#include "app/CCommandRouter.h"
#include "app/SystemIntegration.h"
#include "common/ReleasePtr.h"
#include "libs/lustre/CVisualStyleManager.h"
#include "libs/toolwell/IHarborUtils.h"
#include "libs/toolwell/IQmBridge.h"
#include "libs/toolwell/WordProcessor.h"
#include "navigator/WNavDS.h"
#include "platform/Registry.h"
#include "settings/CNavigatorSettingsDlg.h"
#include "settings/NavigatorSettings.h"

#include <QAbstractButton>
#include <QAbstractItemView>
#include <QAbstractSpinBox>
#include <QAccessible>
#include <QApplication>
#include <QComboBox>
#include <QDialogButtonBox>
#include <QFile>
#include <QLabel>
#include <QLineEdit>
#include <QListWidget>
#include <QPushButton>
#include <QStackedWidget>
#include <QStyle>
#include <QTest>
#include <QTimer>

#include <functional>

namespace {

using namespace Qt::StringLiterals;

QString AccessibleName(QWidget* widget) {
    QAccessibleInterface* accessible = QAccessible::queryAccessibleInterface(widget);
    return accessible != nullptr ? accessible->text(QAccessible::Name) : QString();
}

class SettingsDialogTest : public AmbrelTest {
protected:
    void SetUp() override {
        AmbrelTest::SetUp();
        CreateVisualStyleManager()->Register(QString::fromUtf16(Lustre::kVisualStylesKey));
    }
    void TearDown() override {
        CNavigatorSettingsDlg::SetBloggingPageFactory({});
        AmbrelTest::TearDown();
    }

    // Opens the dialog through open, acts on it once it runs and then presses its button
    // (none: act closes it). Answers the dialog's result.
    static int Run(const std::function<int()>& open, std::function<void(QDialog*)> act,
                   QDialogButtonBox::StandardButton press) {
        QTimer::singleShot(0, [act = std::move(act), press] {
            auto* dialog = qobject_cast<CNavigatorSettingsDlg*>(QApplication::activeModalWidget());
            if (dialog == nullptr) {
                ADD_FAILURE() << "no settings dialog";
                return;
            }
            act(dialog);
            if (press != QDialogButtonBox::NoButton)
                QTest::mouseClick(dialog->findChild<QDialogButtonBox*>()->button(press),
                                  Qt::LeftButton);
        });
        return open();
    }
    static int Run(int firstPage, std::function<void(QDialog*)> act,
                   QDialogButtonBox::StandardButton press) {
        return Run([firstPage] { return OpenSettingsDialog(nullptr, firstPage); }, std::move(act),
                   press);
    }

    // The control that a screen reader announces under that name: its label's, or its own.
    template <class Widget> static Widget* Control(QWidget* dialog, const QString& name) {
        for (QLabel* label : dialog->findChildren<QLabel*>()) {
            if (label->text() == name && qobject_cast<Widget*>(label->buddy()))
                return qobject_cast<Widget*>(label->buddy());
        }
        for (Widget* widget : dialog->findChildren<Widget*>()) {
            if (AccessibleName(widget) == name)
                return widget;
        }
        ADD_FAILURE() << "no control " << name.toStdString();
        return nullptr;
    }

    // Clicks a check box or radio button on its indicator: the button may be wider than what
    // reacts to a click.
    static void Tick(QAbstractButton* button) {
        QTest::mouseClick(button, Qt::LeftButton, {}, QPoint(6, button->height() / 2));
    }

    static void ClickRow(QListWidget* list, int row) {
        QTest::mouseClick(list->viewport(), Qt::LeftButton, {},
                          list->visualItemRect(list->item(row)).center());
    }

    static QStringList Rows(QListWidget* list) {
        QStringList rows;
        for (int row = 0; row < list->count(); ++row)
            rows.append(list->item(row)->text());
        return rows;
    }

    static QByteArray RegistryBytes() {
        QFile file(Platform::Registry::UserFile());
        return file.open(QIODevice::ReadOnly) ? file.readAll() : QByteArray();
    }

    static NavigatorSettingsRecord* Record() { return NavigatorSettings::Instance()->GetRecord(); }
};

TEST_F(SettingsDialogTest, PagesFollowTheListAndTheBloggingFactory) {
    // Opened through its command, the dialog starts on General over the main window.
    QWidget mainWindow;
    CCommandRouter router;
    CApplicationCommands::Register(router, [&mainWindow] { return &mainWindow; });
    Run([&router] { return router.Execute(32775) ? QDialog::Rejected : -1; },
        [&mainWindow](QDialog* dialog) {
            EXPECT_EQ(dialog->parentWidget(), &mainWindow);
            EXPECT_EQ(dialog->findChild<QListWidget*>()->currentItem()->text(), u"General"_s);
            // Every control tells a screen reader what it is.
            for (QWidget* control : dialog->findChildren<QWidget*>()) {
                const bool isControl = qobject_cast<QAbstractButton*>(control) ||
                                       qobject_cast<QComboBox*>(control) ||
                                       qobject_cast<QAbstractSpinBox*>(control) ||
                                       qobject_cast<QAbstractItemView*>(control) ||
                                       (qobject_cast<QLineEdit*>(control) &&
                                        !qobject_cast<QAbstractSpinBox*>(control->parent()));
                QAccessibleInterface* accessible = QAccessible::queryAccessibleInterface(control);
                if (isControl) {
                    EXPECT_TRUE(!accessible->text(QAccessible::Name).isEmpty() ||
                                !accessible->relations(QAccessible::Labelled).isEmpty())
                        << control->metaObject()->className();
                }
            }
        },
        QDialogButtonBox::Cancel);

    const struct {
        const char* name;
        std::function<QWidget*(QWidget*)> factory;
        QStringList rows;
    } cases[] = {
        {"no factory", {}, {u"General"_s, u"Notes"_s, u"Send to Word Processor"_s}},
        {"no page",
         [](QWidget*) { return nullptr; },
         {u"General"_s, u"Notes"_s, u"Send to Word Processor"_s}},
        {"a page",
         [](QWidget* parent) { return new QLabel(u"Blog accounts"_s, parent); },
         {u"General"_s, u"Notes"_s, u"Blogging"_s, u"Send to Word Processor"_s}},
    };
    for (const auto& c : cases) {
        CNavigatorSettingsDlg::SetBloggingPageFactory(c.factory);
        Run(
            CNavigatorSettingsDlg::NotesPage,
            [&c](QDialog* dialog) {
                auto* list = dialog->findChild<QListWidget*>();
                auto* pages = dialog->findChild<QStackedWidget*>();
                EXPECT_EQ(Rows(list), c.rows) << c.name;
                EXPECT_EQ(list->currentItem()->text(), u"Notes"_s) << c.name;
                EXPECT_TRUE(pages->currentWidget()->isAncestorOf(
                    Control<QComboBox>(dialog, u"Default font for Notes"_s)))
                    << c.name;
                // Each row shows its own page, the last one too.
                const int last = list->count() - 1;
                ClickRow(list, last);
                EXPECT_EQ(pages->currentIndex(), last) << c.name;
                if (list->count() == 4) {
                    EXPECT_EQ(qobject_cast<QLabel*>(pages->widget(2))->text(), u"Blog accounts"_s);
                }
            },
            QDialogButtonBox::Cancel);
    }
}

TEST_F(SettingsDialogTest, OkWritesTheCopiesBackAndKeepsValuesTheListsLack) {
    // Neither this size nor (on a machine without it) this font is one of the choices.
    Record()->defaultFontSize = 14;
    Record()->defaultFont.SetValue(u"No Such Font Family"_s);
    Record()->maxLinkedDocuments = 40;
    ASSERT_FALSE(NavigatorSettings::Instance()->IsDirty());

    // Unchanged, OK still marks the settings dirty and refreshes the tree.
    EXPECT_EQ(Run(
                  CNavigatorSettingsDlg::NotesPage, [](QDialog*) {}, QDialogButtonBox::Ok),
              QDialog::Accepted);
    EXPECT_TRUE(NavigatorSettings::Instance()->IsDirty());
    EXPECT_TRUE(WNavDS::Instance()->IsChanged());
    EXPECT_EQ(Record()->defaultFontSize, 14);
    EXPECT_EQ(Record()->defaultFont.Value(), u"No Such Font Family"_s);
    EXPECT_EQ(Record()->maxLinkedDocuments, 40);
    EXPECT_EQ(Record()->defaultBackgroundColor.Value(), u"255,255,255"_s);

    // Chosen values come back as the user left them.
    Run(
        CNavigatorSettingsDlg::NotesPage,
        [](QDialog* dialog) {
            auto* size = Control<QComboBox>(dialog, u"Default font size for Notes"_s);
            size->setFocus();
            QTest::keyClick(size, Qt::Key_Home);
            auto* image = Control<QLineEdit>(dialog, u"Background image:"_s);
            QTest::keyClicks(image, u"/pictures/paper.png"_s);
            auto* limit = Control<QAbstractSpinBox>(dialog, u"Maximum number of items in "
                                                            "Linked Documents folder:"_s);
            limit->selectAll();
            QTest::keyClicks(limit, u"250"_s);
        },
        QDialogButtonBox::Ok);
    EXPECT_EQ(Record()->defaultFontSize, 10);
    EXPECT_EQ(Record()->defaultBackgroundImage.Value(), u"/pictures/paper.png"_s);
    EXPECT_EQ(Record()->maxLinkedDocuments, 250);
}

TEST_F(SettingsDialogTest, AutostartEntryFollowsOnlyAChangedLaunchOption) {
    const auto toggleLaunch = [](QDialog* dialog) {
        Tick(Control<QAbstractButton>(dialog, u"Launch Quillmark Ambrel on start-up"_s));
    };
    Run(CNavigatorSettingsDlg::GeneralPage, toggleLaunch, QDialogButtonBox::Ok);
    ASSERT_TRUE(QFile::exists(AutostartFile()));
    EXPECT_TRUE(Record()->launchAppOnStart.Value());

    // Unchanged, the entry is not written again, nor put back once the user removed it.
    const FileWatch watch(AutostartFile());
    Run(
        CNavigatorSettingsDlg::GeneralPage, [](QDialog*) {}, QDialogButtonBox::Ok);
    EXPECT_TRUE(watch.Untouched());
    QFile::remove(AutostartFile());
    Run(
        CNavigatorSettingsDlg::GeneralPage, [](QDialog*) {}, QDialogButtonBox::Ok);
    EXPECT_FALSE(QFile::exists(AutostartFile()));

    AddToRun();
    Run(CNavigatorSettingsDlg::GeneralPage, toggleLaunch, QDialogButtonBox::Ok);
    EXPECT_FALSE(QFile::exists(AutostartFile()));
}

TEST_F(SettingsDialogTest, OkHandsTheOutsideOptionsToTheirOwnersAndCancelNothing) {
    const QString styleBefore = QApplication::style()->name();
    ASSERT_TRUE(IsStartPanelLaunchOnStart());
    ASSERT_EQ(GetHarborUtilsInterface()->IsStartupBubbleEnabled(), 1);
    QString chosenStyle;
    // Changes every option that lives outside the settings file.
    const auto changeAll = [&chosenStyle](QDialog* dialog) {
        auto* theme = Control<QComboBox>(dialog, u"Interface Theme:"_s);
        EXPECT_EQ(theme->itemText(0), u"Ambrel (Default)"_s);
        EXPECT_EQ(theme->currentIndex(), 0);
        theme->setFocus();
        QTest::keyClick(theme, Qt::Key_Down);
        chosenStyle = theme->currentData().toString();
        const QString boxes[] = {u"Launch Start Panel when Quillmark Ambrel Launches"_s,
                                 u"Automatically download free product updates and notify me "
                                 "before installing"_s};
        for (const QString& box : boxes)
            Tick(Control<QAbstractButton>(dialog, box));
        auto* list = dialog->findChild<QListWidget*>();
        ClickRow(list, list->count() - 1);
        Tick(Control<QAbstractButton>(dialog, u"Let me choose each time"_s));
        QTest::keyClicks(Control<QLineEdit>(dialog, u"Word processor command:"_s), u"abiword"_s);
    };

    EXPECT_EQ(Run(CNavigatorSettingsDlg::GeneralPage, changeAll, QDialogButtonBox::Cancel),
              QDialog::Rejected);
    EXPECT_EQ(RegistryBytes(), QByteArray());
    EXPECT_EQ(QApplication::style()->name(), styleBefore);
    EXPECT_FALSE(NavigatorSettings::Instance()->IsDirty());
    EXPECT_FALSE(QFile::exists(AutostartFile()));

    Run(CNavigatorSettingsDlg::GeneralPage, changeAll, QDialogButtonBox::Ok);
    ASSERT_FALSE(chosenStyle.isEmpty());
    EXPECT_EQ(GetVisualStyleManager()->CurrentStyle(), chosenStyle);
    EXPECT_EQ(QApplication::style()->name().toLower(), chosenStyle.toLower());
    EXPECT_FALSE(IsStartPanelLaunchOnStart());
    // The box was off while the engine's flag was on; ticked, the flag goes off.
    EXPECT_EQ(GetHarborUtilsInterface()->IsStartupBubbleEnabled(), 0);
    const ReleasePtr<IQmBridge> bridge{GetQmBridge()};
    EXPECT_EQ(bridge->GetSendToChoice(), 2);
    EXPECT_EQ(Platform::Registry::UserValue(WordProcessor::KeyPath, WordProcessor::CommandValue),
              u"abiword"_s);

    // The next opening shows what OK stored.
    Run(
        CNavigatorSettingsDlg::GeneralPage,
        [&chosenStyle](QDialog* dialog) {
            EXPECT_EQ(Control<QComboBox>(dialog, u"Interface Theme:"_s)->currentData(),
                      chosenStyle);
            EXPECT_FALSE(Control<QAbstractButton>(
                             dialog, u"Launch Start Panel when Quillmark Ambrel Launches"_s)
                             ->isChecked());
            EXPECT_TRUE(
                Control<QAbstractButton>(dialog, u"Let me choose each time"_s)->isChecked());
        },
        QDialogButtonBox::Cancel);
}

} // namespace
