#include "support/FakeNavigatorBroker.h"

#include <QDBusMetaType>
#include <QElapsedTimer>
#include <QEventLoop>
#include <QTimer>

namespace {

const QString kConnection = QStringLiteral("fake-navigator");
const QString kService = QStringLiteral("com.brindle.QuillmarkAmbrel.AmbrelService");
const QString kPath = QStringLiteral("/AmbrelService");
const QString kBroker = QStringLiteral("com.brindle.QuillmarkAmbrel.Broker");

} // namespace

bool WaitForEvents(const std::function<bool()>& done, int timeoutMs) {
    QElapsedTimer clock;
    clock.start();
    while (!done() && clock.elapsed() < timeoutMs) {
        QEventLoop loop;
        QTimer::singleShot(10, &loop, &QEventLoop::quit);
        loop.exec();
    }
    return done();
}

FakeNavigatorBroker::FakeNavigatorBroker()
    : bus(QDBusConnection::connectToBus(QDBusConnection::SessionBus, kConnection)) {
    // The slot's map type must be known to the bus before the object is exported.
    qDBusRegisterMetaType<QMap<QString, QString>>();
    bus.registerObject(kPath, this, QDBusConnection::ExportAllSlots);
    registered = bus.registerService(kService);
}

FakeNavigatorBroker::~FakeNavigatorBroker() {
    Leave();
}

void FakeNavigatorBroker::Leave() {
    if (!bus.isConnected())
        return;
    bus.unregisterService(kService);
    bus.unregisterObject(kPath);
    bus = QDBusConnection(QString());
    QDBusConnection::disconnectFromBus(kConnection);
}

void FakeNavigatorBroker::Notify(const QString& destination, const QString& name,
                                 const Properties& properties) {
    QDBusMessage signal = destination.isEmpty()
                              ? QDBusMessage::createSignal(kPath, kBroker, QStringLiteral("Notify"))
                              : QDBusMessage::createTargetedSignal(destination, kPath, kBroker,
                                                                   QStringLiteral("Notify"));
    signal << name << QVariant::fromValue(properties);
    bus.send(signal);
}

FakeNavigatorBroker::Message FakeNavigatorBroker::Posted(qsizetype n) {
    WaitForEvents([&] { return posted.size() >= n; });
    return posted.size() >= n ? posted.at(n - 1) : Message();
}

void FakeNavigatorBroker::Post(const QString& name, const QMap<QString, QString>& properties) {
    (name == u"EventNotification" ? activations : posted).append({name, properties});
}
