#pragma once

#include <QDBusAbstractAdaptor>
#include <QMap>
#include <QString>

class CMessageBroker;

// The broker's interface on its object: every message arrives through Post, and the item
// window hub and window requests leave through Notify.
class BrokerAdaptor final : public QDBusAbstractAdaptor {
    Q_OBJECT
    Q_CLASSINFO("D-Bus Interface", "com.brindle.QuillmarkAmbrel.Broker")
public:
    explicit BrokerAdaptor(CMessageBroker* broker);

public Q_SLOTS:
    void Post(const QString& name, const QMap<QString, QString>& properties);

Q_SIGNALS:
    // Never emitted through Qt: the broker sends it as a message, to everyone or to one peer;
    // declared here so that the interface describes it.
    void Notify(const QString& name, const QMap<QString, QString>& properties);

private:
    CMessageBroker* m_broker;
};
