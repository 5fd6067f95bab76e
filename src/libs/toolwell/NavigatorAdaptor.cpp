#include "libs/toolwell/NavigatorAdaptor.h"

#include "libs/toolwell/CMessageBroker.h"

NavigatorAdaptor::NavigatorAdaptor(CMessageBroker* broker)
    : QDBusAbstractAdaptor(broker), m_broker(broker) {}

void NavigatorAdaptor::NewNote() {
    m_broker->NewNote();
}
