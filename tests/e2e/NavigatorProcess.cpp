#include "NavigatorProcess.h"

#include <QThread>

#include <csignal>

NavigatorProcess::NavigatorProcess(const QString& home) : m_home(home) {
    m_process.setProcessEnvironment(Environment());
    m_process.setProcessChannelMode(QProcess::ForwardedErrorChannel);
}

NavigatorProcess::~NavigatorProcess() {
    if (m_process.state() != QProcess::NotRunning) {
        m_process.kill();
        m_process.waitForFinished(5000);
    }
}

QProcessEnvironment NavigatorProcess::Environment() const {
    QProcessEnvironment environment = QProcessEnvironment::systemEnvironment();
    environment.insert(QStringLiteral("HOME"), m_home);
    environment.insert(QStringLiteral("XDG_DATA_HOME"), m_home + QStringLiteral("/data"));
    environment.insert(QStringLiteral("XDG_CONFIG_HOME"), m_home + QStringLiteral("/config"));
    environment.insert(QStringLiteral("XDG_RUNTIME_DIR"), m_home + QStringLiteral("/runtime"));
    environment.insert(QStringLiteral("QT_QPA_PLATFORM"), QStringLiteral("offscreen"));
    return environment;
}

void NavigatorProcess::Start(const QStringList& arguments) {
    m_process.start(QStringLiteral(AMBREL_NAVIGATOR_PATH), arguments);
}

bool NavigatorProcess::WaitUntilRunning(int timeoutMs) {
    if (!m_process.waitForStarted(timeoutMs))
        return false;
    // The program shows no sign of life on its own yet; give it time to reach its event loop.
    QThread::msleep(1500);
    return m_process.state() == QProcess::Running;
}

bool NavigatorProcess::Terminate(int timeoutMs) {
    ::kill(static_cast<pid_t>(m_process.processId()), SIGTERM);
    return m_process.waitForFinished(timeoutMs);
}
