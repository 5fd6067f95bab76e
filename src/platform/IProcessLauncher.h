#pragma once

#include <QString>
#include <QStringList>

namespace Platform {

// Starts another program of the product, detached, with an argument list.
class IProcessLauncher {
public:
    virtual ~IProcessLauncher() = default;
    virtual bool StartDetached(const QString& program, const QStringList& arguments) = 0;
};

// The launcher in use: the real one unless a test put another in its place (null restores it).
IProcessLauncher& ProcessLauncher();
void SetProcessLauncher(IProcessLauncher* launcher);

} // namespace Platform
