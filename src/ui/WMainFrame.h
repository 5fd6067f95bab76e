#pragma once

#include "settings/ISettingsWindow.h"

#include <QMainWindow>
#include <QRect>

#include <optional>

// The navigator's main window. It applies the window options of the settings and, once
// tracking is on, writes its moves and resizes to them.
class WMainFrame final : public QMainWindow, public ISettingsWindow {
    Q_OBJECT
public:
    explicit WMainFrame(QWidget* parent = nullptr);
    ~WMainFrame() override;

    // Places the window by its outer rectangle, decorations included. The decorations are
    // known only once the window is shown (under a window manager, once it has framed it), so
    // the inside is fitted to the outer size again when they become known.
    void PlaceFrame(const QRect& outer);
    // With tracking on, the outer rectangle goes to the settings now and after every move or
    // resize of the normal window.
    void SetTrackPosition(bool track);
    // The frame's share of the idle pass, after the catalog has been saved.
    void OnIdleWork();

    void SetKeepOnTop(bool onTop) override;
    void ShowFrame(bool show) override;
    void ShowMessageCentre(bool show) override;

Q_SIGNALS:
    // The user (or the system) closes the navigator; the windows of the other programs are
    // closed next.
    void Closing();

protected:
    void closeEvent(QCloseEvent* event) override;
    void moveEvent(QMoveEvent* event) override;
    void resizeEvent(QResizeEvent* event) override;

private:
    void RecordPosition();
    void FitToPlacedSize();

    bool m_trackPosition = false;
    // The outer size asked for, until the decorations are known.
    std::optional<QSize> m_placedSize;
};
