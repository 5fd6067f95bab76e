#include "startpanel/StartPanelActions.h"

#include "platform/IProcessLauncher.h"

#include <QFileInfo>

StartPanelActions::StartPanelActions(QString programFolder, Poster post)
    : m_programFolder(std::move(programFolder)), m_post(std::move(post)) {}

bool StartPanelActions::NewNote() {
    return StartNavigator(QStringLiteral("/NewNote"));
}

bool StartPanelActions::SnapshotToNewNote() {
    return StartNavigator(QStringLiteral("/SnapShotToNewNote"));
}

bool StartPanelActions::OpenItem(const QString& itemId) {
    if (itemId.isEmpty())
        return false;
    return m_post(QStringLiteral("OpenItemByItemID"), {{QStringLiteral("itemid"), itemId}});
}

bool StartPanelActions::OpenDocument(const QString& path) {
    if (path.isEmpty())
        return false;
    // The navigator takes only absolute paths.
    return m_post(QStringLiteral("RequestViewerFromFile"),
                  {{QStringLiteral("filename"), QFileInfo(path).absoluteFilePath()}});
}

bool StartPanelActions::StartNavigator(const QString& switchName) {
    return Platform::ProcessLauncher().StartDetached(
        m_programFolder + QStringLiteral("/ambrel-navigator"), {switchName});
}
