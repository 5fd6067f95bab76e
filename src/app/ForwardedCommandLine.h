#pragma once

#include <QString>
#include <QStringList>

class IStartActions;

// The command line that a second start hands to the running navigator travels as one text.

// Splits such a text into tokens. Blanks outside double quotes end a token and exactly one
// character after a token is skipped, so two blanks in a row give an empty token. The quotes
// around a token that begins with one are dropped; quotes inside a token stay.
QStringList SplitForwardedCommandLine(const QString& text);

// The text for a list of arguments (the program first) that splits back into the same list:
// arguments holding blanks, and empty ones, go in double quotes. Answers a null string when an
// argument holds a double quote, which the text cannot carry.
QString JoinForwardedCommandLine(const QStringList& arguments);

// Parses a handed-over text with a fresh command-line info and runs its start actions at once.
void RunForwardedCommandLine(const QString& text, IStartActions& actions);

// The arguments (the program first) with every file argument made absolute against the current
// folder, whether or not the file exists: the running navigator has a folder of its own, and a
// relative path would name another file there.
QStringList MakeFileArgumentsAbsolute(const QStringList& arguments);
