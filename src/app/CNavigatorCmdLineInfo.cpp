#include "app/CNavigatorCmdLineInfo.h"

#include "app/IStartActions.h"

#include <array>
#include <utility>

namespace {

const std::array<QLatin1StringView, 7> kSwitchNames = {
    QLatin1StringView("NewNote"),      QLatin1StringView("NewNoteFromFile"),
    QLatin1StringView("OpenDocument"), QLatin1StringView("ViewDocument"),
    QLatin1StringView("dQMO"),         QLatin1StringView("SnapShotToNewNote"),
    QLatin1StringView("OpenMRUItem")};

bool Is(const QString& param, QLatin1StringView name) {
    return param.compare(name, Qt::CaseInsensitive) == 0;
}

} // namespace

void CNavigatorCmdLineInfo::ParseParam(const QString& param, bool isFlag, bool isLast) {
    if (isFlag) {
        m_expectsFile = false;
        if (Is(param, kSwitchNames[0])) {
            m_newNote = true;
        } else if (Is(param, kSwitchNames[1])) {
            m_newNoteFromFile = true;
            m_expectsFile = true;
        } else if (Is(param, kSwitchNames[2])) {
            m_openDocument = true;
        } else if (Is(param, kSwitchNames[3])) {
            m_viewDocument = true;
            m_expectsFile = true;
        } else if (Is(param, kSwitchNames[4])) {
            m_qmo = true;
        } else if (Is(param, kSwitchNames[5])) {
            m_snapshotToNewNote = true;
        } else if (Is(param, kSwitchNames[6])) {
            m_openRecentItem = true;
            m_expectsRecentItem = true;
        }
    } else {
        if (m_expectsFile) {
            m_fileArgument = param;
            m_expectsFile = false;
        }
        if (m_expectsRecentItem)
            m_recentItem = param;
    }

    if (isLast) {
        if (m_fileArgument.isEmpty()) {
            m_newNoteFromFile = false;
            m_viewDocument = false;
        }
        if (m_recentItem.isEmpty())
            m_expectsRecentItem = false;
        m_hasAction = m_newNote || m_newNoteFromFile || m_openDocument || m_viewDocument || m_qmo ||
                      m_snapshotToNewNote || m_expectsRecentItem;
    }
}

bool IsSwitchToken(const QString& token) {
    if (token.startsWith(u'-'))
        return true;
    if (!token.startsWith(u'/'))
        return false;
    const QString name = token.mid(1);
    for (QLatin1StringView switchName : kSwitchNames) {
        if (Is(name, switchName))
            return true;
    }
    return false;
}

void ParseCommandLine(CNavigatorCmdLineInfo& info, const QStringList& arguments) {
    for (qsizetype i = 1; i < arguments.size(); ++i) {
        const QString& token = arguments[i];
        const bool isFlag = IsSwitchToken(token);
        info.ParseParam(isFlag ? token.mid(1) : token, isFlag, i == arguments.size() - 1);
    }
}

void RunStartActions(CNavigatorCmdLineInfo& info, IStartActions& actions) {
    if (info.m_newNote) {
        info.m_newNote = false;
        actions.NewNote();
    }
    if (info.m_openDocument) {
        info.m_openDocument = false;
        actions.OpenDocument();
    }
    if (info.m_viewDocument) {
        const QString path = std::exchange(info.m_fileArgument, QString());
        info.m_viewDocument = false;
        actions.ViewDocument(path);
    }
    if (info.m_newNoteFromFile) {
        const QString path = std::exchange(info.m_fileArgument, QString());
        info.m_newNoteFromFile = false;
        actions.NewNoteFromFile(path);
    }
    if (info.m_snapshotToNewNote) {
        info.m_snapshotToNewNote = false;
        actions.SnapshotToNewNote();
    }
    if (info.m_openRecentItem) {
        const QString identifier = std::exchange(info.m_recentItem, QString());
        info.m_openRecentItem = false;
        actions.OpenRecentItem(identifier);
    }
}
