#include "support/NavigatorProcess.h"

#include <QDateTime>
#include <QDeadlineTimer>
#include <QFile>
#include <QFileInfo>
#include <QThread>

#include <csignal>
#include <cstdio>

NavigatorProcess::NavigatorProcess(const QString& home, const QString& program)
    : m_home(home), m_program(program) {
    m_process.setProcessEnvironment(Environment());
    // The programs the navigator starts inherit its error output: a file, so that one left
    // running never holds the test runner's pipe open.
    m_process.setStandardErrorFile(ErrorFile());
}

NavigatorProcess::~NavigatorProcess() {
    if (m_process.state() != QProcess::NotRunning) {
        m_process.kill();
        m_process.waitForFinished(5000);
    }
    QFile errors(ErrorFile());
    if (errors.open(QIODevice::ReadOnly) && errors.size() > 0)
        std::fputs(errors.readAll().constData(), stderr);
}

QString NavigatorProcess::ErrorFile() const {
    return m_home + QStringLiteral("/navigator-errors.txt");
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
    m_startedAt = QDateTime::currentDateTime();
    m_process.start(m_program, arguments);
}

QString NavigatorProcess::SettingsFile() const {
    return m_home + QStringLiteral("/data/Brindle/Quillmark Ambrel/NavSettings.dat");
}

bool NavigatorProcess::WaitUntilRunning(int timeoutMs) {
    if (!m_process.waitForStarted(timeoutMs))
        return false;
    // The first idle pass writes the settings (start-up applies the window options through
    // them): once the file is newer than the start, the event loop is running.
    const QDeadlineTimer deadline(timeoutMs);
    while (!deadline.hasExpired() && m_process.state() == QProcess::Running) {
        const QFileInfo settings(SettingsFile());
        if (settings.exists() && settings.lastModified() >= m_startedAt)
            return true;
        QThread::msleep(20);
    }
    return false;
}

int NavigatorProcess::RunToEnd(const QStringList& arguments, int timeoutMs) {
    QProcess second;
    second.setProcessEnvironment(Environment());
    // Read here rather than forwarded: a start that became the navigator starts programs that
    // would otherwise hold the test runner's output open.
    second.setProcessChannelMode(QProcess::MergedChannels);
    second.start(m_program, arguments);
    const bool finished = second.waitForFinished(timeoutMs);
    if (!finished) {
        second.kill();
        second.waitForFinished();
    }
    std::fputs(second.readAll().constData(), stderr);
    if (!finished)
        return -1;
    return second.exitStatus() == QProcess::NormalExit ? second.exitCode() : -1;
}

bool NavigatorProcess::Terminate(int timeoutMs) {
    ::kill(static_cast<pid_t>(m_process.processId()), SIGTERM);
    return m_process.waitForFinished(timeoutMs);
}
