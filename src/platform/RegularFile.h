#pragma once

#include <QString>

class QFile;

namespace Platform {

// Paths that arrive from outside (a drop, a command line, a linked document) may name a FIFO,
// a device or a folder: reading one could block the program for ever or fill the disk. These
// take regular files only, links resolved, and never wait for anything to open.

// Opens the regular file at path for reading; false, with file closed, for anything else.
bool OpenRegularFile(QFile& file, const QString& path);

// Copies the regular file at source to a new file target; false when the source is not a
// regular file, the target exists or the copy fails (a partial target is removed).
bool CopyRegularFile(const QString& source, const QString& target);

} // namespace Platform
