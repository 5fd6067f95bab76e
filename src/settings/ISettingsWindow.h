#pragma once

// What the settings ask of the main window when a window option changes, so that the change
// shows at once. The main window implements it and hands itself to the settings.
class ISettingsWindow {
public:
    // Top-most or not, and shown, without moving or resizing it.
    virtual void SetKeepOnTop(bool onTop) = 0;
    // Shows or hides the window's frame.
    virtual void ShowFrame(bool show) = 0;
    // Shows or hides the message centre bar.
    virtual void ShowMessageCentre(bool show) = 0;

protected:
    ~ISettingsWindow() = default;
};
