#include "libs/toolwell/CMessageBroker.h"

#include "libs/toolwell/AmbrelBus.h"
#include "libs/toolwell/BrokerAdaptor.h"
#include "libs/toolwell/BusForeignWindows.h"
#include "libs/toolwell/BusItemWindowHub.h"
#include "libs/toolwell/IItemWindowHub.h"
#include "libs/toolwell/IMsgEvent.h"
#include "libs/toolwell/NavigatorAdaptor.h"

#include <QDBusError>
#include <QDBusMessage>
#include <QDBusMetaType>

#include <limits>

namespace {

const QString kWindowHandleKey = QStringLiteral("openwindowhandle");

// The number at the start of the text: optional blanks and sign, then digits; 0 when none.
qint64 LeadingInteger(const QString& text) {
    qsizetype at = 0;
    while (at < text.size() && text.at(at).isSpace())
        ++at;
    bool negative = false;
    if (at < text.size() && (text.at(at) == u'-' || text.at(at) == u'+'))
        negative = text.at(at++) == u'-';
    qint64 value = 0;
    for (; at < text.size() && text.at(at) >= u'0' && text.at(at) <= u'9'; ++at) {
        if (value > (std::numeric_limits<qint64>::max() - 9) / 10)
            break;
        value = value * 10 + (text.at(at).unicode() - u'0');
    }
    return negative ? -value : value;
}

qsizetype TextBytes(const QMap<QString, QString>& properties) {
    qsizetype bytes = 0;
    for (auto pair = properties.cbegin(); pair != properties.cend(); ++pair)
        bytes += (pair.key().size() + pair.value().size()) * qsizetype(sizeof(QChar));
    return bytes;
}

} // namespace

CMessageBroker* CMessageBroker::Connect() {
    static int connections = 0;
    auto* broker = new CMessageBroker(QStringLiteral("ambrel-broker-%1").arg(++connections));
    if (!broker->m_connection.isConnected()) {
        broker->Release();
        return nullptr;
    }
    return broker;
}

IMessageBroker* GetMessageBroker() {
    return CMessageBroker::Connect();
}

CMessageBroker::CMessageBroker(const QString& connectionName)
    : m_connectionName(connectionName),
      m_connection(QDBusConnection::connectToBus(QDBusConnection::SessionBus, connectionName)) {
    qDBusRegisterMetaType<QMap<QString, QString>>();
    new BrokerAdaptor(this);
    new NavigatorAdaptor(this);
}

CMessageBroker::~CMessageBroker() {
    Disconnect();
}

void CMessageBroker::Release() {
    delete this;
}

HRESULT CMessageBroker::RegisterService(const QString& name, IPM::IMsgEvent* sink) {
    if (sink == nullptr || m_sink != nullptr || !m_connection.isConnected())
        return E_FAIL;
    const QString objectPath = AmbrelBus::ObjectPath(name);
    const QString serviceName = AmbrelBus::ServiceName(name);
    // The object first: a peer that sees the name must find the object behind it.
    if (!m_connection.registerObject(objectPath, this, QDBusConnection::ExportAdaptors))
        return E_FAIL;
    if (!m_connection.registerService(serviceName)) {
        m_connection.unregisterObject(objectPath);
        return E_FAIL;
    }
    m_sink = sink;
    m_serviceName = serviceName;
    m_objectPath = objectPath;
    m_hub =
        std::make_unique<BusItemWindowHub>(m_connection, objectPath, AmbrelBus::kBrokerInterface);
    m_windows =
        std::make_unique<BusForeignWindows>(m_connection, objectPath, AmbrelBus::kBrokerInterface);
    m_windows->SetGoneHandler(
        [sink](const QList<Platform::WindowHandle>& windows) { sink->OnWindowsGone(windows); });
    SetItemWindowHub(m_hub.get());
    Platform::SetForeignWindows(m_windows.get());
    return S_OK;
}

void CMessageBroker::Disconnect() {
    if (m_hub && GetItemWindowHub() == m_hub.get())
        SetItemWindowHub(nullptr);
    if (m_windows && &Platform::ForeignWindows() == m_windows.get())
        Platform::SetForeignWindows(nullptr);
    m_hub.reset();
    m_windows.reset();
    m_sink = nullptr;
    if (!m_serviceName.isEmpty()) {
        m_connection.unregisterService(m_serviceName);
        m_connection.unregisterObject(m_objectPath);
        m_serviceName.clear();
    }
    // The connection closes once nothing holds it any more.
    m_connection = QDBusConnection(QString());
    QDBusConnection::disconnectFromBus(m_connectionName);
}

void CMessageBroker::Post(const QString& name, QMap<QString, QString> properties) {
    if (m_sink == nullptr)
        return;
    if (properties.size() > kMaxPairs || TextBytes(properties) > kMaxBytes) {
        if (calledFromDBus())
            sendErrorReply(QDBusError::LimitsExceeded,
                           QStringLiteral("The property set is too large."));
        return;
    }
    if (const auto handle = properties.find(kWindowHandleKey); handle != properties.end()) {
        // The number is the sender's own: it becomes the navigator-wide handle of that window.
        const QString sender = calledFromDBus() ? message().service() : QString();
        *handle = QString::number(m_windows->Pair(sender, LeadingInteger(*handle)));
    }
    m_sink->OnMessage(name, properties);
}

void CMessageBroker::NewNote() {
    if (m_sink != nullptr)
        m_sink->OnNewNote();
}
