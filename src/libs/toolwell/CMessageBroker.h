#pragma once

#include "libs/toolwell/IMessageBroker.h"

#include <QDBusConnection>
#include <QDBusContext>
#include <QMap>
#include <QObject>
#include <QString>

#include <memory>

class BusForeignWindows;
class BusItemWindowHub;

// The message broker on the session bus. A service "X" is the bus name
// "com.brindle.QuillmarkAmbrel.X" with the object "/X"; while it is registered, the broker is
// also the item window hub and the way to the other programs' windows. Only the session bus of
// the same user reaches it: that is the bus's own policy.
class CMessageBroker final : public QObject, protected QDBusContext, public IMessageBroker {
    Q_OBJECT
public:
    // A set with more pairs or more text than this is refused whole.
    static constexpr qsizetype kMaxPairs = 1000;
    static constexpr qsizetype kMaxBytes = 1024 * 1024;

    // A broker on its own connection to the session bus, or null when there is none.
    static CMessageBroker* Connect();

    HRESULT RegisterService(const QString& name, IPM::IMsgEvent* sink) override;
    void Disconnect() override;
    void Release() override;

    // What the bus interfaces receive.
    void Post(const QString& name, QMap<QString, QString> properties);
    void NewNote();

private:
    explicit CMessageBroker(const QString& connectionName);
    ~CMessageBroker() override;

    QString m_connectionName;
    QDBusConnection m_connection;
    QString m_serviceName;
    QString m_objectPath;
    IPM::IMsgEvent* m_sink = nullptr;
    std::unique_ptr<BusForeignWindows> m_windows;
    std::unique_ptr<BusItemWindowHub> m_hub;
};
