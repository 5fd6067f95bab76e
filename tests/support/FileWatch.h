#pragma once

#include <QFile>
#include <QString>

#include <fcntl.h>
#include <sys/stat.h>

// Tells whether a file was written after the watch began. The file is back-dated first, so a
// write shows whatever the clock's resolution, and its inode is kept, so a replacement shows
// even when it carries the old time.
class FileWatch {
public:
    explicit FileWatch(const QString& path) : m_path(QFile::encodeName(path)) {
        const timespec times[2] = {{kBackDated, 0}, {kBackDated, 0}};
        struct stat info {};
        m_valid = utimensat(AT_FDCWD, m_path.constData(), times, 0) == 0 &&
                  stat(m_path.constData(), &info) == 0;
        m_inode = info.st_ino;
    }

    bool Untouched() const {
        struct stat now {};
        return m_valid && stat(m_path.constData(), &now) == 0 && now.st_ino == m_inode &&
               now.st_mtim.tv_sec == kBackDated && now.st_mtim.tv_nsec == 0;
    }

private:
    static constexpr time_t kBackDated = 1000000000;

    QByteArray m_path;
    ino_t m_inode = 0;
    bool m_valid = false;
};
