#include "platform/ScreenMetrics.h"

#include <QGuiApplication>
#include <QScreen>

namespace Platform {

QRect VirtualScreenRect() {
    if (qobject_cast<QGuiApplication*>(QCoreApplication::instance()) == nullptr)
        return {};
    QRect all;
    for (const QScreen* screen : QGuiApplication::screens())
        all = all.united(screen->geometry());
    return all;
}

} // namespace Platform
