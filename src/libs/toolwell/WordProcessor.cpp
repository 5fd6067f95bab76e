#include "libs/toolwell/WordProcessor.h"

#include "platform/Registry.h"

#include <QDir>
#include <QFileInfo>
#include <QStandardPaths>

const QString WordProcessor::KeyPath =
    QStringLiteral("SOFTWARE\\Brindle\\Quillmark Ambrel\\Word Processor");
const QString WordProcessor::CommandValue = QStringLiteral("Command");
const QString WordProcessor::NewDocumentSwitchValue = QStringLiteral("NewDocumentSwitch");

namespace {

// An absolute path must name an executable file; a bare name is looked up on PATH. A relative
// path with a separator would depend on the working folder and is refused.
QString ResolveProgram(const QString& command) {
    if (!command.contains(u'/'))
        return QStandardPaths::findExecutable(command);
    if (!QDir::isAbsolutePath(command))
        return {};
    const QFileInfo info(command);
    if (!info.isFile() || !info.isExecutable())
        return {};
    return QDir::cleanPath(info.absoluteFilePath());
}

std::optional<WordProcessor> Configured(const QString& command, const QString& newDocumentSwitch) {
    const QString program = ResolveProgram(command.trimmed());
    if (program.isEmpty())
        return std::nullopt;
    WordProcessor processor;
    processor.program = program;
    if (!newDocumentSwitch.isEmpty())
        processor.newDocumentArguments = QStringList{newDocumentSwitch};
    return processor;
}

} // namespace

std::optional<WordProcessor> WordProcessor::Find() {
    using Platform::Registry;
    const QString userCommand = Registry::UserValue(KeyPath, CommandValue).toString();
    if (!userCommand.trimmed().isEmpty())
        return Configured(userCommand,
                          Registry::UserValue(KeyPath, NewDocumentSwitchValue).toString());
    const QString machineCommand = Registry::MachineValue(KeyPath, CommandValue).toString();
    if (!machineCommand.trimmed().isEmpty())
        return Configured(machineCommand,
                          Registry::MachineValue(KeyPath, NewDocumentSwitchValue).toString());

    const QString writer = QStringLiteral("--writer");
    if (const QString program = QStandardPaths::findExecutable(QStringLiteral("lowriter"));
        !program.isEmpty())
        return WordProcessor{program, {writer}};
    if (const QString program = QStandardPaths::findExecutable(QStringLiteral("libreoffice"));
        !program.isEmpty())
        return WordProcessor{program, {writer}};
    return std::nullopt;
}
