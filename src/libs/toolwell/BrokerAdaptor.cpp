#include "libs/toolwell/BrokerAdaptor.h"

#include "libs/toolwell/CMessageBroker.h"

BrokerAdaptor::BrokerAdaptor(CMessageBroker* broker)
    : QDBusAbstractAdaptor(broker), m_broker(broker) {}

void BrokerAdaptor::Post(const QString& name, const QMap<QString, QString>& properties) {
    m_broker->Post(name, properties);
}
