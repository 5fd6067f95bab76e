#pragma once

#include <QMap>
#include <QString>
#include <QStringList>

// What of a note file goes to a blog: the HTML inside its body (not the note's own head and
// style sheet) and the pictures that sit beside the note and that the body shows.
class CNoteForBlog final {
public:
    // Notes larger than this are not read.
    static constexpr qint64 kMaxNoteSize = 16 * 1024 * 1024;

    // False when the file cannot be read.
    bool Load(const QString& notePath);

    const QString& Body() const { return m_body; }
    // The picture files (whole paths), each once, in the order the body shows them.
    const QStringList& Pictures() const { return m_pictures; }
    // The body with each picture's source replaced by its address on the blog (keyed by the
    // picture's whole path); pictures without an address keep their source.
    QString BodyWithAddresses(const QMap<QString, QString>& addresses) const;

private:
    QString m_folder;
    QString m_body;
    QStringList m_pictures;
};
