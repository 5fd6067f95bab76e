#include "notes/CNoteDocumentCreator.h"

#include "common/IUnicodeString.h"
#include "common/ReleasePtr.h"
#include "notes/FormatLength.h"
#include "notes/IHTMLContentTextConverter.h"
#include "platform/RegularFile.h"

#include <new>

namespace {
constexpr std::uint32_t kWhite = 0x00FFFFFF;
}

CNoteDocumentCreator::CNoteDocumentCreator()
    : m_title(0, u'\0'), m_filePath(0, u'\0'), m_fontFamily(QStringLiteral("Times New Roman")),
      m_fontSize(QStringLiteral("12 pt")),
      m_background(kWhite, QStringLiteral("none"), BackgroundRepeat::Repeat,
                   BackgroundAttachment::Scroll, BackgroundHorizontal::Left,
                   BackgroundVertical::Top),
      m_textColor(QStringLiteral("black")), m_content(0, u'\0'), m_margin(QStringLiteral("0 em")) {}

HRESULT CNoteDocumentCreator::SetTitle(const QString& title) {
    ReleasePtr<IHTMLContentTextConverter> converter(CreateHTMLContentTextConverter());
    if (!converter)
        return E_FAIL;
    QString escaped;
    UnicodeStringPtr sink(&escaped);
    if (FAILED(converter->Convert(title, &sink)))
        return E_FAIL;
    m_title = escaped;
    return S_OK;
}

HRESULT CNoteDocumentCreator::SetBackgroundImage(const QString& path) {
    if (path.compare(QLatin1StringView("none"), Qt::CaseInsensitive) == 0)
        m_background.SetImage(QStringLiteral("none"));
    else
        m_background.SetImage(QLatin1StringView("url( ") + path + QLatin1StringView(" )"));
    return S_OK;
}

HRESULT CNoteDocumentCreator::SetBackgroundColor(std::uint32_t color) {
    return m_background.SetColor(color);
}

HRESULT CNoteDocumentCreator::SetFontFamily(const QString& family) {
    m_fontFamily = family;
    return S_OK;
}

HRESULT CNoteDocumentCreator::SetFontSize(std::uint32_t value, const QString& unit) {
    if (unit != u"points")
        return E_INVALIDARG;
    m_fontSize = FormatLength(value, LengthUnit::Points);
    return S_OK;
}

HRESULT CNoteDocumentCreator::SetTextColor(std::uint32_t color) {
    m_textColor = CHTMLBackgroundStyle::ColorText(color);
    return S_OK;
}

HRESULT CNoteDocumentCreator::SetReserved(std::uint32_t) {
    return E_NOTIMPL;
}

HRESULT CNoteDocumentCreator::SetMargin(std::uint32_t value) {
    m_margin = FormatLength(value, LengthUnit::Ems);
    return S_OK;
}

HRESULT CNoteDocumentCreator::SetContent(const QString& html) {
    m_content = html;
    return S_OK;
}

HRESULT CNoteDocumentCreator::SetFilePath(const QString& path) {
    m_filePath = path;
    return S_OK;
}

QString CNoteDocumentCreator::DocumentText() {
    QString background;
    m_background.GetText(&background);

    QString text = QStringLiteral(
        "<!DOCTYPE HTML PUBLIC \"-//W3C//DTD HTML 4.0 Transitional//EN\"><HTML><HEAD><TITLE>");
    text += m_title;
    text += QLatin1StringView("</TITLE><STYLE type=\"text/css\" > BODY { BACKGROUND : ");
    text += background + u';';
    if (!m_fontFamily.isEmpty())
        text += QLatin1StringView("FONT-FAMILY : ") + m_fontFamily + u';';
    if (!m_fontSize.isEmpty())
        text += QLatin1StringView("FONT-SIZE : ") + m_fontSize + u';';
    text += QLatin1StringView("COLOR : ") + m_textColor + u';';
    text += QLatin1StringView(" } P { MARGIN-TOP : ") + m_margin;
    text += QLatin1StringView(";MARGIN-BOTTOM : ") + m_margin;
    text += QLatin1StringView("; } </STYLE></HEAD><BODY><DIV>");
    text += m_content;
    text += QLatin1StringView("</DIV></BODY></HTML>");
    return text;
}

QByteArray CNoteDocumentCreator::FileBytes() {
    QString document = DocumentText();
    // The text ends at its first zero character, as other writers of note files do.
    const qsizetype end = document.indexOf(QChar(u'\0'));
    if (end >= 0)
        document.truncate(end);
    // Readers of note files expect the terminating zero byte inside the file.
    return document.toUtf8() + '\0';
}

HRESULT CNoteDocumentCreator::Write() {
    // A note file is never written over: an existing file stays as it is. A crash while
    // writing leaves no note rather than a cut-off one.
    switch (Platform::CreateFileWhole(m_filePath, FileBytes())) {
    case Platform::WholeFileResult::Created:
    case Platform::WholeFileResult::NameTaken:
        return S_OK;
    case Platform::WholeFileResult::Failed:
        break;
    }
    return E_FAIL;
}

unsigned long CNoteDocumentCreator::Release() {
    delete this;
    return 0;
}

INoteDocumentCreator* CreateNoteDocumentCreator() {
    return new (std::nothrow) CNoteDocumentCreator();
}
