#pragma once

#include <QLoggingCategory>
#include <QObject>

#include <functional>

// Runs the application's idle work when the event loop is about to wait and nothing else is
// left to do. The handler gets the number of passes since the last event; answering true asks
// for one more pass with the next count. After the handler answers false nothing runs until
// the next event arrives, so an idle program never spins.
//
// QT_LOGGING_RULES="ambrel.idle.debug=true" writes how long each pass took to the error output,
// one line "idle pass <count>: <milliseconds> ms" per pass: a long pass is time in which the
// window does not answer.
Q_DECLARE_LOGGING_CATEGORY(lcIdlePass)

class IdlePass final : public QObject {
    Q_OBJECT
public:
    using Handler = std::function<bool(int count)>;

    explicit IdlePass(Handler handler, QObject* parent = nullptr);
    ~IdlePass() override;

    // Starts watching the current thread's event loop; the first pass comes once it is idle.
    void Start();
    int PassesRun() const { return m_passesRun; }

protected:
    bool eventFilter(QObject* watched, QEvent* event) override;

private:
    void OnAboutToBlock();

    Handler m_handler;
    bool m_armed = true;
    bool m_eventSinceLastLook = true;
    bool m_inPass = false;
    int m_count = 0;
    int m_passesRun = 0;
};
