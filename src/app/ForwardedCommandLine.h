#pragma once

#include <QStringList>

class IStartActions;

// The command line that a second start hands to the running navigator travels as its list of
// arguments, the program first.

// Parses handed-over arguments with a fresh command-line info and runs their start actions.
void RunForwardedCommandLine(const QStringList& arguments, IStartActions& actions);

// The arguments (the program first) with every file argument made absolute against the current
// folder, whether or not the file exists: the running navigator has a folder of its own, and a
// relative path would name another file there.
QStringList MakeFileArgumentsAbsolute(const QStringList& arguments);
