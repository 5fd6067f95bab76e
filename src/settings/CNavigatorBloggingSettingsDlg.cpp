#include "settings/CNavigatorBloggingSettingsDlg.h"

#include "common/StringTable.h"
#include "libs/postwick/IPostwick.h"
#include "navigator/WNavDS.h"
#include "platform/IMessageBox.h"
#include "ui/CBmpButton.h"

#include <QApplication>
#include <QDesktopServices>
#include <QHBoxLayout>
#include <QLabel>
#include <QListWidget>
#include <QStyle>
#include <QUrl>
#include <QVBoxLayout>

using namespace Qt::StringLiterals;

namespace {

constexpr int kFirstButton = 1092;
// The account name behind an entry, whose text may carry the default marker.
constexpr int kNameRole = Qt::UserRole;

struct ButtonInfo {
    int tip;
    const char* iconName;
    QStyle::StandardPixmap fallback;
};
const ButtonInfo kButtons[] = {
    {StringId::SetDefaultBlogAccountTip, "emblem-default", QStyle::SP_DialogApplyButton},
    {StringId::ViewBlogTip, "internet-web-browser", QStyle::SP_DirLinkIcon},
    {StringId::AddBlogAccountTip, "list-add", QStyle::SP_FileDialogNewFolder},
    {StringId::RemoveBlogAccountTip, "list-remove", QStyle::SP_TrashIcon},
    {StringId::EditBlogAccountTip, "document-properties", QStyle::SP_FileDialogDetailedView},
};

QImage ButtonImage(const ButtonInfo& info, const QWidget* widget) {
    QIcon icon = QIcon::fromTheme(QLatin1StringView(info.iconName));
    if (icon.isNull())
        icon = widget->style()->standardIcon(info.fallback, nullptr, widget);
    return icon.pixmap(16, 16).toImage();
}

} // namespace

CNavigatorBloggingSettingsDlg::CNavigatorBloggingSettingsDlg(IBlogAccountManager* accounts,
                                                             QWidget* parent)
    : QWidget(parent), m_accounts(accounts) {
    auto* caption = new QLabel(u"Blog &Accounts:"_s, this);
    m_list = new QListWidget(this);
    m_list->setAccessibleName(u"Blog Accounts"_s);
    m_list->setSortingEnabled(true);
    caption->setBuddy(m_list);

    auto* buttonRow = new QHBoxLayout;
    void (CNavigatorBloggingSettingsDlg::*const actions[])() = {
        &CNavigatorBloggingSettingsDlg::SetDefault, &CNavigatorBloggingSettingsDlg::ViewBlog,
        &CNavigatorBloggingSettingsDlg::Add, &CNavigatorBloggingSettingsDlg::Remove,
        &CNavigatorBloggingSettingsDlg::Edit};
    for (int i = 0; i < 5; ++i) {
        const QString tip = LoadString(kButtons[i].tip);
        m_buttons[i] = new CBmpButton(tip, this);
        m_buttons[i]->setToolTip(tip);
        m_buttons[i]->SetBitmap(ButtonImage(kButtons[i], this));
        m_buttons[i]->setFixedSize(28, 26);
        connect(m_buttons[i], &QPushButton::clicked, this, actions[i]);
        buttonRow->addWidget(m_buttons[i]);
    }
    buttonRow->addStretch();

    auto* supported = new QLabel(
        u"Only blogs that offer the MetaWeblog XML-RPC interface are supported."_s, this);
    supported->setWordWrap(true);
    m_passwords = new QLabel(accounts->PasswordStorageDescription(), this);
    m_passwords->setWordWrap(true);
    m_passwords->setObjectName(u"passwordStorage"_s);

    auto* layout = new QVBoxLayout(this);
    layout->addWidget(caption);
    layout->addWidget(m_list, 1);
    layout->addLayout(buttonRow);
    layout->addWidget(supported);
    layout->addWidget(m_passwords);

    connect(m_list, &QListWidget::itemDoubleClicked, this, &CNavigatorBloggingSettingsDlg::Edit);
    Fill();
}

CBmpButton* CNavigatorBloggingSettingsDlg::Button(int controlId) const {
    const int index = controlId - kFirstButton;
    return index >= 0 && index < 5 ? m_buttons[index] : nullptr;
}

void CNavigatorBloggingSettingsDlg::Fill() {
    m_list->clear();
    Postwick::AccountProperties account;
    for (int more = m_accounts->GetFirstAccount(&account); more == 0;
         more = m_accounts->GetNextAccount(&account)) {
        auto* item = new QListWidgetItem(account.value(Postwick::kAccountName), m_list);
        item->setData(kNameRole, account.value(Postwick::kAccountName));
    }
    MarkDefault();
}

void CNavigatorBloggingSettingsDlg::MarkDefault() {
    Postwick::AccountProperties account;
    const QString defaultName = m_accounts->GetDefaultAccount(&account) == S_OK
                                    ? account.value(Postwick::kAccountName)
                                    : QString();
    for (int row = 0; row < m_list->count(); ++row) {
        QListWidgetItem* item = m_list->item(row);
        const QString name = item->data(kNameRole).toString();
        const bool isDefault = !defaultName.isEmpty() && name == defaultName;
        item->setText(isDefault ? name + LoadString(StringId::DefaultBlogAccountSuffix) : name);
        if (isDefault)
            m_list->setCurrentItem(item);
    }
    UpdateButtons();
}

void CNavigatorBloggingSettingsDlg::UpdateButtons() {
    const bool any = m_list->count() > 0;
    for (int i = 0; i < 5; ++i)
        m_buttons[i]->setEnabled(i == 2 || any);
}

QString CNavigatorBloggingSettingsDlg::SelectedName() const {
    const QListWidgetItem* item = m_list->currentItem();
    return item != nullptr ? item->data(kNameRole).toString() : QString();
}

void CNavigatorBloggingSettingsDlg::SetDefault() {
    if (const QString name = SelectedName();
        !name.isEmpty() && m_accounts->SetDefaultAccount(name) == S_OK)
        MarkDefault();
}

void CNavigatorBloggingSettingsDlg::ViewBlog() {
    Postwick::AccountProperties account;
    if (SelectedName().isEmpty() || m_accounts->GetAccountDetails(SelectedName(), &account) != S_OK)
        return;
    const QUrl address(account.value(Postwick::kAccountBlogHost));
    if (address.scheme() == u"https"_s || address.scheme() == u"http"_s)
        QDesktopServices::openUrl(address);
}

void CNavigatorBloggingSettingsDlg::Add() {
    QString name;
    UnicodeStringPtr sink(&name);
    if (m_accounts->AddAccount(1, &sink) != S_OK || name.isEmpty())
        return;
    Postwick::AccountProperties current;
    if (m_accounts->GetDefaultAccount(&current) != S_OK)
        m_accounts->SetDefaultAccount(name);
    auto* item = new QListWidgetItem(name, m_list);
    item->setData(kNameRole, name);
    MarkDefault();
    m_list->setCurrentItem(item);
}

void CNavigatorBloggingSettingsDlg::Remove() {
    const QString name = SelectedName();
    if (name.isEmpty())
        return;
    const int answer = Platform::MessageBox().Show(
        FormatString(StringId::DeleteBlogAccountQuestion, name),
        LoadString(StringId::DeleteBlogAccountCaption),
        Platform::MessageBoxStyle::YesNo | Platform::MessageBoxStyle::IconWarning);
    if (answer != Platform::MessageBoxAnswer::Yes || m_accounts->RemoveAccount(name) != S_OK)
        return;
    delete m_list->currentItem();
    MarkDefault();
}

void CNavigatorBloggingSettingsDlg::Edit() {
    const QString name = SelectedName();
    if (name.isEmpty() || m_accounts->EditAccount(name) != S_OK)
        return;
    // The name may have changed.
    Fill();
}

QWidget* CreateBloggingSettingsPage(QWidget* parent) {
    IPostwick* blog = WNavDS::Instance()->GetBlogService();
    IBlogAccountManager* accounts = blog != nullptr ? blog->GetAccountManager() : nullptr;
    return accounts != nullptr ? new CNavigatorBloggingSettingsDlg(accounts, parent) : nullptr;
}
