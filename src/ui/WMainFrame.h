#pragma once

#include "settings/ISettingsWindow.h"
#include "ui/ModalDialog.h"

#include <QHash>
#include <QMainWindow>
#include <QRect>
#include <QTimer>

#include <optional>

class CCommandRouter;
class CMsgCenterDlgBar;
class CNavigatorCustomToolbar;
class QAction;
class QMenu;
class QToolBar;
class WNavigatorTree;

namespace BrindleTheming {
class ThemedToolbar;
}

// The navigator's main window: from top to bottom the main toolbar, the custom toolbar, the
// tree, the document toolbar and, where the utility engine offers it, the message centre bar.
// Every button and menu entry runs through the command router the frame owns. It applies the
// window options of the settings and, once tracking is on, writes its moves and resizes to them.
class WMainFrame final : public QMainWindow, public ISettingsWindow {
    Q_OBJECT
public:
    // The smallest client area the user can size the window to.
    static constexpr QSize kMinimumClientSize{268, 292};
    // How long the window takes to fade out when it closes, in milliseconds.
    static constexpr int kFadeDuration = 300;

    explicit WMainFrame(QWidget* parent = nullptr);
    ~WMainFrame() override;

    // Places the window by its outer rectangle, decorations included. The decorations are
    // known only once the window is shown (under a window manager, once it has framed it), so
    // the inside is fitted to the outer size again when they become known.
    void PlaceFrame(const QRect& outer);
    // With tracking on, the outer rectangle goes to the settings now and after every move or
    // resize of the normal window.
    void SetTrackPosition(bool track);
    // The frame's share of the idle pass, after the catalog has been saved: the tree follows
    // the model and every entry's enabled and checked state follows the command table.
    void OnIdleWork();
    // Starts in-place editing of the selected item's name.
    void EditSelectedLabel();

    // The start-up bubble comes after the delay, once the window is active (see
    // OnBubbleTimer).
    void StartBubbleTimer(int delayMs);
    // The bubble's time has come: it is shown now when the window is active, else when the
    // window is next activated and not minimised.
    void OnBubbleTimer();
    bool IsBubblePending() const { return m_bubblePending; }

    void SetKeepOnTop(bool onTop) override;
    void ShowFrame(bool show) override;
    void ShowMessageCentre(bool show) override;

    CCommandRouter* CommandRouter() const { return m_router; }
    WNavigatorTree* Tree() const { return m_tree; }
    BrindleTheming::ThemedToolbar* MainToolbar() const { return m_mainToolbar; }
    CNavigatorCustomToolbar* CustomToolbar() const { return m_customToolbar; }
    BrindleTheming::ThemedToolbar* DocumentToolbar() const { return m_documentToolbar; }
    // Null unless the utility engine offers the message centre.
    CMsgCenterDlgBar* MessageCentreBar() const { return m_messageCentreBar; }
    // The menu of a drop-down button by its command id, or null.
    QMenu* DropDownMenu(int commandId) const;

Q_SIGNALS:
    // The user (or the system) closes the navigator; the windows of the other programs are
    // closed next.
    void Closing();

protected:
    void changeEvent(QEvent* event) override;
    void closeEvent(QCloseEvent* event) override;
    void moveEvent(QMoveEvent* event) override;
    void resizeEvent(QResizeEvent* event) override;

private:
    enum class CloseState { Open, Fading, Closed };

    void CreateToolbars();
    void CreateMessageCentreBar();
    // The command's shared entry with its picture, as a toolbar button shows it.
    QAction* ButtonAction(int commandId);
    void AddButton(QToolBar* toolbar, int commandId);
    QMenu* AddDropDown(QToolBar* toolbar, int commandId, std::initializer_list<int> entries);
    void FillHelpMenu(QMenu* menu);
    void LayOut();
    void FinishClose();
    void ShowStartupBubble();
    void RecordPosition();
    void FitToPlacedSize();

    CCommandRouter* m_router = nullptr;
    BrindleTheming::ThemedToolbar* m_mainToolbar = nullptr;
    CNavigatorCustomToolbar* m_customToolbar = nullptr;
    BrindleTheming::ThemedToolbar* m_documentToolbar = nullptr;
    CMsgCenterDlgBar* m_messageCentreBar = nullptr;
    WNavigatorTree* m_tree = nullptr;
    QHash<int, QMenu*> m_menus;

    bool m_trackPosition = false;
    // The outer size asked for, until the decorations are known.
    std::optional<QSize> m_placedSize;
    QTimer m_bubbleTimer;
    bool m_bubblePending = false;
    CloseState m_closeState = CloseState::Open;
    // From the first close request on, no dialog opens and the open ones are ended.
    std::optional<ModalDialog::ClosingAll> m_closingAll;
};
