#include "notes/CBasicNoteConstructor.h"

#include "common/StringTable.h"
#include "libs/toolwell/Formats.h"
#include "platform/IMessageBox.h"
#include "platform/SaveFailureNotice.h"

#include <QFileInfo>

CBasicNoteConstructor::CBasicNoteConstructor(const QString& source) : m_source(source) {}

CBasicNoteConstructor::~CBasicNoteConstructor() = default;

int CBasicNoteConstructor::Initialize() {
    m_creator.reset(CreateNoteDocumentCreator());
    return m_creator ? 1 : 0;
}

int CBasicNoteConstructor::ConstructNote(const QString& noteFilePath, const QString& title) {
    if (!m_creator || !m_defaults)
        return 0;
    const NoteDefaults& defaults = *m_defaults;

    // Results of the setters are not checked: every value has a sound fallback in the note.
    m_creator->SetFilePath(noteFilePath);
    m_creator->SetTitle(title);
    m_creator->SetBackgroundImage(defaults.backgroundImage);
    m_creator->SetBackgroundColor(ParseColor(defaults.backgroundColor));
    m_creator->SetFontFamily(defaults.font);
    m_creator->SetFontSize(static_cast<std::uint32_t>(defaults.fontSize), QStringLiteral("points"));

    QString content;
    if (BuildContent(&content, noteFilePath, defaults.font) != 1) {
        ShowSourceMessage(StringId::FileNotReadable);
        return 0;
    }
    m_creator->SetContent(content);
    Platform::SaveFailureNotice& notice = Platform::SaveFailureNotice::Instance();
    if (m_creator->Write() != S_OK) {
        notice.Failed(Platform::SavedFile::Note, noteFilePath, {});
        return 0;
    }
    notice.Saved(Platform::SavedFile::Note);
    return 1;
}

int CBasicNoteConstructor::Create(const QString& noteFilePath, const QString& title) {
    if (CanConstruct(m_source) != 1)
        return 0;
    return ConstructNote(noteFilePath, title) == 1 ? 1 : 0;
}

void CBasicNoteConstructor::SetSource(const QString& source) {
    m_source = source;
}

void CBasicNoteConstructor::SetPreformatted(int preformatted) {
    m_preformatted = preformatted;
}

void CBasicNoteConstructor::Release() {
    delete this;
}

void CBasicNoteConstructor::SetNoteDefaults(const NoteDefaults& defaults) {
    m_defaults = defaults;
}

QString CBasicNoteConstructor::SourceFileName() const {
    return QFileInfo(m_source).fileName();
}

void CBasicNoteConstructor::ShowSourceMessage(int stringId) const {
    Platform::MessageBox().Show(FormatString(stringId, SourceFileName()),
                                LoadString(StringId::ProductName), Platform::MessageBoxStyle::Ok);
}

QString CBasicNoteConstructor::EscapeText(const QString& text) {
    QString escaped;
    escaped.reserve(text.size());
    for (QChar c : text) {
        if (c == u'&')
            escaped += QLatin1StringView("&amp;");
        else if (c == u'<')
            escaped += QLatin1StringView("&lt;");
        else if (c == u'>')
            escaped += QLatin1StringView("&gt;");
        else
            escaped += c;
    }
    return escaped;
}

QString CBasicNoteConstructor::EscapeAttribute(const QString& text) {
    return EscapeText(text).replace(u'"', QLatin1StringView("&quot;"));
}
