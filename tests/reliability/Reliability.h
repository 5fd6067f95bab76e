#pragma once

#include <QString>

// The reliability checks run short with every other test and long from scripts/reliability.sh;
// each reports its figures in one line.
namespace Reliability {

// Whether the long form was asked for (AMBREL_RELIABILITY=long).
bool LongForm();
// The short form's count, or the long form's.
int Rounds(int shortForm, int longForm);
// Prints one line of figures and appends it to the file named by AMBREL_RELIABILITY_REPORT,
// which scripts/reliability.sh prints at the end.
void Report(const QString& line);
// A copy of the built navigator in a folder of its own below home, so that it finds none of the
// companion programs beside it and starts none of them; answers its path.
QString LoneNavigatorCopy(const QString& home);

// Whether the process holds a file of the folder open other than `except`: a stopped program
// caught writing its new file.
bool HoldsOpenFileIn(qint64 pid, const QString& folder, const QString& except);
// The bus name of the note tool that has a note open; empty when none has.
QString NoteToolOnBus();

} // namespace Reliability
