#include "settings/CNavigatorSettingsDlg.h"

#include "app/SystemIntegration.h"
#include "common/ReleasePtr.h"
#include "common/StringTable.h"
#include "libs/lustre/CVisualStyleManager.h"
#include "libs/toolwell/IHarborUtils.h"
#include "libs/toolwell/IQmBridge.h"
#include "navigator/WNavDS.h"
#include "settings/CSendToSettingsDlg.h"
#include "settings/NavigatorSettings.h"
#include "ui/ModalDialog.h"

#include <QDialogButtonBox>
#include <QHBoxLayout>
#include <QListWidget>
#include <QStackedWidget>
#include <QVBoxLayout>

namespace {

std::function<QWidget*(QWidget*)>& BloggingPageFactory() {
    static std::function<QWidget*(QWidget*)> factory;
    return factory;
}

} // namespace

void CNavigatorSettingsDlg::SetBloggingPageFactory(
    std::function<QWidget*(QWidget* parent)> factory) {
    BloggingPageFactory() = std::move(factory);
}

CNavigatorSettingsDlg::CNavigatorSettingsDlg(const NavigatorSettingsRecord* record, int firstPage,
                                             IQmBridge* bridge, QWidget* parent)
    : QDialog(parent), m_pageList(new QListWidget(this)), m_pages(new QStackedWidget(this)),
      m_generalPage(new CNavigatorGeneralSettingsDlg(this)),
      m_notesPage(new CNavigatorNotesSettingsDlg(this)) {
    setWindowTitle(LoadString(StringId::Settings));
    if (record != nullptr) {
        m_general.maxLinkedDocuments = record->maxLinkedDocuments;
        m_general.cleanDeletedOnClose = record->cleanDeletedOnClose.Value();
        m_general.launchAppOnStart = record->launchAppOnStart.Value();
        m_notes = {record->defaultFont.Value(), record->defaultFontSize,
                   record->defaultBackgroundColor.Value(), record->defaultBackgroundImage.Value()};
    }
    m_general.launchStartPanel = IsStartPanelLaunchOnStart();
    // The engine's flag says the opposite of the box.
    if (GetHarborUtilsInterface()->IsStartupBubbleEnabled() == 1)
        m_general.automaticUpdates = false;
    m_initialAutomaticUpdates = m_general.automaticUpdates;
    m_generalPage->SetOptions(m_general);
    m_notesPage->SetOptions(m_notes);

    m_pageList->setAccessibleName(QStringLiteral("Pages"));
    AddPage(StringId::GeneralPage, GeneralPage, m_generalPage);
    AddPage(StringId::NotesPage, NotesPage, m_notesPage);
    if (const auto& factory = BloggingPageFactory()) {
        if (QWidget* blogging = factory(this))
            AddPage(StringId::BloggingPage, BloggingPage, blogging);
    }
    if (bridge != nullptr) {
        m_sendToPage = new CSendToSettingsDlg(bridge, this);
        AddPage(StringId::SendToPage, SendToPage, m_sendToPage);
    }
    m_pageList->setFixedWidth(m_pageList->sizeHintForColumn(0) +
                              m_pageList->fontMetrics().averageCharWidth() * 4);
    connect(m_pageList, &QListWidget::currentRowChanged, this, &CNavigatorSettingsDlg::ShowPage);
    int firstRow = 0;
    for (int row = 0; row < m_pageList->count(); ++row) {
        if (m_pageList->item(row)->data(Qt::UserRole).toInt() == firstPage)
            firstRow = row;
    }
    m_pageList->setCurrentRow(firstRow);

    auto* buttons = new QDialogButtonBox(QDialogButtonBox::Ok | QDialogButtonBox::Cancel, this);
    connect(buttons, &QDialogButtonBox::accepted, this, &CNavigatorSettingsDlg::accept);
    connect(buttons, &QDialogButtonBox::rejected, this, &CNavigatorSettingsDlg::reject);
    auto* body = new QHBoxLayout;
    body->addWidget(m_pageList);
    body->addWidget(m_pages, 1);
    auto* layout = new QVBoxLayout(this);
    layout->addLayout(body, 1);
    layout->addWidget(buttons);
}

CNavigatorSettingsDlg::~CNavigatorSettingsDlg() = default;

void CNavigatorSettingsDlg::AddPage(int stringId, Page page, QWidget* widget) {
    auto* entry = new QListWidgetItem(LoadString(stringId), m_pageList);
    entry->setData(Qt::UserRole, static_cast<int>(page));
    m_pages->addWidget(widget);
}

void CNavigatorSettingsDlg::ShowPage(int row) {
    // Rows and pages were added together, so a row is its page's index.
    m_pages->setCurrentIndex(row >= 0 && row < m_pages->count() ? row : 0);
}

void CNavigatorSettingsDlg::accept() {
    m_general = m_generalPage->GetOptions();
    if (m_general.automaticUpdates != m_initialAutomaticUpdates) {
        GetHarborUtilsInterface()->SetStartupBubbleEnabled(!m_general.automaticUpdates);
        m_initialAutomaticUpdates = m_general.automaticUpdates;
    }
    m_notes = m_notesPage->GetOptions();
    if (Lustre::CVisualStyleManager* styles = GetVisualStyleManager()) {
        if (const QString style = m_generalPage->SelectedStyle(); !style.isEmpty())
            styles->SetCurrentStyle(style, QString::fromUtf16(Lustre::kVisualStylesKey));
    }
    if (m_sendToPage != nullptr)
        m_sendToPage->Apply();
    QDialog::accept();
}

void CNavigatorSettingsDlg::WriteBack(NavigatorSettingsRecord* record) const {
    record->maxLinkedDocuments = m_general.maxLinkedDocuments;
    record->cleanDeletedOnClose.SetValue(m_general.cleanDeletedOnClose);
    record->launchAppOnStart.SetValue(m_general.launchAppOnStart);
    record->defaultFontSize = m_notes.fontSize;
    record->defaultFont.SetValue(m_notes.font);
    record->defaultBackgroundColor.SetValue(m_notes.backgroundColor);
    record->defaultBackgroundImage.SetValue(m_notes.backgroundImage);
}

int OpenSettingsDialog(QWidget* parent, int firstPage) {
    NavigatorSettings* settings = NavigatorSettings::Instance();
    NavigatorSettingsRecord* record = settings->GetRecord();
    const bool launchedOnStart = record->launchAppOnStart.Value();
    // Declared before the dialog, so that it outlives the page that holds it.
    const ReleasePtr<IQmBridge> bridge{GetQmBridge()};
    ModalDialog modal(new CNavigatorSettingsDlg(record, firstPage, bridge.get(), parent));
    const int result = modal.Exec();
    const auto* dialog = modal.Get<CNavigatorSettingsDlg>();
    if (result != QDialog::Accepted || dialog == nullptr)
        return result;

    dialog->WriteBack(record);
    SetStartPanelLaunchOnStart(dialog->GeneralOptions().launchStartPanel);
    const bool launchOnStart = record->launchAppOnStart.Value();
    if (launchOnStart && !launchedOnStart)
        AddToRun();
    else if (!launchOnStart && launchedOnStart)
        RemoveFromRun();
    WNavDS::Instance()->SetChanged(true);
    settings->MarkDirty();
    return result;
}
