#pragma once

#include <QDesktopServices>
#include <QList>
#include <QObject>
#include <QUrl>

// While it lives, takes every file and web address the program opens, instead of the desktop.
class RecordingUrlHandler final : public QObject {
    Q_OBJECT
public:
    RecordingUrlHandler() {
        for (const char* scheme : kSchemes)
            QDesktopServices::setUrlHandler(QString::fromLatin1(scheme), this, "Open");
    }
    ~RecordingUrlHandler() override {
        for (const char* scheme : kSchemes)
            QDesktopServices::unsetUrlHandler(QString::fromLatin1(scheme));
    }

    QList<QUrl> opened;

public Q_SLOTS:
    void Open(const QUrl& url) { opened.append(url); }

private:
    static constexpr const char* kSchemes[] = {"file", "http", "https", "ftp"};
};
