#include "messaging/ActivityCenter.h"

#include "platform/IProcessLauncher.h"
#include "platform/Registry.h"

#include <QFileInfo>

QString GetActivityCenterPath() {
    const QVariant value = Platform::Registry::MachineValue(
        QStringLiteral("SOFTWARE\\Brindle\\AppLauncher"), QStringLiteral("Activity Center"));
    return value.typeId() == QMetaType::QString ? value.toString() : QString();
}

bool IsActivityCenterInstalled() {
    const QString path = GetActivityCenterPath();
    return !path.isEmpty() && QFileInfo::exists(path);
}

void LaunchActivityCenter(bool atStart) {
    if (!IsActivityCenterInstalled())
        return;
    QStringList arguments;
    if (atStart)
        arguments << QStringLiteral("/p");
    Platform::ProcessLauncher().StartDetached(GetActivityCenterPath(), arguments);
}
