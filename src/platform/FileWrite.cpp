#include "platform/FileWrite.h"

#include <QByteArray>
#include <QFileDevice>
#include <QSaveFile>
#include <QString>

namespace Platform {

bool WriteAll(QFileDevice& file, const char* data, qint64 size) {
    const qint64 written = file.write(data, size);
    if (written == size)
        return true;
    if (written >= 0)
        file.write(data + written, size - written);
    return false;
}

bool FlushAll(QFileDevice& file) {
    if (file.flush())
        return true;
    file.flush();
    return false;
}

bool ReplaceFile(const QString& path, const QByteArray& bytes, QString* error) {
    QSaveFile file(path);
    if (!file.open(QIODevice::WriteOnly)) {
        *error = file.errorString();
        return false;
    }
    // A small file stays in the write buffer until the flush; commit would not see that write
    // fail and would put a cut file in place of the old one.
    if (!WriteAll(file, bytes.constData(), bytes.size()) || !FlushAll(file)) {
        *error = file.errorString();
        file.cancelWriting();
        return false;
    }
    if (!file.commit()) {
        *error = file.errorString();
        return false;
    }
    return true;
}

} // namespace Platform
