#pragma once

#include "platform/IForeignWindows.h"

#include <QList>
#include <QMap>
#include <QString>

namespace IPM {

// The sink of a service of the message broker. Every call arrives on the main thread.
class IMsgEvent {
public:
    // A message posted to the service; the properties are the pairs the sender posted, except
    // that a reported "openwindowhandle" is replaced by the handle under which the navigator
    // knows that window (see Platform::IForeignWindows).
    virtual void OnMessage(const QString& name, const QMap<QString, QString>& properties) = 0;
    // Another program asked for a new note.
    virtual void OnNewNote() = 0;
    // The program that owned these windows has left: they are closed.
    virtual void OnWindowsGone(const QList<Platform::WindowHandle>& windows) = 0;
    virtual ~IMsgEvent() = default;
};

} // namespace IPM
