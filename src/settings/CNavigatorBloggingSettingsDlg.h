#pragma once

#include <QWidget>

class CBmpButton;
class IBlogAccountManager;
class QLabel;
class QListWidget;

// The Blogging page of the settings: the blog accounts, the default one marked, and buttons
// to make an account the default, view its blog, add, remove and edit accounts. Changes go to
// the blogging library at once; the page has nothing to write back on OK.
class CNavigatorBloggingSettingsDlg final : public QWidget {
    Q_OBJECT
public:
    CNavigatorBloggingSettingsDlg(IBlogAccountManager* accounts, QWidget* parent = nullptr);

    QListWidget* AccountList() const { return m_list; }
    // The buttons by their control ids 1092 to 1096.
    CBmpButton* Button(int controlId) const;

private:
    void Fill();
    // Marks the default account's entry and selects it.
    void MarkDefault();
    void UpdateButtons();
    // The account name of the selected entry; empty without a selection.
    QString SelectedName() const;

    void SetDefault();
    void ViewBlog();
    void Add();
    void Remove();
    void Edit();

    IBlogAccountManager* m_accounts;
    QListWidget* m_list;
    CBmpButton* m_buttons[5];
    QLabel* m_passwords;
};

// The Blogging page over the blogging library of the navigator's data source; null when there
// is no account manager.
QWidget* CreateBloggingSettingsPage(QWidget* parent);
