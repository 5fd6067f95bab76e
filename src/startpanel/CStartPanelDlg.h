#pragma once

#include <QDialog>
#include <QPointer>

class QCheckBox;
class QFileDialog;
class QLabel;
class QVBoxLayout;
class StartPanelActions;

// The start panel's window: large buttons for a new note, a document and a snapshot, the
// recently used notes and documents (read again each time the window is activated), and the
// choice of starting the panel with the navigator.
class CStartPanelDlg final : public QDialog {
    Q_OBJECT
public:
    static constexpr int RecentCount = 10;

    explicit CStartPanelDlg(StartPanelActions& actions, QWidget* parent = nullptr);

    // Rebuilds the recent list from the stored item links.
    void RefreshRecentItems();
    // Brings the window to the front, shown normally.
    void BringToFront();
    // A window command of the navigator for this program's window `handle`; the panel's one
    // window is its window 0.
    void ApplyWindowCommand(qint64 handle, const QString& command, int showCommand);

protected:
    bool event(QEvent* event) override;

private:
    void ChooseDocument();

    StartPanelActions& m_actions;
    QVBoxLayout* m_recentLayout = nullptr;
    QLabel* m_noRecentItems = nullptr;
    QCheckBox* m_launchOnStart = nullptr;
    QPointer<QFileDialog> m_fileDialog;
};
