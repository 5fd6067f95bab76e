#pragma once

#include <QString>
#include <QStringList>

#include <optional>

// The word processor that the bridge hands documents to, and how it is started.
//
// The user may name one in the registry stand-in, key
//   "SOFTWARE\Brindle\Quillmark Ambrel\Word Processor"
// with the values "Command" (an absolute program path, or a program name looked up on PATH)
// and, optionally, "NewDocumentSwitch" (the one argument that makes it start with a new
// document; without it the program is started with no argument). The current user's values
// come first, then the machine's. Without a configured command the office suite's Writer is
// used when installed, "lowriter" or else "libreoffice"; both start a new text document with
// "--writer".
struct WordProcessor {
    static const QString KeyPath;
    static const QString CommandValue;
    static const QString NewDocumentSwitchValue;

    // The word processor to use now; none when nothing is configured or installed, and none
    // when the configured command cannot be found (another program is never run in its place).
    static std::optional<WordProcessor> Find();

    // Absolute path of the program; the files to open are its arguments.
    QString program;
    // Arguments that start it with a new, empty document.
    QStringList newDocumentArguments;
};
