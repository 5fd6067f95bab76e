#include "platform/FileWrite.h"

#include <QFileDevice>

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

} // namespace Platform
