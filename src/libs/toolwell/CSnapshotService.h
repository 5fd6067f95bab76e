#pragma once

#include "libs/toolwell/ISnapshotService.h"

#include <QImage>
#include <QList>
#include <QRect>

class QTemporaryDir;

// Grabs the screens with the windowing system's screen grab; where the windowing system allows
// none (some Wayland compositors) every operation fails with E_FAIL.
class CSnapshotService final : public ISnapshotService {
public:
    HRESULT SnapshotToClipboard() override;
    HRESULT SnapshotToNewNote() override;
    HRESULT SnapshotToQm() override;

    // The picture of every screen at its place in the virtual screen; null when there is no
    // screen or the grab failed.
    static QImage GrabScreens();

    struct ScreenPicture {
        QRect geometry; // in the virtual screen's logical coordinates
        QImage picture;
    };
    // Lays the pictures out as their screens stand, at the finest pixel density among them so
    // that no screen loses detail; what no screen covers stays black. Null without a picture.
    static QImage ComposeScreens(const QList<ScreenPicture>& screens);

private:
    // Grabs the screens into "Snapshot <date and time>.png" in `folder`; empty on failure.
    static QString GrabToFile(const QTemporaryDir& folder);
};
