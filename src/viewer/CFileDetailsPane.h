#pragma once

#include <QString>
#include <QWidget>

class QLabel;
class QPushButton;

// A document the viewer cannot draw itself: its name, size and dates, and the ways to see it
// elsewhere (the desktop's default program for the file, or the word processor).
class CFileDetailsPane : public QWidget {
    Q_OBJECT
public:
    explicit CFileDetailsPane(QWidget* parent = nullptr);

    void ShowFile(const QString& path);
    QString FilePath() const { return m_path; }

    // The texts shown, for whoever needs to read them back: name, size, created, modified.
    QString NameText() const;
    QString SizeText() const;
    QString CreatedText() const;
    QString ModifiedText() const;

Q_SIGNALS:
    void SendToWordProcessorRequested();

private:
    void OpenWithDefaultProgram();

    QString m_path;
    QLabel* m_name;
    QLabel* m_size;
    QLabel* m_created;
    QLabel* m_modified;
};
