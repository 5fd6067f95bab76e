#pragma once

#include <QDBusAbstractAdaptor>

class CMessageBroker;

// The navigator's own requests on the broker's object.
class NavigatorAdaptor final : public QDBusAbstractAdaptor {
    Q_OBJECT
    Q_CLASSINFO("D-Bus Interface", "com.brindle.QuillmarkAmbrel.Navigator")
public:
    explicit NavigatorAdaptor(CMessageBroker* broker);

public Q_SLOTS:
    void NewNote();

private:
    CMessageBroker* m_broker;
};
