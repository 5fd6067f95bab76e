#include "platform/RegularFile.h"

#include <QFile>

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

namespace Platform {

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

} // namespace Platform
