#include "notetool/CNotePictures.h"

#include "platform/RegularFile.h"

#include <QDir>
#include <QFileInfo>
#include <QImage>
#include <QImageReader>
#include <QImageWriter>
#include <QSaveFile>

namespace {

// A picture name that would be dropped on a later save never becomes a file name.
QString PlainBase(const QString& base) {
    QString plain;
    for (const QChar c : base) {
        if (c.isLetterOrNumber() || c == u'-' || c == u'_' || c == u' ')
            plain += c;
    }
    plain = plain.trimmed();
    return plain.isEmpty() ? QStringLiteral("picture") : plain;
}

} // namespace

CNotePictures::CNotePictures(QString folder) : m_folder(std::move(folder)) {}

bool CNotePictures::IsPictureFile(const QString& path) {
    const QByteArray suffix = QFileInfo(path).suffix().toLower().toLatin1();
    return !suffix.isEmpty() && QImageReader::supportedImageFormats().contains(suffix);
}

QString CNotePictures::FreeName(const QString& base, const QString& suffix) const {
    const QDir folder(m_folder);
    QString name = base + u'.' + suffix;
    for (int number = 2; folder.exists(name) || QFileInfo(folder.filePath(name)).isSymLink();
         ++number)
        name = base + u'-' + QString::number(number) + u'.' + suffix;
    return name;
}

QString CNotePictures::AddImage(const QImage& image) const {
    if (image.isNull())
        return {};
    const QString name = FreeName(QStringLiteral("picture"), QStringLiteral("png"));
    QSaveFile file(QDir(m_folder).filePath(name));
    if (!file.open(QIODevice::WriteOnly))
        return {};
    QImageWriter writer(&file, "png");
    // The picture's tail is written by the flush; commit would not see that write fail.
    if (!writer.write(image) || !file.flush()) {
        file.cancelWriting();
        return {};
    }
    if (!file.commit())
        return {};
    return name;
}

QString CNotePictures::CopyFile(const QString& source) const {
    const QFileInfo info(source);
    const QString suffix = info.suffix().toLower();
    if (!IsPictureFile(source))
        return {};
    const QString name = FreeName(PlainBase(info.completeBaseName()), suffix);
    if (!Platform::CopyRegularFile(source, QDir(m_folder).filePath(name)))
        return {};
    return name;
}
