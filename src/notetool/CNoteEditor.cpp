#include "notetool/CNoteEditor.h"

#include "notes/CHTMLBackgroundStyle.h"
#include "notetool/CNoteFile.h"

#include <QDir>
#include <QFileInfo>
#include <QImage>
#include <QMimeData>
#include <QTextCursor>
#include <QTextDocument>
#include <QTextFrame>
#include <QTextImageFormat>
#include <QUrl>

namespace {

QColor ColorOf(std::uint32_t value) {
    return QColor(value & 0xFF, (value >> 8) & 0xFF, (value >> 16) & 0xFF);
}

QStringList LocalPictureFiles(const QMimeData* source) {
    QStringList files;
    if (!source->hasUrls())
        return files;
    for (const QUrl& url : source->urls()) {
        if (url.isLocalFile() && CNotePictures::IsPictureFile(url.toLocalFile()))
            files.append(url.toLocalFile());
    }
    return files;
}

} // namespace

CNoteEditor::CNoteEditor(QWidget* parent) : QTextEdit(parent), m_pictures(QString()) {
    setAccessibleName(tr("Note text"));
    setAutoFormatting(QTextEdit::AutoBulletList);
}

void CNoteEditor::ShowNote(const NoteContent& content, const QString& notePath) {
    m_folder = QFileInfo(notePath).absolutePath();
    m_pictures = CNotePictures(m_folder);
    QTextDocument* note = document();
    // Pictures are named relative to the note file.
    note->setMetaInformation(
        QTextDocument::DocumentUrl,
        QUrl::fromLocalFile(QFileInfo(notePath).absoluteFilePath()).toString());
    ApplyLook(content);
    note->setUndoRedoEnabled(false);
    if (Qt::mightBeRichText(content.body) || content.body.isEmpty())
        setHtml(content.body);
    else
        setPlainText(content.body);
    note->setUndoRedoEnabled(true);
    note->setModified(false);
}

void CNoteEditor::ApplyLook(const NoteContent& content) {
    QTextDocument* note = document();
    QFont font = note->defaultFont();
    if (!content.fontFamily.isEmpty())
        font.setFamilies({content.fontFamily});
    font.setPointSize(static_cast<int>(qBound(1U, content.fontSize, 400U)));
    note->setDefaultFont(font);
    note->setDefaultStyleSheet(
        QStringLiteral("p { margin-top: %1em; margin-bottom: %1em; }").arg(content.margin));

    QPalette colors = palette();
    colors.setColor(QPalette::Base, ColorOf(content.backgroundColor));
    colors.setColor(QPalette::Text, ColorOf(CHTMLBackgroundStyle::ReadColor(content.textColor)));
    setPalette(colors);

    QTextFrameFormat page = note->rootFrame()->frameFormat();
    const QString& image = content.backgroundImage;
    QImage background;
    if (!image.isEmpty() && image != u"none")
        background = QImage(QDir(m_folder).absoluteFilePath(image));
    if (background.isNull())
        page.clearBackground();
    else
        page.setBackground(QBrush(background));
    note->rootFrame()->setFrameFormat(page);
}

QString CNoteEditor::BodyHtml() const {
    return CNoteFile::BodyOf(toHtml());
}

bool CNoteEditor::InsertPictureFile(const QString& path) {
    const QString name = m_pictures.CopyFile(path);
    if (name.isEmpty())
        return false;
    InsertPicture(name);
    return true;
}

bool CNoteEditor::canInsertFromMimeData(const QMimeData* source) const {
    return source->hasImage() || !LocalPictureFiles(source).isEmpty() ||
           QTextEdit::canInsertFromMimeData(source);
}

void CNoteEditor::insertFromMimeData(const QMimeData* source) {
    const QStringList files = LocalPictureFiles(source);
    if (!files.isEmpty()) {
        for (const QString& file : files)
            InsertPictureFile(file);
        return;
    }
    if (source->hasImage() && !source->hasHtml()) {
        const QString name = m_pictures.AddImage(qvariant_cast<QImage>(source->imageData()));
        if (!name.isEmpty())
            InsertPicture(name);
        return;
    }
    QTextEdit::insertFromMimeData(source);
}

void CNoteEditor::InsertPicture(const QString& fileName) {
    QTextImageFormat picture;
    picture.setName(fileName);
    textCursor().insertImage(picture);
}
