#pragma once

#include "libs/toolwell/IHelpService.h"

#include <QString>
#include <QUrl>

// The user guide is the HTML set installed in "help/" beside the program's folder (the build
// puts it there too: "<build>/help/index.html"). The website is the value "Website" under the
// machine key "SOFTWARE\Brindle\Quillmark Ambrel"; only http and https addresses count.
class CHelpService final : public IHelpService {
public:
    // programFolder: where the program file lies; empty for the running executable's folder.
    explicit CHelpService(const QString& programFolder = {});

    HRESULT ShowHelpTopics() override;
    HRESULT ShowUserGuide() override;
    int HasUserGuide() override;
    HRESULT OpenWebsite() override;
    bool HasWebsite() override;
    HRESULT ShowAbout() override;

    // The guide's contents page, whether it is there or not.
    QString UserGuidePath() const;
    // The configured website; an empty address when none is usable.
    static QUrl Website();

private:
    HRESULT OpenUserGuide();

    QString m_programFolder;
};
