#pragma once

#include "support/RecordingForeignWindows.h"
#include "support/RecordingItemWindowHub.h"
#include "support/RecordingMessageBox.h"
#include "support/RecordingProcessLauncher.h"

#include <QByteArray>
#include <QString>

// What every fuzz target stands on: a private temporary home (data, configuration and runtime
// folders) made once, an offscreen application object, and the program's singletons put back
// to their first state after each input so that no input sees what an earlier one left.
namespace FuzzEnvironment {

enum class Application { Core, Gui };

// Once, from LLVMFuzzerInitialize.
void SetUp(int* argc, char*** argv, Application application);

QString Home();
// "$XDG_DATA_HOME/Brindle/Quillmark Ambrel".
QString AppDataFolder();
// Removes the program's data folder and everything in it.
void RemoveAppData();
// Puts every process-wide singleton of the program back to its first state, the machine's
// registry file still in the temporary home.
void ResetProgram();

QByteArray ReadFile(const QString& path);
// Writes the file, making its folder; false when it cannot be written.
bool WriteFile(const QString& path, const QByteArray& bytes);

// While it lives, programs started, message boxes, foreign windows and item windows only go
// on record: an input never starts a program or waits for an answer.
class RecordingPlatform {
public:
    RecordingPlatform();
    ~RecordingPlatform();
    RecordingPlatform(const RecordingPlatform&) = delete;
    RecordingPlatform& operator=(const RecordingPlatform&) = delete;

private:
    RecordingProcessLauncher m_launcher;
    RecordingMessageBox m_messages;
    RecordingForeignWindows m_windows;
    RecordingItemWindowHub m_hub;
};

// A property that must hold for every input: otherwise the input is reported and the run ends
// as a finding.
void Require(bool condition, const char* what);

} // namespace FuzzEnvironment
