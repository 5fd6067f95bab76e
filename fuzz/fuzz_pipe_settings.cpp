// The pipe-delimited property text and the settings file made of it: whatever the bytes, the
// parser and the settings load end, and what the program writes back reads back the same.
#include "FuzzEnvironment.h"

#include "common/ReleasePtr.h"
#include "dataexchange/ParsePipeDelimitedString.h"
#include "dataexchange/PipeDelimitedStringReporter.h"
#include "dataexchange/WProperties.h"
#include "settings/NavigatorSettings.h"

#include <cstddef>
#include <cstdint>

namespace {

QString Serialise(const QString& text) {
    ReleasePtr<DataExchange::IProperties> set(DataExchange::CreateProperties());
    DataExchange::ParsePipeDelimitedString(text, set.get());
    DataExchange::PipeDelimitedStringReporter reporter;
    set->ReportProperties(&reporter);
    QString written;
    UnicodeStringPtr sink(&written);
    reporter.GetString(&sink);
    return written;
}

// Loads the settings file as start-up does and saves it again; answers the written bytes.
QByteArray LoadAndSave() {
    NavigatorSettings* settings = NavigatorSettings::Instance();
    settings->Load();
    settings->Save();
    const QByteArray written = FuzzEnvironment::ReadFile(NavigatorSettings::SettingsFilePath());
    FuzzEnvironment::ResetProgram();
    return written;
}

} // namespace

extern "C" int LLVMFuzzerInitialize(int* argc, char*** argv) {
    // The settings put a window back on the screen: the screen needs the GUI application.
    FuzzEnvironment::SetUp(argc, argv, FuzzEnvironment::Application::Gui);
    return 0;
}

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    const QByteArray bytes(reinterpret_cast<const char*>(data), qsizetype(size));

    // The same bytes as the text itself, code unit by code unit (lone surrogates included).
    const QString text =
        QString::fromUtf16(reinterpret_cast<const char16_t*>(bytes.constData()), bytes.size() / 2);
    const QString once = Serialise(text);
    FuzzEnvironment::Require(Serialise(once) == once, "pipe-delimited text reads back the same");

    FuzzEnvironment::Require(
        FuzzEnvironment::WriteFile(NavigatorSettings::SettingsFilePath(), bytes),
        "settings file written");
    const QByteArray first = LoadAndSave();
    const QByteArray second = LoadAndSave();
    FuzzEnvironment::Require(first == second, "a saved settings file saves again unchanged");
    return 0;
}
