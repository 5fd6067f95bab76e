#pragma once

#include <QString>

// Names under which the navigator and the product's other programs meet on the session bus.
namespace AmbrelBus {

inline QString ServiceName(const QString& service) {
    return QStringLiteral("com.brindle.QuillmarkAmbrel.") + service;
}
inline QString ObjectPath(const QString& service) {
    return u'/' + service;
}
inline const QString kBrokerInterface = QStringLiteral("com.brindle.QuillmarkAmbrel.Broker");
inline const QString kNavigatorInterface = QStringLiteral("com.brindle.QuillmarkAmbrel.Navigator");
// The name the start panel owns while it runs.
inline const QString kStartPanelName = QStringLiteral("com.brindle.QuillmarkAmbrel.StartPanel");
inline const QString kNotify = QStringLiteral("Notify");
inline const QString kWindowCommand = QStringLiteral("WindowCommand");

} // namespace AmbrelBus
