#include "settings/CNavigatorGeneralSettingsDlg.h"

#include "common/StringTable.h"
#include "libs/lustre/CVisualStyleManager.h"

#include <QCheckBox>
#include <QComboBox>
#include <QFormLayout>
#include <QLabel>
#include <QSpinBox>
#include <QVBoxLayout>

CNavigatorGeneralSettingsDlg::CNavigatorGeneralSettingsDlg(QWidget* parent)
    : QWidget(parent), m_theme(new QComboBox(this)),
      m_launchAppOnStart(
          new QCheckBox(QStringLiteral("Launch Quillmark Ambrel on start-up"), this)),
      m_launchStartPanel(
          new QCheckBox(QStringLiteral("Launch Start Panel when Quillmark Ambrel Launches"), this)),
      m_automaticUpdates(new QCheckBox(
          QStringLiteral("Automatically download free product updates and notify me before "
                         "installing"),
          this)),
      m_cleanDeletedOnClose(
          new QCheckBox(QStringLiteral("Empty Deleted Items Folder on close"), this)),
      m_maxLinkedDocuments(new QSpinBox(this)) {
    auto* themeLabel = new QLabel(QStringLiteral("Interface Theme:"), this);
    themeLabel->setBuddy(m_theme);
    auto* themeRow = new QFormLayout;
    themeRow->addRow(themeLabel, m_theme);

    m_maxLinkedDocuments->setRange(1, 1000);
    auto* limitLabel =
        new QLabel(QStringLiteral("Maximum number of items in Linked Documents folder:"), this);
    limitLabel->setBuddy(m_maxLinkedDocuments);
    auto* limitRow = new QHBoxLayout;
    limitRow->addWidget(limitLabel);
    limitRow->addWidget(m_maxLinkedDocuments);
    limitRow->addStretch();

    auto* layout = new QVBoxLayout(this);
    layout->setContentsMargins(0, 0, 0, 0);
    layout->addLayout(themeRow);
    for (QCheckBox* box :
         {m_launchAppOnStart, m_launchStartPanel, m_automaticUpdates, m_cleanDeletedOnClose})
        layout->addWidget(box);
    layout->addLayout(limitRow);
    layout->addStretch();

    FillThemes();
    SetOptions({});
}

void CNavigatorGeneralSettingsDlg::FillThemes() {
    const Lustre::CVisualStyleManager* manager = GetVisualStyleManager();
    if (manager == nullptr) {
        m_theme->setEnabled(false);
        return;
    }
    for (const Lustre::VisualStyle& style : manager->Styles()) {
        const QString text = style.identifier == QString::fromUtf16(Lustre::kAmbrelStyle)
                                 ? LoadString(StringId::DefaultStyleName).arg(style.displayName)
                                 : style.displayName;
        m_theme->addItem(text, style.identifier);
    }
    m_theme->setCurrentIndex(m_theme->findData(manager->CurrentStyle()));
    m_theme->setEnabled(manager->CanChangeStyle());
}

void CNavigatorGeneralSettingsDlg::SetOptions(const Options& options) {
    m_maxLinkedDocuments->setValue(options.maxLinkedDocuments);
    m_cleanDeletedOnClose->setChecked(options.cleanDeletedOnClose);
    m_launchAppOnStart->setChecked(options.launchAppOnStart);
    m_launchStartPanel->setChecked(options.launchStartPanel);
    m_automaticUpdates->setChecked(options.automaticUpdates);
}

CNavigatorGeneralSettingsDlg::Options CNavigatorGeneralSettingsDlg::GetOptions() const {
    return {m_maxLinkedDocuments->value(), m_cleanDeletedOnClose->isChecked(),
            m_launchAppOnStart->isChecked(), m_launchStartPanel->isChecked(),
            m_automaticUpdates->isChecked()};
}

QString CNavigatorGeneralSettingsDlg::SelectedStyle() const {
    return m_theme->currentData().toString();
}
