#include "app/SingleInstance.h"

#include "app/ForwardedCommandLine.h"
#include "platform/SessionNames.h"
#include "platform/SharedMemoryClient.h"

#include <QDeadlineTimer>
#include <QThread>

namespace {

constexpr QLatin1StringView kNamePrefix("AmbrelNavigator-1.0.0.521");
// Between two looks at the lock and the socket while another start holds the lock.
constexpr unsigned long kRetryPauseMs = 50;

QString FileNameSafe(QString part) {
    return part.replace(u'%', QStringLiteral("%25")).replace(u'/', QStringLiteral("%2F"));
}

} // namespace

QString SingleInstance::InstanceName(const QString& desktop, const QString& user) {
    QString name = kNamePrefix;
    if (!desktop.isEmpty())
        name += u'-' + FileNameSafe(desktop);
    if (!user.isEmpty())
        name += u'-' + FileNameSafe(user);
    return name;
}

QString SingleInstance::InstanceName() {
    return InstanceName(Platform::DesktopName(), Platform::UserName());
}

SingleInstance::SingleInstance(const QString& name) : m_name(name) {}

SingleInstance::~SingleInstance() {
    // The socket goes before the lock, so that no start finds the lock free and the socket
    // still there.
    m_channel.Close();
    m_mutex.Release();
}

SingleInstance::Outcome SingleInstance::Start(const QStringList& arguments,
                                              std::chrono::milliseconds patience) {
    if (!m_mutex.Create(m_name))
        return Outcome::Unavailable;
    const QDeadlineTimer deadline(patience);
    for (;;) {
        const bool owned = m_mutex.Wait(std::chrono::milliseconds(0));
        SharedMemoryClient client;
        switch (client.Connect(m_name, deadline)) {
        case SharedMemoryClient::Connection::Connected: {
            // The running navigator takes the lock to shut down; it must not wait for us.
            m_mutex.Release();
            switch (client.Exchange(arguments, deadline)) {
            case SharedMemoryClient::Answer::Done:
                return Outcome::HandedOver;
            case SharedMemoryClient::Answer::Refused:
            case SharedMemoryClient::Answer::TooLarge:
                return Outcome::NotCarried;
            case SharedMemoryClient::Answer::NoAnswer:
                return Outcome::NoAnswer;
            case SharedMemoryClient::Answer::Dropped:
                break; // it ended or is ending: look again
            }
            break;
        }
        case SharedMemoryClient::Connection::NoListener:
            if (owned) {
                if (m_channel.Listen(m_name))
                    return Outcome::Running;
                m_mutex.Release();
                return Outcome::Unavailable;
            }
            break; // the lock's owner is about to listen, or to end
        case SharedMemoryClient::Connection::Busy:
            break;
        case SharedMemoryClient::Connection::Unavailable:
            m_mutex.Release();
            return Outcome::Unavailable;
        }
        m_mutex.Release();
        if (deadline.hasExpired())
            return Outcome::NoAnswer;
        QThread::msleep(kRetryPauseMs);
    }
}

void SingleInstance::Publish(std::function<void()> arrived) {
    m_channel.Publish([this, arrived = std::move(arrived)](const QStringList& arguments) {
        m_handedOver.append(arguments);
        if (arrived)
            arrived();
    });
}

void SingleInstance::RunHandedOver(IStartActions& actions) {
    // Taken off first: an action may let more come in while it runs.
    while (!m_handedOver.isEmpty())
        RunForwardedCommandLine(m_handedOver.takeFirst(), actions);
}

void SingleInstance::EndStartup() {
    m_mutex.Release();
}

void SingleInstance::Withdraw() {
    // Other starts hold the lock only for a moment, never while they wait for an answer.
    m_mutex.Wait(kPatience);
    m_channel.Close();
}

QString SingleInstance::Describe(Outcome outcome) {
    switch (outcome) {
    case Outcome::Running:
    case Outcome::HandedOver:
        break;
    case Outcome::NotCarried:
        return QStringLiteral("The running navigator did not take the command line (it is too "
                              "long).");
    case Outcome::NoAnswer:
        return QStringLiteral("A navigator is running but did not answer within %1 seconds.")
            .arg(kPatience.count() / 1000);
    case Outcome::Unavailable:
        return QStringLiteral("Cannot reach or set up the running navigator's socket (the "
                              "runtime folder is missing, not private, or its path too long).");
    }
    return {};
}
