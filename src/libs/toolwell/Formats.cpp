#include "libs/toolwell/Formats.h"

#include <QDateTime>
#include <QRegularExpression>
#include <QTimeZone>

HRESULT FormatTime(QString* text, std::int64_t time) {
    if (text == nullptr)
        return E_INVALIDARG;
    *text = QDateTime::fromSecsSinceEpoch(time, QTimeZone::utc())
                .toString(QStringLiteral("yyyy-MM-dd'T'HH:mm:ss'Z'"));
    return text->isEmpty() ? E_FAIL : S_OK;
}

HRESULT ParseTime(std::int64_t* time, const QString& text) {
    if (time == nullptr)
        return E_INVALIDARG;
    static const QRegularExpression shape(
        QStringLiteral("^\\d{4}-\\d{2}-\\d{2}T\\d{2}:\\d{2}:\\d{2}Z$"));
    if (!shape.match(text).hasMatch())
        return E_FAIL;
    const QDateTime parsed = QDateTime::fromString(text, Qt::ISODate);
    if (!parsed.isValid())
        return E_FAIL;
    *time = parsed.toSecsSinceEpoch();
    return S_OK;
}

int ParseIntegerList(const QString& text, QList<int>* numbers) {
    if (numbers != nullptr)
        numbers->clear();
    if (text.trimmed().isEmpty())
        return 0;
    int count = 0;
    for (const QString& piece : text.split(u',')) {
        bool ok = false;
        const int value = piece.trimmed().toInt(&ok, 10);
        if (!ok)
            break;
        if (numbers != nullptr)
            numbers->append(value);
        ++count;
    }
    return count;
}

HRESULT FormatColor(QString* text, std::uint32_t color) {
    if (text == nullptr)
        return E_INVALIDARG;
    *text = QStringLiteral("%1,%2,%3")
                .arg(color & 0xFF)
                .arg((color >> 8) & 0xFF)
                .arg((color >> 16) & 0xFF);
    return S_OK;
}

std::uint32_t ParseColor(const QString& text) {
    QList<int> parts;
    if (ParseIntegerList(text, &parts) != 3 || text.split(u',').size() != 3)
        return 0;
    for (int part : parts) {
        if (part < 0 || part > 255)
            return 0;
    }
    return static_cast<std::uint32_t>(parts[0]) | (static_cast<std::uint32_t>(parts[1]) << 8) |
           (static_cast<std::uint32_t>(parts[2]) << 16);
}
