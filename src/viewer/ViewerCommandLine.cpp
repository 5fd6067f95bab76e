#include "viewer/ViewerCommandLine.h"

#include "libs/toolwell/ItemIdentifier.h"

namespace {

enum class Switch { None, Open, Id };

Switch SwitchOf(const QString& argument) {
    if (!argument.startsWith(u'/') && !argument.startsWith(u'-'))
        return Switch::None;
    const QStringView name = QStringView(argument).mid(1);
    if (name.compare(u"o", Qt::CaseInsensitive) == 0)
        return Switch::Open;
    if (name.startsWith(u"id:", Qt::CaseInsensitive))
        return Switch::Id;
    return Switch::None;
}

} // namespace

ViewerCommandLine ViewerCommandLine::Parse(const QStringList& arguments) {
    ViewerCommandLine line;
    for (qsizetype i = 0; i < arguments.size(); ++i) {
        const QString& argument = arguments.at(i);
        switch (SwitchOf(argument)) {
        case Switch::Open:
            line.m_openSwitch = true;
            // A file name may itself start with "/": only one of the viewer's switches ends "/o".
            if (i + 1 < arguments.size() && SwitchOf(arguments.at(i + 1)) == Switch::None)
                line.m_file = arguments.at(++i);
            break;
        case Switch::Id:
            line.m_itemId = argument.mid(4);
            break;
        case Switch::None:
            line.m_problem = QStringLiteral("unknown argument: ") + argument;
            return line;
        }
    }
    if (line.m_itemId.isEmpty())
        line.m_problem = QStringLiteral("missing /id:<item id>");
    else if (!IsItemIdentifier(line.m_itemId))
        line.m_problem = QStringLiteral("not an item identifier: ") + line.m_itemId;
    return line;
}
