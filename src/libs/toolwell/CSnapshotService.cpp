#include "libs/toolwell/CSnapshotService.h"

#include "common/ReleasePtr.h"
#include "libs/toolwell/IQmBridge.h"

#include <QClipboard>
#include <QDateTime>
#include <QDir>
#include <QFile>
#include <QGuiApplication>
#include <QPainter>
#include <QPixmap>

#include <QScreen>
#include <QTemporaryDir>
#include <algorithm>

namespace {

SnapshotNoteHandler& NoteHandler() {
    static SnapshotNoteHandler handler;
    return handler;
}

bool HasScreens() {
    return qobject_cast<QGuiApplication*>(QCoreApplication::instance()) != nullptr &&
           !QGuiApplication::screens().isEmpty();
}

} // namespace

QImage CSnapshotService::GrabScreens() {
    if (!HasScreens())
        return {};
    const QList<QScreen*> screens = QGuiApplication::screens();
    if (screens.size() == 1)
        return screens.first()->grabWindow(0).toImage();
    QList<ScreenPicture> pictures;
    for (QScreen* screen : screens)
        pictures.append({screen->geometry(), screen->grabWindow(0).toImage()});
    return ComposeScreens(pictures);
}

QImage CSnapshotService::ComposeScreens(const QList<ScreenPicture>& screens) {
    QRect virtualRect;
    qreal ratio = 0.0;
    for (const ScreenPicture& screen : screens) {
        if (screen.picture.isNull() || screen.geometry.isEmpty())
            continue;
        virtualRect = virtualRect.united(screen.geometry);
        ratio = std::max(ratio, qreal(screen.picture.width()) / screen.geometry.width());
    }
    if (ratio <= 0.0)
        return {};
    const auto scaled = [ratio](const QRect& rect) {
        return QRectF(rect.x() * ratio, rect.y() * ratio, rect.width() * ratio,
                      rect.height() * ratio)
            .toRect();
    };
    QImage canvas(scaled(virtualRect.translated(-virtualRect.topLeft())).size(),
                  QImage::Format_RGB32);
    canvas.fill(Qt::black);
    QPainter painter(&canvas);
    for (const ScreenPicture& screen : screens) {
        if (screen.picture.isNull() || screen.geometry.isEmpty())
            continue;
        QImage picture = screen.picture;
        picture.setDevicePixelRatio(1.0);
        painter.drawImage(scaled(screen.geometry.translated(-virtualRect.topLeft())), picture);
    }
    painter.end();
    return canvas;
}

QString CSnapshotService::GrabToFile(const QTemporaryDir& folder) {
    if (!folder.isValid())
        return {};
    const QImage picture = GrabScreens();
    if (picture.isNull())
        return {};
    // The file's name becomes the note's title.
    const QString name =
        QStringLiteral("Snapshot %1.png")
            .arg(QDateTime::currentDateTime().toString(QStringLiteral("yyyy-MM-dd hh.mm.ss")));
    const QString path = folder.filePath(name);
    return picture.save(path, "PNG") ? path : QString();
}

HRESULT CSnapshotService::SnapshotToClipboard() {
    const QImage picture = GrabScreens();
    if (picture.isNull())
        return E_FAIL;
    QGuiApplication::clipboard()->setImage(picture);
    return S_OK;
}

HRESULT CSnapshotService::SnapshotToNewNote() {
    // A copy, so that a handler which replaces itself does not end its own call.
    const SnapshotNoteHandler handler = NoteHandler();
    if (!handler)
        return E_FAIL;
    // The folder and whatever the handler left in it go when this returns.
    const QTemporaryDir folder(QDir::tempPath() + QStringLiteral("/ambrel-snapshot-XXXXXX"));
    const QString path = GrabToFile(folder);
    if (path.isEmpty())
        return E_FAIL;
    return handler(path);
}

HRESULT CSnapshotService::SnapshotToQm() {
    const QTemporaryDir folder(QDir::tempPath() + QStringLiteral("/ambrel-snapshot-XXXXXX"));
    const QString path = GrabToFile(folder);
    if (path.isEmpty())
        return E_FAIL;
    const ReleasePtr<IQmBridge> bridge(GetQmBridge());
    if (!bridge)
        return E_FAIL;
    return bridge->SendPictureToQm(path, {});
}

ISnapshotService* GetSnapshotService() {
    static CSnapshotService service;
    return &service;
}

void SetSnapshotNoteHandler(SnapshotNoteHandler handler) {
    NoteHandler() = std::move(handler);
}
