#include "platform/RegularFile.h"

#include <QByteArray>
#include <QDir>
#include <QFile>
#include <QFileInfo>
#include <QRegularExpression>

#include <cerrno>
#include <cstdlib>
#include <functional>

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

namespace Platform {

namespace {

// Writes a new file's content to its descriptor; false when a write fails.
using Filler = std::function<bool(int fd)>;

bool WriteAll(int fd, const char* at, qsizetype left) {
    while (left > 0) {
        const ssize_t written = ::write(fd, at, static_cast<size_t>(left));
        if (written < 0 && errno == EINTR)
            continue;
        if (written <= 0)
            return false;
        at += written;
        left -= written;
    }
    return true;
}

bool Fill(int fd, const Filler& fill) {
    return fill(fd) && ::fdatasync(fd) == 0;
}

WholeFileResult LinkResult(bool linked, int error) {
    if (linked)
        return WholeFileResult::Created;
    return error == EEXIST ? WholeFileResult::NameTaken : WholeFileResult::Failed;
}

// Where the folder's file system has no unnamed files: a hidden named one, linked to its name
// and then removed. Only a crash between its creation and its removal leaves it behind.
WholeFileResult CreateThroughNamedFile(const QByteArray& folder, const QByteArray& target,
                                       const Filler& fill) {
    QByteArray temporary = folder + "/.ambrel-new-XXXXXX";
    const int fd = ::mkostemp(temporary.data(), O_CLOEXEC);
    if (fd < 0)
        return WholeFileResult::Failed;
    const bool written = Fill(fd, fill);
    ::close(fd);
    const bool linked = written && ::link(temporary.constData(), target.constData()) == 0;
    const int error = written && !linked ? errno : 0;
    ::unlink(temporary.constData());
    return LinkResult(linked, error);
}

// An unnamed file in the target's folder, given its name by linking it in once complete: the
// link fails when the name exists, and a crash before it leaves nothing at all.
WholeFileResult CreateWhole(const QString& path, const Filler& fill) {
    const QFileInfo info(path);
    const QByteArray folder = QFile::encodeName(info.absolutePath());
    const QByteArray target = QFile::encodeName(info.absoluteFilePath());
    // Without /proc an unnamed file cannot be given a name.
    if (::access("/proc/self/fd", F_OK) != 0)
        return CreateThroughNamedFile(folder, target, fill);
    const int fd = ::open(folder.constData(), O_TMPFILE | O_WRONLY | O_CLOEXEC, 0666);
    if (fd < 0) {
        if (errno != EOPNOTSUPP && errno != EISDIR && errno != EINVAL)
            return WholeFileResult::Failed;
        return CreateThroughNamedFile(folder, target, fill);
    }
    if (!Fill(fd, fill)) {
        ::close(fd);
        return WholeFileResult::Failed;
    }
    const QByteArray self = "/proc/self/fd/" + QByteArray::number(fd);
    const bool linked =
        ::linkat(AT_FDCWD, self.constData(), AT_FDCWD, target.constData(), AT_SYMLINK_FOLLOW) == 0;
    const int error = errno;
    ::close(fd);
    return LinkResult(linked, error);
}

} // namespace

bool OpenRegularFile(QFile& file, const QString& path) {
    file.close();
    // Without O_NONBLOCK opening a FIFO would wait for a writer.
    const int fd = ::open(QFile::encodeName(path).constData(), O_RDONLY | O_NONBLOCK | O_CLOEXEC);
    if (fd < 0)
        return false;
    struct stat status {};
    if (::fstat(fd, &status) != 0 || !S_ISREG(status.st_mode) ||
        !file.open(fd, QIODevice::ReadOnly, QFileDevice::AutoCloseHandle)) {
        ::close(fd);
        return false;
    }
    return true;
}

bool CopyRegularFile(const QString& source, const QString& target) {
    QFile in;
    if (!OpenRegularFile(in, source))
        return false;
    // A copy cut off by a crash would later pass for the whole one: it appears only complete.
    return CreateWhole(target, [&in](int fd) {
               constexpr qint64 kChunk = 1 << 16;
               while (!in.atEnd()) {
                   const QByteArray chunk = in.read(kChunk);
                   if (chunk.isEmpty() || !WriteAll(fd, chunk.constData(), chunk.size()))
                       return false;
               }
               return in.error() == QFileDevice::NoError;
           }) == WholeFileResult::Created;
}

WholeFileResult CreateFileWhole(const QString& path, const QByteArray& bytes) {
    return CreateWhole(path,
                       [&bytes](int fd) { return WriteAll(fd, bytes.constData(), bytes.size()); });
}

void RemoveLeftSaveFiles(const QString& path) {
    const QFileInfo info(path);
    const QRegularExpression left(QRegularExpression::anchoredPattern(
        QRegularExpression::escape(info.fileName()) + QStringLiteral("\\.[A-Za-z0-9]{6}")));
    const QDir folder = info.absoluteDir();
    for (const QString& name : folder.entryList(QDir::Files | QDir::Hidden | QDir::NoSymLinks)) {
        if (left.match(name).hasMatch())
            QFile::remove(folder.filePath(name));
    }
}

} // namespace Platform
