#pragma once

#include <QObject>
#include <QString>

#include <array>

namespace Platform {

// The kinds of file the program writes for the user, each told about on its own.
enum class SavedFile { Catalog, Settings, Note };

// Tells the user that a file could not be written. A failing disk fails every save of a kind
// again and again (the catalog's at every idle pass), so the user hears once for each kind, and
// again only after a save of that kind has worked in between. The message box is posted to the
// event loop, never opened inside the caller: the caller may be an idle pass, and a modal's
// nested loop would run idle passes inside it.
class SaveFailureNotice {
public:
    // The single object, made on first use.
    static SaveFailureNotice& Instance();
    // Destroys the single object now, dropping posted messages; the next Instance() is fresh.
    static void DestroyInstance();

    SaveFailureNotice(const SaveFailureNotice&) = delete;
    SaveFailureNotice& operator=(const SaveFailureNotice&) = delete;

    // A save of that kind worked: its next failure is told again.
    void Saved(SavedFile kind);
    // A save of that kind failed; path names the file, reason says why (may be empty).
    void Failed(SavedFile kind, const QString& path, const QString& reason);
    // Once no dialog can open any more (the program is ending), failures and the messages
    // still waiting go to the standard error stream instead.
    void SetSilent(bool silent) { m_silent = silent; }

    // The message text for a failure, as the box shows it.
    static QString Text(SavedFile kind, const QString& path, const QString& reason);

private:
    SaveFailureNotice() = default;
    void Tell(const QString& text) const;

    // Messages posted but not yet shown go with it.
    QObject m_context;
    std::array<bool, 3> m_told{};
    bool m_silent = false;
};

} // namespace Platform
