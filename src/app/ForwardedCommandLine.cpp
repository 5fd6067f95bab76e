#include "app/ForwardedCommandLine.h"

#include "app/CNavigatorCmdLineInfo.h"

#include <QDir>
#include <QFileInfo>

void RunForwardedCommandLine(const QStringList& arguments, IStartActions& actions) {
    CNavigatorCmdLineInfo info;
    ParseCommandLine(info, arguments);
    RunStartActions(info, actions);
}

QStringList MakeFileArgumentsAbsolute(const QStringList& arguments) {
    QStringList result = arguments;
    // The parser itself tells which parameter it will take for a file.
    CNavigatorCmdLineInfo parsed;
    for (qsizetype i = 1; i < result.size(); ++i) {
        const QString& argument = result.at(i);
        const bool isFlag = IsSwitchToken(argument);
        const bool isFile = !isFlag && parsed.ExpectsFile();
        parsed.ParseParam(isFlag ? argument.mid(1) : argument, isFlag, false);
        if (isFile && !argument.isEmpty() && QFileInfo(argument).isRelative())
            result[i] = QDir::current().absoluteFilePath(argument);
    }
    return result;
}
