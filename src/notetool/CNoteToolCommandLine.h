#pragma once

#include <QMap>
#include <QString>
#include <QStringList>

// The note tool's command line: the path of the note file, then optionally "/PROPERTY" and
// the item's catalog properties as pipe-delimited text.
class CNoteToolCommandLine {
public:
    // arguments: without the program's own name.
    explicit CNoteToolCommandLine(const QStringList& arguments);

    const QString& NotePath() const { return m_notePath; }
    const QMap<QString, QString>& Properties() const { return m_properties; }

private:
    QString m_notePath;
    QMap<QString, QString> m_properties;
};
