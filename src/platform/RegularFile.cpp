#include "platform/RegularFile.h"

#include <QByteArray>
#include <QFile>
#include <QFileInfo>

#include <cerrno>
#include <cstdlib>

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

namespace Platform {

namespace {

bool WriteAll(int fd, const QByteArray& bytes) {
    const char* at = bytes.constData();
    qsizetype left = bytes.size();
    while (left > 0) {
        const ssize_t written = ::write(fd, at, static_cast<size_t>(left));
        if (written < 0 && errno == EINTR)
            continue;
        if (written <= 0)
            return false;
        at += written;
        left -= written;
    }
    return ::fdatasync(fd) == 0;
}

WholeFileResult LinkResult(bool linked, int error) {
    if (linked)
        return WholeFileResult::Created;
    return error == EEXIST ? WholeFileResult::NameTaken : WholeFileResult::Failed;
}

// Where the folder's file system has no unnamed files: a hidden named one, linked to its name
// and then removed. Only a crash between its creation and its removal leaves it behind.
WholeFileResult CreateThroughNamedFile(const QByteArray& folder, const QByteArray& target,
                                       const QByteArray& bytes) {
    QByteArray temporary = folder + "/.ambrel-new-XXXXXX";
    const int fd = ::mkostemp(temporary.data(), O_CLOEXEC);
    if (fd < 0)
        return WholeFileResult::Failed;
    const bool written = WriteAll(fd, bytes);
    ::close(fd);
    const bool linked = written && ::link(temporary.constData(), target.constData()) == 0;
    const int error = written && !linked ? errno : 0;
    ::unlink(temporary.constData());
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
    QFile out(target);
    if (!out.open(QIODevice::WriteOnly | QIODevice::NewOnly))
        return false;
    constexpr qint64 kChunk = 1 << 16;
    QByteArray chunk;
    bool ok = true;
    while (ok && !in.atEnd()) {
        chunk = in.read(kChunk);
        ok = !chunk.isEmpty() && out.write(chunk) == chunk.size();
    }
    ok = ok && out.flush();
    out.close();
    if (!ok)
        QFile::remove(target);
    return ok;
}

WholeFileResult CreateFileWhole(const QString& path, const QByteArray& bytes) {
    const QFileInfo info(path);
    const QByteArray folder = QFile::encodeName(info.absolutePath());
    const QByteArray target = QFile::encodeName(info.absoluteFilePath());
    // An unnamed file in the same folder, given its name by linking it in: the link fails
    // when the name exists, and a crash before it leaves nothing at all.
    const int fd = ::open(folder.constData(), O_TMPFILE | O_WRONLY | O_CLOEXEC, 0666);
    if (fd < 0) {
        if (errno != EOPNOTSUPP && errno != EISDIR && errno != EINVAL)
            return WholeFileResult::Failed;
        return CreateThroughNamedFile(folder, target, bytes);
    }
    if (!WriteAll(fd, bytes)) {
        ::close(fd);
        return WholeFileResult::Failed;
    }
    const QByteArray self = "/proc/self/fd/" + QByteArray::number(fd);
    const bool linked =
        ::linkat(AT_FDCWD, self.constData(), AT_FDCWD, target.constData(), AT_SYMLINK_FOLLOW) == 0;
    const int error = errno;
    ::close(fd);
    // Without /proc the unnamed file cannot be named.
    if (!linked && error == ENOENT && ::access("/proc/self/fd", F_OK) != 0)
        return CreateThroughNamedFile(folder, target, bytes);
    return LinkResult(linked, error);
}

} // namespace Platform
