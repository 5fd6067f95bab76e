#pragma once

#include "common/Result.h"

#include <QString>

namespace IPM {
class IMsgEvent;
}

// Delivers the messages that the product's other programs post to a service of the navigator.
class IMessageBroker {
public:
    // Makes the service reachable and hands its messages to the sink (which must outlive the
    // registration); E_FAIL when the service cannot be offered.
    virtual HRESULT RegisterService(const QString& name, IPM::IMsgEvent* sink) = 0;
    // Stops delivering and leaves the bus; the object stays until Release.
    virtual void Disconnect() = 0;
    virtual void Release() = 0;

protected:
    virtual ~IMessageBroker() = default;
};

// A new broker on the session bus (one reference for the caller), or null when there is no
// session bus or another process already offers the navigator's service there.
IMessageBroker* GetMessageBroker();
