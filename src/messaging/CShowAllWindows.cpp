#include "messaging/CShowAllWindows.h"

namespace {

int ShowCommandOf(const QString& commandType) {
    const auto is = [&commandType](const char16_t* name) {
        return commandType.compare(QStringView(name), Qt::CaseInsensitive) == 0;
    };
    if (is(u"WindowShowMinimize"))
        return Platform::ShowCommand::Minimize;
    if (is(u"WindowShowMaximize"))
        return Platform::ShowCommand::Maximize;
    if (is(u"WindowShowRestore"))
        return Platform::ShowCommand::Restore;
    return Platform::ShowCommand::ShowNoActivate;
}

} // namespace

CShowAllWindows::CShowAllWindows(const QString& commandType)
    : m_showCommand(ShowCommandOf(commandType)) {}

HRESULT CShowAllWindows::Apply(Platform::WindowHandle window, int) {
    return Platform::ForeignWindows().Show(window, m_showCommand) ? S_OK : E_FAIL;
}
