#pragma once

#include "notetool/CNoteFile.h"
#include "notetool/NoteContent.h"

#include <QMap>
#include <QObject>
#include <QString>
#include <QTimer>

#include <memory>

class CompanionBus;
class CNoteWindow;
class QPrinter;

// One note tool process: loads the note, shows it in its window, saves it, tells the
// navigator what happens to it and follows the navigator's requests. While the note is open
// this program owns the note's own bus name, where a second start for the same note finds it.
class CNoteToolApp final : public QObject {
    Q_OBJECT
    Q_CLASSINFO("D-Bus Interface", "com.brindle.QuillmarkAmbrel.NoteTool")
public:
    // The number of the program's one window in the messages it sends.
    static constexpr qint64 kWindowNumber = 1;
    // A note left changed is saved after this long.
    static constexpr int kAutoSaveMs = 30000;

    CNoteToolApp(CompanionBus* bus, const QString& notePath,
                 const QMap<QString, QString>& properties, QObject* parent = nullptr);
    ~CNoteToolApp() override;

    // The bus name owned while the note of this file is open.
    static QString BusName(const QString& notePath);

    // Takes the note's bus name, loads the note and shows its window. False when another
    // note tool has this note open: that one is brought forward instead.
    bool Start();
    CNoteWindow* Window() const { return m_window.get(); }
    CNoteFile::State FileState() const { return m_fileState; }
    bool IsChanged() const;
public Q_SLOTS:
    // What the note's bus name offers: bring the window forward, rename the note, save it,
    // close it.
    Q_SCRIPTABLE void Activate();
    Q_SCRIPTABLE void SetTitle(const QString& title);
    // Writes the note when it can be written; tells the navigator its title and the time.
    Q_SCRIPTABLE bool Save();
    Q_SCRIPTABLE void Close();

Q_SIGNALS:
    // The window has closed and the navigator has been told: the program may end.
    void Closed();

private:
    void ApplyProperties(const QMap<QString, QString>& properties, bool fromNavigator);
    void Post(const QString& name, QMap<QString, QString> properties);
    void OnChanged();
    void OnCloseRequested(bool* allowed);
    void OnHubNotified(const QString& name, const QMap<QString, QString>& properties);
    void OnWindowCommand(qint64 handle, const QString& command, int showCommand);
    void Print();

    CompanionBus* m_bus;
    CNoteFile m_file;
    QString m_itemId;
    QMap<QString, QString> m_startProperties;
    NoteContent m_content;
    CNoteFile::State m_fileState = CNoteFile::State::New;
    std::unique_ptr<CNoteWindow> m_window;
    std::unique_ptr<QPrinter> m_printer;
    QTimer m_autoSave;
    bool m_headerChanged = false;
    bool m_closed = false;
};
