#include "libs/postwick/CNoteForBlog.h"

#include <QDir>
#include <QFile>
#include <QFileInfo>
#include <QRegularExpression>

using namespace Qt::StringLiterals;

namespace {

// An <img> tag's source attribute, quoted either way: the prefix, the quote and the value.
const QRegularExpression kPictureSource(uR"((<img\b[^>]*?\bsrc\s*=\s*)(["'])(.*?)\2)"_s,
                                        QRegularExpression::CaseInsensitiveOption |
                                            QRegularExpression::DotMatchesEverythingOption);

QString DecodeAttribute(QString text) {
    text.replace(u"&quot;"_s, u"\""_s).replace(u"&#39;"_s, u"'"_s);
    text.replace(u"&lt;"_s, u"<"_s).replace(u"&gt;"_s, u">"_s);
    return text.replace(u"&amp;"_s, u"&"_s);
}

QString EncodeAttribute(QString text) {
    text.replace(u"&"_s, u"&amp;"_s).replace(u"\""_s, u"&quot;"_s).replace(u"'"_s, u"&#39;"_s);
    return text.replace(u"<"_s, u"&lt;"_s).replace(u">"_s, u"&gt;"_s);
}

// A plain file name: no folder, no way out of the note's folder.
bool IsPlainName(const QString& name) {
    return !name.isEmpty() && name != u"."_s && name != u".."_s && !name.contains(u'/') &&
           !name.contains(u'\\') && !name.contains(u':');
}

} // namespace

bool CNoteForBlog::Load(const QString& notePath) {
    QFile file(notePath);
    if (!file.open(QIODevice::ReadOnly) || file.size() > kMaxNoteSize)
        return false;
    QString text = QString::fromUtf8(file.readAll());
    // Note files end with a zero byte.
    while (text.endsWith(QChar(0)))
        text.chop(1);
    static const QRegularExpression body(uR"(<body\b[^>]*>(.*)</body\s*>)"_s,
                                         QRegularExpression::CaseInsensitiveOption |
                                             QRegularExpression::DotMatchesEverythingOption);
    const QRegularExpressionMatch match = body.match(text);
    m_body = match.hasMatch() ? match.captured(1) : text;
    m_folder = QFileInfo(notePath).absolutePath();
    m_pictures.clear();
    for (auto it = kPictureSource.globalMatch(m_body); it.hasNext();) {
        const QString name = DecodeAttribute(it.next().captured(3));
        if (!IsPlainName(name))
            continue;
        const QFileInfo picture(QDir(m_folder).filePath(name));
        if (picture.isFile() && !picture.isSymLink() &&
            !m_pictures.contains(picture.absoluteFilePath()))
            m_pictures.append(picture.absoluteFilePath());
    }
    return true;
}

QString CNoteForBlog::BodyWithAddresses(const QMap<QString, QString>& addresses) const {
    QString result;
    qsizetype copied = 0;
    for (auto it = kPictureSource.globalMatch(m_body); it.hasNext();) {
        const QRegularExpressionMatch match = it.next();
        const QString name = DecodeAttribute(match.captured(3));
        if (!IsPlainName(name))
            continue;
        const QString address = addresses.value(QDir(m_folder).absoluteFilePath(name));
        if (address.isEmpty())
            continue;
        result += QStringView(m_body).mid(copied, match.capturedStart(3) - copied);
        result += EncodeAttribute(address);
        copied = match.capturedEnd(3);
    }
    result += QStringView(m_body).mid(copied);
    return result;
}
