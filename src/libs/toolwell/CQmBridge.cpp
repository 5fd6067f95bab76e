#include "libs/toolwell/CQmBridge.h"

#include "platform/IProcessLauncher.h"
#include "platform/Registry.h"

#include <QClipboard>
#include <QDir>
#include <QFileInfo>
#include <QGuiApplication>
#include <QImage>
#include <QMimeData>
#include <QSaveFile>
#include <QTemporaryDir>
#include <QTextDocument>
#include <QUrl>

namespace {

// A private folder for the files the word processor is to read, kept once it started.
QString HandOverTemplate() {
    return QDir::tempPath() + QStringLiteral("/ambrel-qm-XXXXXX");
}

bool WriteFile(const QString& path, const QByteArray& content) {
    QSaveFile file(path);
    return file.open(QIODevice::WriteOnly) && file.write(content) == content.size() &&
           file.commit();
}

// UTF-8 behind a byte order mark, which outweighs any character set that pasted markup declares.
bool WriteHtmlFile(const QString& path, const QString& html) {
    return WriteFile(path, QByteArrayLiteral("\xEF\xBB\xBF") + html.toUtf8());
}

QString HtmlDocument(const QString& title, const QString& body) {
    return QStringLiteral("<!DOCTYPE html>\n<html>\n<head>\n<meta charset=\"utf-8\">\n"
                          "<title>%1</title>\n</head>\n<body>\n%2\n</body>\n</html>\n")
        .arg(title.toHtmlEscaped(), body);
}

// A document showing the picture `fileName` that lies beside it.
QString PictureDocument(const QString& fileName) {
    const QString source = QString::fromLatin1(QUrl::toPercentEncoding(fileName));
    return HtmlDocument(
        QFileInfo(fileName).completeBaseName(),
        QStringLiteral("<p><img src=\"%1\" alt=\"%2\"></p>").arg(source, fileName.toHtmlEscaped()));
}

const QString kSendToChoiceValue = QStringLiteral("SendToChoice");
constexpr int kChoices = 3;

} // namespace

HRESULT CQmBridge::Resolve(const QString& target, WordProcessor* processor) {
    const std::optional<WordProcessor> found = WordProcessor::Find();
    if (!found)
        return E_FAIL;
    if (!target.isEmpty() && target != found->program)
        return E_INVALIDARG;
    *processor = *found;
    return S_OK;
}

HRESULT CQmBridge::Open(const WordProcessor& processor, const QStringList& paths,
                        QTemporaryDir* handOver) {
    if (!Platform::ProcessLauncher().StartDetached(processor.program, paths))
        return E_FAIL;
    if (handOver != nullptr)
        handOver->setAutoRemove(false);
    return S_OK;
}

HRESULT CQmBridge::ConnectToQm(Platform::WindowHandle, IUnicodeString* target) {
    WordProcessor processor;
    if (const HRESULT hr = Resolve({}, &processor); FAILED(hr))
        return hr;
    return target != nullptr ? target->Assign(processor.program) : S_OK;
}

HRESULT CQmBridge::CreateDocument(int templateIndex, const QString& target, int show) {
    if (templateIndex != 0 || show != 1)
        return E_INVALIDARG;
    WordProcessor processor;
    if (const HRESULT hr = Resolve(target, &processor); FAILED(hr))
        return hr;
    return Open(processor, processor.newDocumentArguments);
}

HRESULT CQmBridge::SendNotesToQm(const QStringList& notePaths, const QString&,
                                 const QString& target) {
    WordProcessor processor;
    if (const HRESULT hr = Resolve(target, &processor); FAILED(hr))
        return hr;
    if (notePaths.isEmpty())
        return S_FALSE;
    // Absolute paths only: a path beginning with "-" would be read as a switch.
    QStringList files;
    for (const QString& path : notePaths) {
        const QFileInfo info(path);
        if (!path.isEmpty() && info.isFile())
            files.append(QDir::cleanPath(info.absoluteFilePath()));
    }
    if (files.isEmpty())
        return E_FAIL;
    return Open(processor, files);
}

HRESULT CQmBridge::SendDocumentToQm(const QString& path, const QString& target, bool inNotebook) {
    WordProcessor processor;
    if (const HRESULT hr = Resolve(target, &processor); FAILED(hr))
        return hr;
    const QFileInfo info(path);
    if (path.isEmpty() || !info.isFile())
        return E_FAIL;
    const QString source = QDir::cleanPath(info.absoluteFilePath());
    if (!inNotebook)
        return Open(processor, {source});

    QTemporaryDir handOver(HandOverTemplate());
    const QString copy = handOver.filePath(info.fileName());
    if (!handOver.isValid() || !QFile::copy(source, copy))
        return E_FAIL;
    return Open(processor, {copy}, &handOver);
}

HRESULT CQmBridge::SendPictureToQm(const QString& picturePath, const QString& target) {
    WordProcessor processor;
    if (const HRESULT hr = Resolve(target, &processor); FAILED(hr))
        return hr;
    const QFileInfo info(picturePath);
    if (picturePath.isEmpty() || !info.isFile())
        return E_FAIL;

    // The picture travels with its document, so the caller may remove its own file.
    QTemporaryDir handOver(HandOverTemplate());
    const QString document = handOver.filePath(info.completeBaseName() + QStringLiteral(".htm"));
    if (!handOver.isValid() ||
        !QFile::copy(info.absoluteFilePath(), handOver.filePath(info.fileName())) ||
        !WriteHtmlFile(document, PictureDocument(info.fileName())))
        return E_FAIL;
    return Open(processor, {document}, &handOver);
}

HRESULT CQmBridge::PasteClipboardToQm() {
    if (qobject_cast<QGuiApplication*>(QCoreApplication::instance()) == nullptr)
        return E_FAIL;
    const QMimeData* data = QGuiApplication::clipboard()->mimeData();
    if (data == nullptr)
        return E_FAIL;
    WordProcessor processor;
    if (const HRESULT hr = Resolve({}, &processor); FAILED(hr))
        return hr;

    QTemporaryDir handOver(HandOverTemplate());
    if (!handOver.isValid())
        return E_FAIL;
    const QString title = QStringLiteral("Clipboard");
    const QString document = handOver.filePath(title + QStringLiteral(".htm"));
    bool written = false;
    if (const QString html = data->html(); data->hasHtml() && !html.trimmed().isEmpty()) {
        // Copied markup is mostly a fragment; a whole page is kept as it is.
        const bool wholePage = html.contains(QLatin1StringView("<html"), Qt::CaseInsensitive);
        written = WriteHtmlFile(document, wholePage ? html : HtmlDocument(title, html));
    } else if (const QImage image = qvariant_cast<QImage>(data->imageData()); !image.isNull()) {
        const QString pictureName = title + QStringLiteral(".png");
        written = image.save(handOver.filePath(pictureName), "PNG") &&
                  WriteHtmlFile(document, PictureDocument(pictureName));
    } else if (const QString text = data->text(); !text.isEmpty()) {
        written = WriteHtmlFile(
            document, HtmlDocument(title, Qt::convertFromPlainText(text, Qt::WhiteSpaceNormal)));
    } else {
        return E_FAIL;
    }
    if (!written)
        return E_FAIL;
    return Open(processor, {document}, &handOver);
}

int CQmBridge::GetSendToChoice() {
    bool valid = false;
    const int choice =
        Platform::Registry::UserValue(WordProcessor::KeyPath, kSendToChoiceValue).toInt(&valid);
    return valid && choice >= 0 && choice < kChoices ? choice : 0;
}

HRESULT CQmBridge::SetSendToChoice(int choice) {
    if (choice < 0 || choice >= kChoices)
        return E_INVALIDARG;
    return Platform::Registry::SetUserValue(WordProcessor::KeyPath, kSendToChoiceValue, choice)
               ? S_OK
               : E_FAIL;
}

IQmBridge* GetQmBridge() {
    return new CQmBridge;
}
