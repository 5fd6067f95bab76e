#pragma once

#include <QtGlobal>

class QByteArray;
class QFileDevice;
class QString;

namespace Platform {

// Writing that keeps the system's reason when it fails. A write cut short by a full disk or a
// file size limit leaves no reason in the file's errorString(), so the rest is tried once more:
// that attempt fails at once, with the reason.

// Writes all size bytes; false when they could not all be written.
bool WriteAll(QFileDevice& file, const char* data, qint64 size);
// Writes out what the file still buffers: commit and close would not see that write fail.
bool FlushAll(QFileDevice& file);
// Puts bytes in the place of the file at path, whole or not at all (written aside and renamed
// over it); false with the system's reason in error.
bool ReplaceFile(const QString& path, const QByteArray& bytes, QString* error);

} // namespace Platform
