#include "app/ForwardedCommandLine.h"

#include "app/CNavigatorCmdLineInfo.h"

#include <QDir>
#include <QFileInfo>

#include <algorithm>

namespace {

constexpr QChar kQuote = u'"';

bool IsBlank(QChar c) {
    return c.isSpace();
}

} // namespace

QStringList SplitForwardedCommandLine(const QString& text) {
    QStringList tokens;
    qsizetype position = 0;
    while (position < text.size()) {
        const bool quotedStart = text[position] == kQuote;
        bool quoting = false;
        qsizetype end = position;
        while (end < text.size() && (quoting || !IsBlank(text[end]))) {
            if (text[end] == kQuote)
                quoting = !quoting;
            ++end;
        }
        QString token = text.mid(position, end - position);
        if (quotedStart) {
            token.remove(0, 1);
            // The quote that closes the opening one goes too; later quotes stay.
            const qsizetype closing = token.indexOf(kQuote);
            if (closing >= 0)
                token.remove(closing, 1);
        }
        tokens.append(token);
        position = end + 1;
    }
    return tokens;
}

QString JoinForwardedCommandLine(const QStringList& arguments) {
    QStringList parts;
    parts.reserve(arguments.size());
    for (const QString& argument : arguments) {
        if (argument.contains(kQuote))
            return {};
        if (argument.isEmpty() || std::any_of(argument.begin(), argument.end(), IsBlank))
            parts.append(kQuote + argument + kQuote);
        else
            parts.append(argument);
    }
    return parts.join(u' ');
}

void RunForwardedCommandLine(const QString& text, IStartActions& actions) {
    CNavigatorCmdLineInfo info;
    ParseCommandLine(info, SplitForwardedCommandLine(text));
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
