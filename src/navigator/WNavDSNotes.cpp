#include "navigator/WNavDS.h"

#include "catalog/IDataStoreService.h"
#include "common/ReleasePtr.h"
#include "dataexchange/PipeDelimitedStringReporter.h"
#include "dataexchange/WProperties.h"
#include "libs/toolwell/Formats.h"
#include "messaging/INoteToolService.h"
#include "notes/CBasicNoteConstructor.h"
#include "notes/NoteConstructorRegistry.h"
#include "notes/NoteDefaults.h"
#include "settings/NavigatorSettings.h"

#include <QFile>

#include <ctime>

namespace {

// The look every new note starts with: the settings' defaults.
NoteDefaults DefaultsFromSettings() {
    NoteDefaults defaults;
    NavigatorSettings* settings = NavigatorSettings::Instance();
    if (settings->GetRecord() != nullptr) {
        defaults.font = settings->GetDefaultFont();
        defaults.fontSize = settings->GetDefaultFontSize();
        defaults.backgroundColor = settings->GetDefaultBackgroundColor();
        defaults.backgroundImage = settings->GetDefaultBackgroundImage();
    }
    return defaults;
}

} // namespace

HRESULT WNavDS::AddNoteFromConstructor(const QString& title, CBasicNoteConstructor* constructor,
                                       int open, int placement, IUnicodeString* idCallback) {
    if (constructor == nullptr || m_noteToolService == nullptr)
        return E_FAIL;
    QString now;
    FormatTime(&now, static_cast<std::int64_t>(std::time(nullptr)));
    const NoteDefaults defaults = DefaultsFromSettings();

    QString noteTitle = title;
    if (noteTitle.isEmpty()) {
        UnicodeStringPtr titleSink(&noteTitle);
        m_noteToolService->GetDefaultNoteTitle(&titleSink);
    }
    QString fileName;
    UnicodeStringPtr fileSink(&fileName);
    m_noteToolService->GetNoteFileName(&fileSink);

    ReleasePtr<DataExchange::IProperties> set(DataExchange::CreateProperties());
    set->SetProperty(QStringLiteral("type"), QStringLiteral("note"));
    set->SetProperty(QStringLiteral("title"), noteTitle);
    set->SetProperty(QStringLiteral("filename"), fileName);
    set->SetProperty(QStringLiteral("datecreated"), now);
    set->SetProperty(QStringLiteral("dateaccessed"), now);
    set->SetProperty(QStringLiteral("font"), defaults.font);
    set->SetProperty(QStringLiteral("fontsize"), QString::number(defaults.fontSize));
    set->SetProperty(QStringLiteral("backgroundcolor"), defaults.backgroundColor);
    set->SetProperty(QStringLiteral("backgroundimage"), defaults.backgroundImage);
    set->SetProperty(QStringLiteral("size"), QStringLiteral("525,400"));
    set->SetProperty(QStringLiteral("open"),
                     open == 1 ? QStringLiteral("true") : QStringLiteral("false"));

    NavListItemData* const previousSelection = m_selected;
    QString itemId;
    UnicodeStringPtr idSink(&itemId);
    if (AddNewItem(set.get(), placement, &idSink) != S_OK)
        return E_FAIL;
    if (idCallback != nullptr)
        idCallback->Assign(itemId);

    QString notePath;
    AppendUnicodeStringPtr pathSink(&notePath);
    m_noteToolService->GetNoteFolder(m_dataStoreHost, itemId, &pathSink);
    m_noteToolService->GetNoteFileName(&pathSink);

    // The settings' look goes into the file as it went into the catalog.
    constructor->SetNoteDefaults(defaults);
    const int made = constructor->Create(notePath, noteTitle);
    if (made == 1) {
        if (open == 1) {
            set->SetProperty(QStringLiteral("itemid"), itemId);
            m_noteToolService->SetEventTarget(this);
            QString propertyText;
            UnicodeStringPtr textSink(&propertyText);
            DataExchange::PipeDelimitedStringReporter reporter;
            set->ReportProperties(&reporter);
            reporter.GetString(&textSink);
            m_noteToolService->OpenNote(notePath, propertyText);
        }
        m_changed = true;
        return S_OK;
    }

    // No note could be made: the new item goes again, with its folder.
    if (IDataStoreService* service = GetDataStoreService())
        service->DeleteItem(itemId);
    if (NavListItemData* record = FindItem(itemId))
        RemoveItemTree(record);
    if (previousSelection != nullptr)
        SelectItem(previousSelection);
    m_changed = true;
    return E_FAIL;
}

HRESULT WNavDS::AddNoteFromFile(const QString& source, IUnicodeString* idCallback) {
    ReleasePtr<CBasicNoteConstructor> constructor(CreateNoteConstructor(source));
    if (!constructor)
        return E_FAIL;
    constructor->SetPreformatted(0);
    QString title;
    if (m_noteToolService != nullptr) {
        UnicodeStringPtr titleSink(&title);
        m_noteToolService->GetDefaultNoteTitle(&titleSink);
    }
    const HRESULT result = AddNoteFromConstructor(title, constructor.get(), 1, 0, idCallback);
    // The file was handed over to become a note; it goes only once the note holds its content.
    if (result == S_OK)
        QFile::remove(source);
    return result;
}
