#pragma once

#include <QRect>
#include <QString>

// The start-up bubble: a one-time desktop notification telling the user that the navigator is
// running and where its window is. It is shown on the first run only: once a notification
// service took it, the user's "ShowStartupBubble" value under "SOFTWARE\Brindle\Quillmark
// Ambrel" is set to false (missing means true); without a notification service nothing is
// shown and the hint waits for the next run.
class StartupBubble {
public:
    static constexpr int DefaultDelay = 120000;

    // How long after start-up the bubble comes, in milliseconds: the machine's
    // "BubbleStartupDelay" under "Software\Brindle\Quillmark Ambrel", else DefaultDelay.
    static int Delay();

    static bool IsEnabled();
    static void SetEnabled(bool enabled);

    // Sends the notification to the session bus's notification service. False (and nothing
    // sent) when there is no session bus or no such service on it.
    static bool Show(const QRect& navigatorRect);

    static QString Summary();
    // The text that says where the window is, on the screen that holds the window's middle.
    static QString Body(const QRect& navigatorRect);
};
