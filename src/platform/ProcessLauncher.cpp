#include "platform/IProcessLauncher.h"

#include <QFileInfo>
#include <QProcess>

namespace Platform {

namespace {

class DetachedProcessLauncher final : public IProcessLauncher {
public:
    bool StartDetached(const QString& program, const QStringList& arguments) override {
        // A missing program is a failed start, not a silent success.
        if (program.contains(u'/') && !QFileInfo(program).isExecutable())
            return false;
        return QProcess::startDetached(program, arguments);
    }
};

IProcessLauncher* g_launcher = nullptr;

} // namespace

IProcessLauncher& ProcessLauncher() {
    static DetachedProcessLauncher real;
    return g_launcher != nullptr ? *g_launcher : real;
}

void SetProcessLauncher(IProcessLauncher* launcher) {
    g_launcher = launcher;
}

} // namespace Platform
