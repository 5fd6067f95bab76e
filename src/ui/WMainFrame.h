#pragma once

#include "settings/ISettingsWindow.h"

#include <QMainWindow>

// The navigator's main window. It applies the window options of the settings and, once
// tracking is on, writes its moves and resizes to them.
class WMainFrame final : public QMainWindow, public ISettingsWindow {
    Q_OBJECT
public:
    explicit WMainFrame(QWidget* parent = nullptr);
    ~WMainFrame() override;

    void SetTrackPosition(bool track) { m_trackPosition = track; }
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

    bool m_trackPosition = false;
};
