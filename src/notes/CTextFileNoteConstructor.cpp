#include "notes/CTextFileNoteConstructor.h"

#include "common/StringTable.h"
#include "platform/RegularFile.h"

#include <QFile>
#include <QFileInfo>
#include <QStringDecoder>

#include <array>

namespace {

enum ByteOrderMark { NoMark = 0, Utf32BE = 1, Utf32LE = 2, Utf16BE = 3, Utf16LE = 4, Utf8 = 5 };

ByteOrderMark DetectMark(const QByteArray& data) {
    // UTF-32 little-endian must be tested before UTF-16 little-endian: it starts the same way.
    if (data.startsWith(QByteArrayLiteral("\x00\x00\xFE\xFF")))
        return Utf32BE;
    if (data.startsWith(QByteArrayLiteral("\xFF\xFE\x00\x00")))
        return Utf32LE;
    if (data.startsWith("\xFE\xFF"))
        return Utf16BE;
    if (data.startsWith("\xFF\xFE"))
        return Utf16LE;
    if (data.startsWith("\xEF\xBB\xBF"))
        return Utf8;
    return NoMark;
}

// The characters of bytes 0x80 to 0x9F in Windows-1252; the five bytes it leaves undefined
// keep their own code, as the system's converter does.
constexpr std::array<char16_t, 32> kWindows1252High{
    u'\u20AC', u'\u0081', u'\u201A', u'\u0192', u'\u201E', u'\u2026', u'\u2020', u'\u2021',
    u'\u02C6', u'\u2030', u'\u0160', u'\u2039', u'\u0152', u'\u008D', u'\u017D', u'\u008F',
    u'\u0090', u'\u2018', u'\u2019', u'\u201C', u'\u201D', u'\u2022', u'\u2013', u'\u2014',
    u'\u02DC', u'\u2122', u'\u0161', u'\u203A', u'\u0153', u'\u009D', u'\u017E', u'\u0178'};

QString FromWindows1252(const QByteArray& bytes) {
    QString text(bytes.size(), Qt::Uninitialized);
    for (qsizetype i = 0; i < bytes.size(); ++i) {
        const auto byte = static_cast<unsigned char>(bytes[i]);
        text[i] = byte >= 0x80 && byte <= 0x9F ? QChar(kWindows1252High[byte - 0x80])
                                               : QChar(static_cast<char16_t>(byte));
    }
    return text;
}

// How many bytes at the end start a UTF-8 sequence that the end cuts off.
qsizetype CutSequenceLength(const QByteArray& bytes) {
    for (qsizetype back = 1; back <= 4 && back <= bytes.size(); ++back) {
        const auto byte = static_cast<unsigned char>(bytes[bytes.size() - back]);
        if ((byte & 0xC0) == 0x80)
            continue; // a continuation byte: its lead byte lies further back
        const qsizetype needed = byte >= 0xF0 ? 4 : byte >= 0xE0 ? 3 : byte >= 0xC0 ? 2 : 1;
        return needed > back ? back : 0;
    }
    return 0;
}

bool DecodeUtf8Strictly(const QByteArray& bytes, QString* text) {
    QStringDecoder decoder(QStringDecoder::Utf8, QStringDecoder::Flag::Stateless);
    QString decoded = decoder.decode(bytes);
    if (decoder.hasError())
        return false;
    *text = decoded;
    return true;
}

// 8-bit text without a mark: UTF-8 when the bytes are valid UTF-8, else one character per
// byte. Text cut at the size limit may end inside a UTF-8 sequence; that piece is dropped.
QString DecodeEightBit(const QByteArray& bytes, bool cut) {
    QString text;
    if (DecodeUtf8Strictly(bytes, &text))
        return text;
    if (cut) {
        const qsizetype tail = CutSequenceLength(bytes);
        if (tail > 0 && DecodeUtf8Strictly(bytes.first(bytes.size() - tail), &text))
            return text;
    }
    return FromWindows1252(bytes);
}

// 16-bit units from the given offset up to the first zero unit; a final odd byte is a unit
// whose high byte is zero.
QString FromUtf16(const QByteArray& bytes, qsizetype offset, bool bigEndian) {
    QString text;
    text.reserve((bytes.size() - offset + 1) / 2);
    for (qsizetype i = offset; i < bytes.size(); i += 2) {
        const auto first = static_cast<unsigned char>(bytes[i]);
        const auto second = i + 1 < bytes.size() ? static_cast<unsigned char>(bytes[i + 1]) : 0;
        const char16_t unit = bigEndian ? static_cast<char16_t>((first << 8) | second)
                                        : static_cast<char16_t>((second << 8) | first);
        if (unit == 0)
            break;
        text += QChar(unit);
    }
    return text;
}

QByteArray UpToFirstZero(const QByteArray& bytes) {
    const qsizetype zero = bytes.indexOf('\0');
    return zero < 0 ? bytes : bytes.first(zero);
}

} // namespace

CTextFileNoteConstructor::CTextFileNoteConstructor(const QString& source)
    : CBasicNoteConstructor(source) {}

int CTextFileNoteConstructor::CanConstruct(const QString&) {
    return 1;
}

int CTextFileNoteConstructor::BuildContent(QString* content, const QString&,
                                           const QString& fontFamily) {
    if (content == nullptr)
        return 0;
    content->clear();

    QFile file;
    if (!Platform::OpenRegularFile(file, Source()))
        return 0;
    const qint64 size = file.size();
    if (size > kMaxTextBytes)
        ShowSourceMessage(StringId::FileTooLarge);
    if (size < 4)
        return 0;
    const qint64 n = qMin(size, kMaxTextBytes);
    QByteArray data = file.read(n);
    file.close();
    if (data.size() != n)
        return 0;

    QString text;
    switch (DetectMark(data)) {
    case NoMark: {
        const bool temporary =
            QFileInfo(Source()).fileName().endsWith(QLatin1StringView(".tmp"), Qt::CaseInsensitive);
        for (char& byte : data) {
            const auto value = static_cast<unsigned char>(byte);
            if (value >= 32 || value == '\t' || value == '\n' || value == '\r')
                continue;
            // Handed-over clipboard text may carry control characters; a text file may not.
            if (!temporary)
                return 0;
            byte = value == 0x14 ? '-' : ' ';
        }
        // No zero byte is left by now, so the whole text is taken.
        text = DecodeEightBit(data, size > n);
        break;
    }
    case Utf8:
        text = QString::fromUtf8(UpToFirstZero(data.sliced(3)));
        break;
    case Utf16LE:
        text = FromUtf16(data, 2, false);
        break;
    case Utf16BE:
        if (n % 2 != 0)
            return 0;
        text = FromUtf16(data, 2, true);
        break;
    case Utf32BE:
    case Utf32LE:
        return 0;
    }

    // The note shows the file's text as it is: markup in it stays text.
    *content = EscapeText(text);
    if (Preformatted() == 1) {
        *content = QLatin1StringView("<PRE><FONT FACE=\"") + EscapeAttribute(fontFamily) +
                   QLatin1StringView("\">") + *content + QLatin1StringView("</FONT></PRE>");
    }
    return 1;
}
