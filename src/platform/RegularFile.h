#pragma once

#include <QString>

class QByteArray;
class QFile;

namespace Platform {

// Paths that arrive from outside (a drop, a command line, a linked document) may name a FIFO,
// a device or a folder: reading one could block the program for ever or fill the disk. These
// take regular files only, links resolved, and never wait for anything to open.

// Opens the regular file at path for reading; false, with file closed, for anything else.
bool OpenRegularFile(QFile& file, const QString& path);

// Copies the regular file at source to a new file target; false when the source is not a
// regular file, the target exists or the copy fails. The copy appears under target only when
// complete, as CreateFileWhole makes its file.
bool CopyRegularFile(const QString& source, const QString& target);

// What CreateFileWhole did.
enum class WholeFileResult { Created, NameTaken, Failed };

// Makes a new file at path holding exactly bytes. The name appears only once the file is
// complete, so a crash or a failed write leaves no file, nor a cut-off one, under it. An
// existing entry of that name (a dangling link too) is never written over nor followed.
WholeFileResult CreateFileWhole(const QString& path, const QByteArray& bytes);

// Removes what a save of the file at path left when the program was killed between writing
// the new file under a temporary name ("<name>.XXXXXX" beside it) and renaming it over the
// old one. Only for a file that one process alone saves, before it saves again.
void RemoveLeftSaveFiles(const QString& path);

} // namespace Platform
