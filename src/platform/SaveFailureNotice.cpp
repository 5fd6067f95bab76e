#include "platform/SaveFailureNotice.h"

#include "common/StringTable.h"
#include "platform/IMessageBox.h"

#include <QTimer>

#include <cstdio>
#include <memory>

namespace Platform {

namespace {

std::unique_ptr<SaveFailureNotice>& Single() {
    static std::unique_ptr<SaveFailureNotice> single;
    return single;
}

int MessageId(SavedFile kind) {
    switch (kind) {
    case SavedFile::Catalog:
        return StringId::CatalogNotSaved;
    case SavedFile::Settings:
        return StringId::SettingsNotSaved;
    case SavedFile::Note:
        break;
    }
    return StringId::NoteNotSaved;
}

} // namespace

SaveFailureNotice& SaveFailureNotice::Instance() {
    std::unique_ptr<SaveFailureNotice>& single = Single();
    if (!single)
        single.reset(new SaveFailureNotice);
    return *single;
}

void SaveFailureNotice::DestroyInstance() {
    Single().reset();
}

void SaveFailureNotice::Saved(SavedFile kind) {
    m_told[static_cast<std::size_t>(kind)] = false;
}

void SaveFailureNotice::Failed(SavedFile kind, const QString& path, const QString& reason) {
    bool& told = m_told[static_cast<std::size_t>(kind)];
    if (told)
        return;
    told = true;
    const QString text = Text(kind, path, reason);
    if (m_silent) {
        Tell(text);
        return;
    }
    QTimer::singleShot(0, &m_context, [this, text] { Tell(text); });
}

QString SaveFailureNotice::Text(SavedFile kind, const QString& path, const QString& reason) {
    QString text = FormatString(MessageId(kind), path);
    if (!reason.isEmpty())
        text += QStringLiteral("\n\n") + FormatString(StringId::SaveFailureReason, reason);
    return text;
}

void SaveFailureNotice::Tell(const QString& text) const {
    if (m_silent) {
        std::fputs(qPrintable(text + u'\n'), stderr);
        return;
    }
    MessageBox().Show(text, LoadString(StringId::ProductName),
                      MessageBoxStyle::Ok | MessageBoxStyle::IconWarning);
}

} // namespace Platform
