#include "settings/NavigatorSettings.h"

#include "common/ReleasePtr.h"
#include "dataexchange/ParsePipeDelimitedString.h"
#include "dataexchange/PipeDelimitedStringReporter.h"
#include "dataexchange/WProperties.h"
#include "libs/toolwell/Formats.h"
#include "libs/toolwell/IHarborUtils.h"
#include "messaging/CNoteToolService.h"
#include "messaging/CViewerService.h"
#include "platform/AppFolders.h"
#include "platform/FileWrite.h"
#include "platform/RegularFile.h"
#include "platform/ScreenMetrics.h"
#include "settings/ISettingsWindow.h"
#include "settings/StorageRegistry.h"

#include <QDir>
#include <QFile>
#include <QFileInfo>
#include <QtEndian>

#include <algorithm>
#include <climits>

namespace {

const QString kPositionKey = QStringLiteral("applicationposition");
const QString kMaxLinkedDocumentsKey = QStringLiteral("maxlinkeddocuments");
const QString kDefaultFontSizeKey = QStringLiteral("defaultfontsize");

constexpr int kMessageCentreFeature = 6;
// Where a window found off the virtual screen is put back, edge by edge.
constexpr int kResetRight = 280;
constexpr int kResetBottom = 650;

std::unique_ptr<NavigatorSettings> g_instance;

// Reads a number as the C library does: leading blanks, an optional sign, digits, and
// whatever follows ignored; no digits read as 0, and a value out of range is clamped.
int ToInteger(const QString& text) {
    qsizetype i = 0;
    const qsizetype length = text.size();
    while (i < length && (text.at(i) == u' ' || (text.at(i) >= u'\t' && text.at(i) <= u'\r')))
        ++i;
    bool negative = false;
    if (i < length && (text.at(i) == u'+' || text.at(i) == u'-')) {
        negative = text.at(i) == u'-';
        ++i;
    }
    long long value = 0;
    for (; i < length && text.at(i) >= u'0' && text.at(i) <= u'9'; ++i) {
        value = value * 10 + (text.at(i).unicode() - u'0');
        if (value > static_cast<long long>(INT_MAX) + 1)
            value = static_cast<long long>(INT_MAX) + 1;
    }
    if (negative)
        value = -value;
    if (value > INT_MAX)
        return INT_MAX;
    return static_cast<int>(value);
}

bool GetText(DataExchange::IProperties* set, const QString& key, QString* text) {
    UnicodeStringPtr sink(text);
    return set->GetProperty(key, &sink) == S_OK;
}

// The rectangle that "applicationposition" asks for: left, top, width and height, put back
// on the virtual screen when it lies wholly above, below, left or right of it.
void ApplyPosition(const QString& text, WindowRect* position) {
    QList<int> numbers;
    const int count = ParseIntegerList(text, &numbers);
    if (count == 0) {
        *position = WindowRect{};
        return;
    }
    // The program always writes four numbers; a rectangle is not built from missing ones.
    if (count < 4)
        return;
    // Numbers beyond any screen are held where the edges can still be computed; they are off
    // the screen all the same.
    constexpr int kFar = 1 << 24;
    for (int& number : numbers)
        number = std::clamp(number, -kFar, kFar);
    WindowRect rect =
        WindowRect::FromGeometry(QRect(numbers.at(0), numbers.at(1), numbers.at(2), numbers.at(3)));
    const QRect screen = Platform::VirtualScreenRect();
    if (!screen.isEmpty()) {
        if (rect.bottom < screen.top() || rect.top > screen.top() + screen.height()) {
            rect.top = 0;
            rect.bottom = kResetBottom;
        }
        if (rect.right < screen.left() || rect.left > screen.left() + screen.width()) {
            rect.left = 0;
            rect.right = kResetRight;
        }
    }
    *position = rect;
}

bool MessageCentreAvailable() {
    IHarborUtils* utils = GetHarborUtilsInterface();
    return utils != nullptr && utils->IsFeatureAvailable(kMessageCentreFeature) == 1;
}

} // namespace

NavigatorSettings* NavigatorSettings::Instance() {
    if (!g_instance)
        g_instance.reset(new NavigatorSettings);
    g_instance->FillServices();
    return g_instance.get();
}

void NavigatorSettings::FillServices() {
    if (m_viewerService == nullptr)
        m_viewerService = CViewerService::GetInstance();
    if (m_noteToolService == nullptr)
        m_noteToolService = CNoteToolService::GetInstance();
}

void NavigatorSettings::DestroyInstance() {
    g_instance.reset();
}

NavigatorSettings::NavigatorSettings()
    : m_record(std::make_unique<NavigatorSettingsRecord>(
          WindowRect{}, 100, false, false, false, false, false, false, true, false, QString(), 12,
          QStringLiteral("Times New Roman"), QStringLiteral("255,255,255"), QString())) {}

NavigatorSettings::~NavigatorSettings() {
    if (m_viewerService != nullptr)
        m_viewerService->Release();
    if (m_noteToolService != nullptr)
        m_noteToolService->Release();
    m_record.reset();
    if (m_dataStoreHost != nullptr)
        m_dataStoreHost->Release();
    if (m_applicationInfo != nullptr)
        m_applicationInfo->Release();
}

QString NavigatorSettings::SettingsFilePath() {
    const QString folder = Platform::ApplicationDataFolder();
    if (folder.isEmpty())
        return {};
    return folder + QStringLiteral("/NavSettings.dat");
}

bool NavigatorSettings::Load() {
    const QString path = SettingsFilePath();
    if (path.isEmpty())
        return false;
    // What a save cut short by a kill left beside the file; only this navigator saves it.
    Platform::RemoveLeftSaveFiles(path);
    QFile file(path);
    if (!file.open(QIODevice::ReadOnly))
        return false;
    const qint64 length = file.size();
    const QByteArray bytes = file.readAll();
    file.close();
    // A short read: the file is not whole, keep what we have. A lone last byte is only half a
    // code unit and is dropped; every complete pair before it still counts.
    if (bytes.size() < length)
        return false;

    // Text after an embedded zero unit is ignored; a byte-order mark is not skipped, it
    // becomes part of the first key.
    QString text = QStringLiteral("");
    const qsizetype units = bytes.size() / 2;
    text.reserve(units);
    for (qsizetype i = 0; i < units; ++i) {
        const char16_t unit = qFromLittleEndian<char16_t>(bytes.constData() + 2 * i);
        if (unit == 0)
            break;
        text.append(QChar(unit));
    }

    ReleasePtr<DataExchange::IProperties> set(DataExchange::CreateProperties());
    DataExchange::ParsePipeDelimitedString(text, set.get());
    Settings::StorageRegistry::LoadAll(set.get());
    QString value;
    if (GetText(set.get(), kPositionKey, &value))
        ApplyPosition(value, &m_record->applicationPosition);
    if (GetText(set.get(), kMaxLinkedDocumentsKey, &value))
        m_record->maxLinkedDocuments = ToInteger(value);
    if (GetText(set.get(), kDefaultFontSizeKey, &value))
        m_record->defaultFontSize = ToInteger(value);
    return true;
}

bool NavigatorSettings::Save() {
    m_saveError.clear();
    const QString folder = Platform::ApplicationDataFolder();
    if (folder.isEmpty())
        return false;
    if (!QFileInfo(folder).isDir() && !QDir().mkpath(folder)) {
        m_saveError = QStringLiteral("The folder could not be made.");
        return false;
    }

    ReleasePtr<DataExchange::IProperties> set(DataExchange::CreateProperties());
    const WindowRect& position = m_record->applicationPosition;
    set->SetProperty(kPositionKey, QStringLiteral("%1,%2,%3,%4")
                                       .arg(position.left)
                                       .arg(position.top)
                                       .arg(position.Width())
                                       .arg(position.Height()));
    set->SetProperty(kMaxLinkedDocumentsKey, QString::number(m_record->maxLinkedDocuments));
    Settings::StorageRegistry::SaveAll(set.get());
    set->SetProperty(kDefaultFontSizeKey, QString::number(m_record->defaultFontSize));

    DataExchange::PipeDelimitedStringReporter writer;
    set->ReportProperties(&writer);
    set.reset();
    QString text;
    UnicodeStringPtr sink(&text);
    if (writer.GetString(&sink) != S_OK)
        return false;

    QByteArray bytes(text.size() * 2, Qt::Uninitialized);
    qToLittleEndian<char16_t>(text.utf16(), text.size(), bytes.data());
    return Platform::ReplaceFile(folder + QStringLiteral("/NavSettings.dat"), bytes, &m_saveError);
}

bool NavigatorSettings::SaveIfDirty() {
    if (!m_dirty)
        return true;
    // A failed save keeps the change, to be tried again at the next pass.
    if (!Save())
        return false;
    m_dirty = false;
    return true;
}

void NavigatorSettings::SetDataStoreHost(IDataStoreHost* host) {
    if (host != nullptr)
        host->AddRef();
    if (m_dataStoreHost != nullptr)
        m_dataStoreHost->Release();
    m_dataStoreHost = host;
}

void NavigatorSettings::SetApplicationInfo(Brindle::Application::IApplicationInfo* info) {
    if (info != nullptr)
        info->AddRef();
    if (m_applicationInfo != nullptr)
        m_applicationInfo->Release();
    m_applicationInfo = info;
}

WindowRect NavigatorSettings::GetApplicationPosition() const {
    return m_record->applicationPosition;
}

void NavigatorSettings::SetApplicationPosition(const WindowRect& position) {
    m_record->applicationPosition = position;
    MarkDirty();
}

int NavigatorSettings::GetMaxLinkedDocuments() const {
    return m_record->maxLinkedDocuments;
}

void NavigatorSettings::SetMaxLinkedDocuments(int count) {
    m_record->maxLinkedDocuments = count;
    MarkDirty();
}

bool NavigatorSettings::GetCleanDeletedOnClose() const {
    return m_record->cleanDeletedOnClose.Value();
}

void NavigatorSettings::SetCleanDeletedOnClose(bool clean) {
    m_record->cleanDeletedOnClose.SetValue(clean);
    MarkDirty();
}

bool NavigatorSettings::GetLaunchAppOnStart() const {
    return m_record->launchAppOnStart.Value();
}

void NavigatorSettings::SetLaunchAppOnStart(bool launch) {
    m_record->launchAppOnStart.SetValue(launch);
    MarkDirty();
}

void NavigatorSettings::ChooseTypeFilter(Settings::Bool NavigatorSettingsRecord::*filter,
                                         bool show) {
    if (!show)
        return;
    for (Settings::Bool NavigatorSettingsRecord::*each :
         {&NavigatorSettingsRecord::showNotes, &NavigatorSettingsRecord::showQmd,
          &NavigatorSettingsRecord::showDoc, &NavigatorSettingsRecord::showPdf,
          &NavigatorSettingsRecord::showAllTypes})
        ((*m_record).*each).SetValue(false);
    ((*m_record).*filter).SetValue(true);
    MarkDirty();
    FilterChanged();
}

void NavigatorSettings::FilterChanged() {
    if (m_filterChanged)
        m_filterChanged();
}

bool NavigatorSettings::GetShowNotes() const {
    return m_record->showNotes.Value();
}

void NavigatorSettings::SetShowNotes(bool show) {
    ChooseTypeFilter(&NavigatorSettingsRecord::showNotes, show);
}

bool NavigatorSettings::GetShowQmd() const {
    return m_record->showQmd.Value();
}

void NavigatorSettings::SetShowQmd(bool show) {
    ChooseTypeFilter(&NavigatorSettingsRecord::showQmd, show);
}

bool NavigatorSettings::GetShowDoc() const {
    return m_record->showDoc.Value();
}

void NavigatorSettings::SetShowDoc(bool show) {
    ChooseTypeFilter(&NavigatorSettingsRecord::showDoc, show);
}

bool NavigatorSettings::GetShowPdf() const {
    return m_record->showPdf.Value();
}

void NavigatorSettings::SetShowPdf(bool show) {
    ChooseTypeFilter(&NavigatorSettingsRecord::showPdf, show);
}

bool NavigatorSettings::GetShowAllTypes() const {
    return m_record->showAllTypes.Value();
}

void NavigatorSettings::SetShowAllTypes(bool show) {
    ChooseTypeFilter(&NavigatorSettingsRecord::showAllTypes, show);
}

bool NavigatorSettings::GetShowOpenedItemsOnly() const {
    return m_record->showOpenedItemsOnly.Value();
}

void NavigatorSettings::SetShowOpenedItemsOnly(bool show) {
    m_record->showOpenedItemsOnly.SetValue(show);
    MarkDirty();
    FilterChanged();
}

QString NavigatorSettings::GetLastSelectedItemId() const {
    return m_record->lastSelectedItemId.Value();
}

void NavigatorSettings::SetLastSelectedItemId(const QString& itemId) {
    m_record->lastSelectedItemId.SetValue(itemId);
    MarkDirty();
}

int NavigatorSettings::GetDefaultFontSize() const {
    return m_record->defaultFontSize;
}

void NavigatorSettings::SetDefaultFontSize(int size) {
    m_record->defaultFontSize = size;
    MarkDirty();
}

QString NavigatorSettings::GetDefaultFont() const {
    return m_record->defaultFont.Value();
}

void NavigatorSettings::SetDefaultFont(const QString& font) {
    m_record->defaultFont.SetValue(font);
    MarkDirty();
}

QString NavigatorSettings::GetDefaultBackgroundColor() const {
    return m_record->defaultBackgroundColor.Value();
}

void NavigatorSettings::SetDefaultBackgroundColor(const QString& color) {
    m_record->defaultBackgroundColor.SetValue(color);
    MarkDirty();
}

QString NavigatorSettings::GetDefaultBackgroundImage() const {
    return m_record->defaultBackgroundImage.Value();
}

void NavigatorSettings::SetDefaultBackgroundImage(const QString& path) {
    m_record->defaultBackgroundImage.SetValue(path);
    MarkDirty();
}

bool NavigatorSettings::GetShowMessageCentre() const {
    return MessageCentreAvailable() && m_showMessageCentre.Value();
}

void NavigatorSettings::SetShowMessageCentre(bool show) {
    const bool shown = show && MessageCentreAvailable();
    m_showMessageCentre.SetValue(shown);
    MarkDirty();
    if (m_frame != nullptr)
        m_frame->ShowMessageCentre(shown);
}

void NavigatorSettings::SetKeepOnTop(bool onTop) {
    m_keepOnTop.SetValue(onTop);
    MarkDirty();
    if (m_frame != nullptr)
        m_frame->SetKeepOnTop(onTop);
}

void NavigatorSettings::SetShowFrame(bool show) {
    m_showFrame.SetValue(show);
    MarkDirty();
    if (m_frame != nullptr)
        m_frame->ShowFrame(show);
}
