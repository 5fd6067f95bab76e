#pragma once

#include <QDateTime>
#include <QProcess>
#include <QString>
#include <QStringList>

// The built navigator program, run offscreen with its data, settings and runtime folders in a
// test's temporary home.
class NavigatorProcess {
public:
    // program: the navigator to run; the built one unless told otherwise.
    explicit NavigatorProcess(const QString& home,
                              const QString& program = QStringLiteral(AMBREL_NAVIGATOR_PATH));
    ~NavigatorProcess();

    void Start(const QStringList& arguments = {});
    // Waits until the program has started up and is running its event loop.
    bool WaitUntilRunning(int timeoutMs = 15000);
    // Sends SIGTERM; answers whether the program then ended by itself within the time.
    bool Terminate(int timeoutMs = 10000);

    // Runs another start of the program with this one's environment to its end; answers its
    // exit code, or -1 when it crashed or did not end in time.
    int RunToEnd(const QStringList& arguments, int timeoutMs = 20000);

    QString SettingsFile() const;
    QProcess& Process() { return m_process; }
    QProcessEnvironment Environment() const;

private:
    QString ErrorFile() const;

    QString m_home;
    QString m_program;
    QProcess m_process;
    QDateTime m_startedAt;
};
