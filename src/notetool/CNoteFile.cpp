#include "notetool/CNoteFile.h"

#include "notes/CHTMLBackgroundStyle.h"
#include "notes/CNoteDocumentCreator.h"
#include "platform/FileWrite.h"

#include <QFile>
#include <QFileInfo>
#include <QStringDecoder>

#include <array>
#include <utility>

namespace {

using namespace Qt::StringLiterals;

// The longest run of bytes that a file cut inside one UTF-8 character leaves at its end.
constexpr qsizetype kLongestCutCharacter = 3;

bool DecodeText(QByteArray bytes, QString* text) {
    while (!bytes.isEmpty() && bytes.back() == '\0')
        bytes.chop(1);
    if (bytes.contains('\0'))
        return false;
    if (bytes.startsWith("\xEF\xBB\xBF"))
        bytes.remove(0, 3);
    for (qsizetype cut = 0; cut <= kLongestCutCharacter && cut <= bytes.size(); ++cut) {
        QStringDecoder decoder(QStringConverter::Utf8, QStringConverter::Flag::Stateless);
        QString decoded = decoder.decode(QByteArrayView(bytes).chopped(cut));
        if (!decoder.hasError()) {
            *text = std::move(decoded);
            return true;
        }
    }
    return false;
}

// The title is stored with the note escape table: percent forms and a few entities.
QString UnescapeTitle(const QString& text) {
    static const std::array<std::pair<QStringView, QChar>, 11> kForms{{{u"%3C", u'<'},
                                                                       {u"%3E", u'>'},
                                                                       {u"%20", u' '},
                                                                       {u"%23", u'#'},
                                                                       {u"%25", u'%'},
                                                                       {u"&lt;", u'<'},
                                                                       {u"&gt;", u'>'},
                                                                       {u"&nbsp;", u' '},
                                                                       {u"&quot;", u'"'},
                                                                       {u"&#39;", u'\''},
                                                                       {u"&amp;", u'&'}}};
    QString result;
    result.reserve(text.size());
    for (qsizetype i = 0; i < text.size();) {
        bool replaced = false;
        if (text[i] == u'%' || text[i] == u'&') {
            const QStringView rest = QStringView(text).mid(i);
            for (const auto& [form, character] : kForms) {
                if (rest.startsWith(form, Qt::CaseInsensitive)) {
                    result += character;
                    i += form.size();
                    replaced = true;
                    break;
                }
            }
        }
        if (!replaced)
            result += text[i++];
    }
    return result;
}

QString Between(const QString& text, QLatin1StringView open, QLatin1StringView close,
                qsizetype from = 0, qsizetype to = -1) {
    const qsizetype start = text.indexOf(open, from, Qt::CaseInsensitive);
    if (start < 0 || (to >= 0 && start >= to))
        return {};
    const qsizetype begin = start + open.size();
    qsizetype end = text.indexOf(close, begin, Qt::CaseInsensitive);
    if (end < 0 || (to >= 0 && end > to))
        end = to >= 0 ? to : text.size();
    return text.mid(begin, end - begin);
}

// The declarations of one rule of the style sheet, "NAME : value;" each. Rules are looked for
// only between blocks: a value, a picture's path above all, may hold text that reads like one.
QList<std::pair<QString, QString>> Declarations(const QString& styleSheet, QLatin1StringView rule) {
    QList<std::pair<QString, QString>> result;
    qsizetype at = 0;
    while (at < styleSheet.size()) {
        const qsizetype open = styleSheet.indexOf(u'{', at);
        if (open < 0)
            return result;
        qsizetype close = styleSheet.indexOf(u'}', open + 1);
        if (close < 0)
            close = styleSheet.size();
        // The selector's last word: "<!-- BODY" is the rule BODY.
        const QStringView before = QStringView(styleSheet).mid(at, open - at).trimmed();
        qsizetype word = before.size();
        while (word > 0 && (before[word - 1].isLetterOrNumber() || before[word - 1] == u'-'))
            --word;
        if (before.mid(word).compare(rule, Qt::CaseInsensitive) == 0) {
            const QString inside = styleSheet.mid(open + 1, close - open - 1);
            for (const QString& declaration : inside.split(u';', Qt::SkipEmptyParts)) {
                const qsizetype colon = declaration.indexOf(u':');
                if (colon > 0)
                    result.append({declaration.left(colon).trimmed().toUpper(),
                                   declaration.mid(colon + 1).trimmed()});
            }
            return result;
        }
        at = close + 1;
    }
    return result;
}

// "12 pt", "12pt" or "12": the whole number before the unit.
bool ReadNumber(const QString& text, QLatin1StringView unit, std::uint32_t* value) {
    QString number = text.trimmed();
    if (number.endsWith(unit, Qt::CaseInsensitive))
        number = number.chopped(unit.size()).trimmed();
    bool ok = false;
    const double read = number.toDouble(&ok);
    if (!ok || read < 0 || read > 10000)
        return false;
    *value = static_cast<std::uint32_t>(read);
    return true;
}

void ReadBackground(const QString& value, NoteContent* content) {
    const qsizetype url = value.indexOf("url("_L1, 0, Qt::CaseInsensitive);
    const qsizetype close = value.lastIndexOf(u')');
    // The colour is read outside the picture's path, which may hold anything.
    QString outside = value;
    if (url >= 0)
        outside = value.left(url) + (close > url ? value.mid(close + 1) : QString());
    CHTMLBackgroundStyle style(content->backgroundColor, {}, 0, 0, 0, 0);
    style.Parse(outside);
    style.GetColor(&content->backgroundColor);
    if (url >= 0) {
        QString image = close > url ? value.mid(url + 4, close - url - 4) : value.mid(url + 4);
        // The header writes one blank on each side of the picture's path.
        if (image.startsWith(u' '))
            image.remove(0, 1);
        if (image.endsWith(u' '))
            image.chop(1);
        content->backgroundImage = image;
    } else if (value.split(u' ', Qt::SkipEmptyParts).contains("none"_L1)) {
        content->backgroundImage = u"none"_s;
    }
}

void ReadHeader(const QString& text, NoteContent* content) {
    qsizetype headEnd = text.indexOf("<body"_L1, 0, Qt::CaseInsensitive);
    if (headEnd < 0)
        headEnd = text.size();
    if (text.indexOf("<title>"_L1, 0, Qt::CaseInsensitive) >= 0 &&
        text.indexOf("<title>"_L1, 0, Qt::CaseInsensitive) < headEnd)
        content->title = UnescapeTitle(Between(text, "<title>"_L1, "</title>"_L1, 0, headEnd));

    const QString styleSheet = Between(text, "<style"_L1, "</style>"_L1, 0, headEnd);
    if (styleSheet.isEmpty())
        return;
    for (const auto& [name, value] : Declarations(styleSheet, "BODY"_L1)) {
        if (name == u"BACKGROUND")
            ReadBackground(value, content);
        else if (name == u"FONT-FAMILY" && !value.isEmpty()) // an empty name names no font
            content->fontFamily = value;
        else if (name == u"FONT-SIZE")
            ReadNumber(value, "pt"_L1, &content->fontSize);
        else if (name == u"COLOR")
            content->textColor = value;
    }
    for (const auto& [name, value] : Declarations(styleSheet, "P"_L1)) {
        if (name == u"MARGIN-TOP")
            ReadNumber(value, "em"_L1, &content->margin);
    }
}

} // namespace

CNoteFile::CNoteFile(QString path) : m_path(std::move(path)) {}

QString CNoteFile::Folder() const {
    return QFileInfo(m_path).absolutePath();
}

CNoteFile::State CNoteFile::Load(NoteContent* content) {
    m_writable = false;
    QFile file(m_path);
    if (!file.exists() && !QFileInfo(m_path).isSymLink()) {
        m_writable = true;
        return State::New;
    }
    if (!file.open(QIODevice::ReadOnly))
        return State::Unreadable;
    const QByteArray bytes = file.readAll();
    if (file.error() != QFileDevice::NoError || !Parse(bytes, content))
        return State::Unreadable;
    m_writable = true;
    return State::Read;
}

bool CNoteFile::Save(const NoteContent& content) {
    m_saveError.clear();
    if (!m_writable)
        return false;
    return Platform::ReplaceFile(m_path, Format(content), &m_saveError);
}

QByteArray CNoteFile::Format(const NoteContent& content) {
    CNoteDocumentCreator creator;
    creator.SetTitle(content.title);
    creator.SetFontFamily(content.fontFamily);
    creator.SetFontSize(content.fontSize, u"points"_s);
    creator.SetBackgroundColor(content.backgroundColor);
    creator.SetBackgroundImage(content.backgroundImage);
    // The header keeps the word of a new note's colour; any other is written as "#rrggbb".
    if (content.textColor != u"black")
        creator.SetTextColor(CHTMLBackgroundStyle::ReadColor(content.textColor));
    creator.SetMargin(content.margin);
    creator.SetContent(content.body);
    return creator.FileBytes();
}

bool CNoteFile::Parse(const QByteArray& bytes, NoteContent* content) {
    QString text;
    if (!DecodeText(bytes, &text))
        return false;
    ReadHeader(text, content);
    content->body = BodyOf(text);
    return true;
}

QString CNoteFile::BodyOf(const QString& html) {
    qsizetype begin = 0;
    if (const qsizetype body = html.indexOf("<body"_L1, 0, Qt::CaseInsensitive); body >= 0) {
        const qsizetype close = html.indexOf(u'>', body);
        begin = close >= 0 ? close + 1 : html.size();
    } else if (const qsizetype head = html.indexOf("</head>"_L1, 0, Qt::CaseInsensitive);
               head >= 0) {
        begin = head + 7;
    } else if (html.indexOf("<head"_L1, 0, Qt::CaseInsensitive) >= 0) {
        // Cut off inside the header: there is no body yet.
        return {};
    }
    qsizetype end = html.lastIndexOf("</body>"_L1, -1, Qt::CaseInsensitive);
    if (end < begin)
        end = html.lastIndexOf("</html>"_L1, -1, Qt::CaseInsensitive);
    if (end < begin)
        end = html.size();
    QString body = html.mid(begin, end - begin);
    while (body.startsWith(u'\n') || body.startsWith(u'\r'))
        body.remove(0, 1);
    if (body.startsWith("<div>"_L1, Qt::CaseInsensitive)) {
        body.remove(0, 5);
        if (body.endsWith("</div>"_L1, Qt::CaseInsensitive))
            body.chop(6);
    }
    return body;
}
