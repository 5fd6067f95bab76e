#pragma once

#include <QDBusConnection>
#include <QDBusMessage>
#include <QList>
#include <QMap>
#include <QObject>
#include <QString>

#include <functional>
#include <utility>

// Runs the event loop until done() holds or the time is up; answers done().
bool WaitForEvents(const std::function<bool()>& done, int timeoutMs = 5000);

// The navigator's broker as a companion program meets it, on a bus connection of its own:
// records what is posted (activation reports apart, since the window manager sends them
// whenever it likes) and sends notifications. Leaves the bus when destroyed.
class FakeNavigatorBroker final : public QObject {
    Q_OBJECT
    Q_CLASSINFO("D-Bus Interface", "com.brindle.QuillmarkAmbrel.Broker")
public:
    using Properties = QMap<QString, QString>;
    using Message = std::pair<QString, Properties>;

    FakeNavigatorBroker();
    ~FakeNavigatorBroker() override;

    // Leaves the bus as a navigator that ends or crashes does.
    void Leave();
    // A hub notification to everyone, or a window command to one program (its unique name).
    void Notify(const QString& destination, const QString& name, const Properties& properties);
    // Waits for the n-th post (one-based) and answers it; empty when it never came.
    Message Posted(qsizetype n);

    bool registered = false;
    QList<Message> posted;
    QList<Message> activations;
    QDBusConnection bus;

public Q_SLOTS:
    void Post(const QString& name, const QMap<QString, QString>& properties);
};
