#pragma once

#include <QMap>
#include <QString>

#include <functional>

// What the start panel's buttons do: messages to the running navigator, or a start of the
// navigator program with a switch (which a running navigator takes over).
class StartPanelActions {
public:
    using Properties = QMap<QString, QString>;
    using Poster = std::function<bool(const QString& name, const Properties& properties)>;

    // programFolder: where the navigator program lies (the panel's own folder).
    StartPanelActions(QString programFolder, Poster post);

    bool NewNote();
    bool SnapshotToNewNote();
    bool OpenItem(const QString& itemId);
    bool OpenDocument(const QString& path);

private:
    bool StartNavigator(const QString& switchName);

    QString m_programFolder;
    Poster m_post;
};
