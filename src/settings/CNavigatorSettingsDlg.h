#pragma once

#include "settings/CNavigatorGeneralSettingsDlg.h"
#include "settings/CNavigatorNotesSettingsDlg.h"

#include <QDialog>

#include <functional>

class CSendToSettingsDlg;
class IQmBridge;
class NavigatorSettingsRecord;
class QListWidget;
class QStackedWidget;

// The settings dialog: a list of pages on the left, the chosen page on the right. It works on
// copies of the options; OK hands the options that live elsewhere (automatic updates, visual
// style, send-to choice) to their owners, and the caller copies the rest back.
class CNavigatorSettingsDlg final : public QDialog {
    Q_OBJECT
public:
    // The pages by their place in the list; Blogging and Send to are there only when they exist.
    enum Page { GeneralPage = 0, NotesPage = 1, BloggingPage = 2, SendToPage = 3 };

    // The copies come from the record (the pages' defaults without one) and the start panel's
    // own choice. With a bridge the Send to page reads its choice from it; the bridge must
    // outlive the dialog. A first page that is not there shows General.
    CNavigatorSettingsDlg(const NavigatorSettingsRecord* record, int firstPage, IQmBridge* bridge,
                          QWidget* parent = nullptr);
    ~CNavigatorSettingsDlg() override;

    // The Blogging page is made by whoever offers blogging; without a factory, or when it makes
    // no page, the page and its list entry are absent. The page acts on blog accounts at once,
    // so OK and Cancel leave it alone. An empty function removes the factory.
    static void SetBloggingPageFactory(std::function<QWidget*(QWidget* parent)> factory);

    // The copies as OK left them.
    const CNavigatorGeneralSettingsDlg::Options& GeneralOptions() const { return m_general; }
    const CNavigatorNotesSettingsDlg::Options& NotesOptions() const { return m_notes; }
    // Copies them into the record.
    void WriteBack(NavigatorSettingsRecord* record) const;

    void accept() override;

private:
    void AddPage(int stringId, Page page, QWidget* widget);
    void ShowPage(int row);

    CNavigatorGeneralSettingsDlg::Options m_general;
    CNavigatorNotesSettingsDlg::Options m_notes;
    // The automatic-updates box as it started, so that only a change is handed over.
    bool m_initialAutomaticUpdates;

    QListWidget* m_pageList;
    QStackedWidget* m_pages;
    CNavigatorGeneralSettingsDlg* m_generalPage;
    CNavigatorNotesSettingsDlg* m_notesPage;
    CSendToSettingsDlg* m_sendToPage = nullptr;
};

// The "Settings" command: runs the dialog modally over parent on the given first page and, on
// OK, writes the options back, keeps the start panel's choice and the log-on start entry in
// step, refreshes the tree and marks the settings dirty. Answers the dialog's result.
int OpenSettingsDialog(QWidget* parent, int firstPage);
