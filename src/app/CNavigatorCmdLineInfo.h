#pragma once

#include <QString>
#include <QStringList>

class IStartActions;

// The start actions that a command line asks for. The application parses its own command line
// into one at start-up and runs the actions once the navigator is up; a command line handed
// over by a second start gets a fresh one that runs at once.
class CNavigatorCmdLineInfo {
public:
    // Takes one command-line token; flags come without their leading "-" or "/".
    void ParseParam(const QString& param, bool isFlag, bool isLast);

    bool NewNote() const { return m_newNote; }
    bool NewNoteFromFile() const { return m_newNoteFromFile; }
    bool OpenDocument() const { return m_openDocument; }
    bool ViewDocument() const { return m_viewDocument; }
    bool Qmo() const { return m_qmo; }
    bool SnapshotToNewNote() const { return m_snapshotToNewNote; }
    bool OpenRecentItem() const { return m_openRecentItem; }
    bool ExpectsRecentItem() const { return m_expectsRecentItem; }
    bool HasAction() const { return m_hasAction; }
    // The next plain parameter is the file of "NewNoteFromFile" or "ViewDocument".
    bool ExpectsFile() const { return m_expectsFile; }
    const QString& FileArgument() const { return m_fileArgument; }
    const QString& RecentItem() const { return m_recentItem; }

    // "dQMO" is acted on by start-up alone, which clears it afterwards.
    void ClearQmo() { m_qmo = false; }

private:
    friend void RunStartActions(CNavigatorCmdLineInfo& info, IStartActions& actions);

    bool m_newNote = false;
    bool m_newNoteFromFile = false;
    bool m_openDocument = false;
    bool m_viewDocument = false;
    bool m_qmo = false;
    bool m_snapshotToNewNote = false;
    QString m_fileArgument;
    bool m_hasAction = false;
    bool m_expectsFile = false;
    bool m_openRecentItem = false;
    // Stays set once the item argument was taken: it marks that one is present.
    bool m_expectsRecentItem = false;
    QString m_recentItem;
};

// Whether a command-line token is a switch. A token beginning with "-" always is; one beginning
// with "/" only when the rest is one of the navigator's switch names, because on this system
// "/" also begins every absolute path.
bool IsSwitchToken(const QString& token);

// Feeds the tokens after the first (the program) to ParseParam, switches without their first
// character, the final token marked as the last.
void ParseCommandLine(CNavigatorCmdLineInfo& info, const QStringList& arguments);

// Runs the pending start actions in their fixed order and clears them, so that running them
// again does nothing. "dQMO" is left to start-up.
void RunStartActions(CNavigatorCmdLineInfo& info, IStartActions& actions);
