// The messages of the other programs, with any names and property sets, dispatched against a
// small notebook as the idle pass dispatches them. Whatever they ask, the navigator changes
// files only inside its data folder: the rest of the home, with a folder of the user's own
// files that the notebook links to, stays as it was.
#include "FuzzEnvironment.h"

#include "app/CNavigatorApp.h"
#include "catalog/IDataStoreService.h"
#include "common/ReleasePtr.h"
#include "libs/toolwell/IDataStoreHost.h"
#include "messaging/CNavInstanceMgr.h"
#include "navigator/WNavDS.h"
#include "platform/Registry.h"

#include <QDirIterator>
#include <QFileInfo>
#include <QMap>

#include <fuzzer/FuzzedDataProvider.h>

#include <cstddef>
#include <cstdint>
#include <cstdio>

namespace {

const char* const kNote = "0C6E2B7A-3F41-4D8E-9A55-1B2C3D4E5F60";
const char* const kFolder = "7D9F0A1B-2C3D-4E5F-8071-92A3B4C5D6E7";
const char* const kInner = "A1B2C3D4-E5F6-4071-8293-A4B5C6D7E8F9";
const char* const kDocument = "F0E1D2C3-B4A5-4697-8879-6A5B4C3D2E1F";
const char* const kDeleted = "5A4B3C2D-1E0F-4A9B-8C7D-6E5F4A3B2C1D";

const char* const kNames[] = {"RequestNewNoteWithClipboard",
                              "EventNotification",
                              "DocumentOpenNotification",
                              "DocumentWaitForOpenNotification",
                              "NoteOpenNotification",
                              "SaveDocumentToNotebook",
                              "WindowShowNotification",
                              "SendToBlog",
                              "UpdateMetadata",
                              "OpenItemByItemID",
                              "RequestViewerFromFile",
                              "RequestClipboardPasteToQm",
                              "RequestExportToQm"};
const char* const kKeys[] = {"itemid",
                             "type",
                             "title",
                             "open",
                             "openwindowhandle",
                             "event",
                             "WindowShowCmdType",
                             "filename",
                             "path",
                             "QmChoice",
                             "deleted",
                             "linked",
                             "subtype",
                             "dateaccessed",
                             "size",
                             "font",
                             "fontsize",
                             "backgroundcolor",
                             "backgroundimage",
                             "keepontop",
                             "position"};

QString Decoy() {
    return FuzzEnvironment::Home() + QStringLiteral("/decoy");
}

QByteArray Utf16(const QString& text) {
    QByteArray bytes;
    for (const QChar c : QString(QChar(0xFEFF)) + text) {
        bytes.append(char(c.unicode() & 0xFF));
        bytes.append(char(c.unicode() >> 8));
    }
    return bytes;
}

QString Item(const char* kind, const char* id, const QString& properties) {
    return QStringLiteral("<%1 uuid=\"%2\"><properties>%3</properties></%1>")
        .arg(QLatin1StringView(kind), QLatin1StringView(id), properties);
}

// The notebook every input starts from: a note, a folder with a note in it, a linked document
// in the decoy folder and a deleted note.
void WriteNotebook() {
    const QString catalogFolder = FuzzEnvironment::AppDataFolder() + QStringLiteral("/Catalog/");
    const QString note = QStringLiteral("<type>note</type><title>%1</title><filename>note.htm"
                                        "</filename><open>false</open>");
    const QString text =
        QStringLiteral("<?xml version=\"1.0\" encoding=\"UTF-16\"?><archive majorversion=\"1\" "
                       "minorversion=\"0\"><organization scheme=\"folders\"><root>"
                       "<child uuidref=\"%1\"/><child uuidref=\"%2\"><child uuidref=\"%3\"/>"
                       "</child><child uuidref=\"%4\"/><child uuidref=\"%5\"/></root>"
                       "</organization><items>")
            .arg(QLatin1StringView(kNote), QLatin1StringView(kFolder), QLatin1StringView(kInner),
                 QLatin1StringView(kDocument), QLatin1StringView(kDeleted)) +
        Item("note", kNote, note.arg(QStringLiteral("First"))) +
        Item("folder", kFolder, QStringLiteral("<type>folder</type><title>Folder</title>")) +
        Item("note", kInner, note.arg(QStringLiteral("Inner"))) +
        Item("document", kDocument,
             QStringLiteral("<type>document</type><title>report.pdf</title><subtype>pdf"
                            "</subtype><linked>true</linked><path>%1/report.pdf</path>")
                 .arg(Decoy())) +
        Item("note", kDeleted,
             note.arg(QStringLiteral("Gone")) + QStringLiteral("<deleted>true</deleted>")) +
        QStringLiteral("</items></archive>");
    FuzzEnvironment::WriteFile(catalogFolder + QStringLiteral("catalog.xml"), Utf16(text));
    for (const char* id : {kNote, kInner, kDeleted})
        FuzzEnvironment::WriteFile(catalogFolder + QLatin1StringView(id) +
                                       QStringLiteral("/note.htm"),
                                   QByteArrayLiteral("<HTML><BODY><DIV>text</DIV></BODY></HTML>"));
}

// Every file and folder of the home outside the data folder and the program's registry file,
// with size and time of change.
QStringList Outside() {
    QStringList entries;
    const QString data = FuzzEnvironment::AppDataFolder();
    const QString registry = Platform::Registry::UserFile();
    QDirIterator it(FuzzEnvironment::Home(),
                    QDir::AllEntries | QDir::NoDotAndDotDot | QDir::Hidden | QDir::System,
                    QDirIterator::Subdirectories);
    while (it.hasNext()) {
        const QFileInfo info = it.nextFileInfo();
        const QString path = info.filePath();
        if (path == data || path.startsWith(data + u'/') || data.startsWith(path + u'/'))
            continue;
        // The program's own registry file (the recent items live there) and its folders.
        if (path == registry || registry.startsWith(path + u'/'))
            continue;
        entries.append(QStringLiteral("%1 %2 %3")
                           .arg(path)
                           .arg(info.size())
                           .arg(info.lastModified().toMSecsSinceEpoch()));
    }
    entries.sort();
    return entries;
}

QStringList g_outside;

QString Value(FuzzedDataProvider& input) {
    const QString values[] = {
        QLatin1StringView(kNote),
        QLatin1StringView(kFolder),
        QLatin1StringView(kInner),
        QLatin1StringView(kDocument),
        QLatin1StringView(kDeleted),
        QStringLiteral("root"),
        QStringLiteral("true"),
        QStringLiteral("false"),
        QStringLiteral("note"),
        QStringLiteral("document"),
        QStringLiteral("WindowOnActivate"),
        QStringLiteral("note.htm"),
        QStringLiteral("report.pdf"),
        QStringLiteral("../../../decoy/report.pdf"),
        Decoy(),
        Decoy() + QStringLiteral("/report.pdf"),
        Decoy() + QStringLiteral("/notes.txt"),
        QStringLiteral("5"),
        QStringLiteral("0"),
        QStringLiteral("-1"),
    };
    if (input.ConsumeBool())
        return values[input.ConsumeIntegralInRange<std::size_t>(0, std::size(values) - 1)];
    return QString::fromStdString(input.ConsumeRandomLengthString(48));
}

} // namespace

extern "C" int LLVMFuzzerInitialize(int* argc, char*** argv) {
    FuzzEnvironment::SetUp(argc, argv, FuzzEnvironment::Application::Gui);
    FuzzEnvironment::WriteFile(Decoy() + QStringLiteral("/report.pdf"), "%PDF-1.4\n");
    FuzzEnvironment::WriteFile(Decoy() + QStringLiteral("/notes.txt"), "my own notes\n");
    FuzzEnvironment::WriteFile(Decoy() + QStringLiteral("/sub/note.htm"), "<HTML></HTML>");
    g_outside = Outside();
    return 0;
}

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    static CNavigatorApp application{{QStringLiteral("ambrel-navigator")}};
    FuzzEnvironment::RemoveAppData();
    WriteNotebook();

    const FuzzEnvironment::RecordingPlatform recording;
    {
        ReleasePtr<IDataStoreHost> host(GetDataStoreHost());
        IDataStoreService* service = CreateDataStoreService(host.get());
        FuzzEnvironment::Require(service != nullptr, "a data store service");
        WNavDS* model = WNavDS::Instance();
        model->SetDataStoreHost(host.get());
        model->Initialize();

        CNavInstanceMgr manager(&application);
        FuzzedDataProvider input(data, size);
        const int count = input.ConsumeIntegralInRange(1, 6);
        for (int i = 0; i < count && input.remaining_bytes() > 0; ++i) {
            const QString name = input.ConsumeBool()
                                     ? QString::fromLatin1(input.PickValueInArray(kNames))
                                     : QString::fromStdString(input.ConsumeRandomLengthString(32));
            QMap<QString, QString> properties;
            const int pairs = input.ConsumeIntegralInRange(0, 6);
            for (int pair = 0; pair < pairs; ++pair) {
                const QString key =
                    input.ConsumeBool()
                        ? QString::fromLatin1(input.PickValueInArray(kKeys))
                        : QString::fromStdString(input.ConsumeRandomLengthString(16));
                properties.insert(key, Value(input));
            }
            manager.OnMessage(name, properties);
            if (input.ConsumeBool())
                manager.OnWindowsGone({input.ConsumeIntegralInRange<Platform::WindowHandle>(0, 8)});
        }
        manager.ProcessQueue();
        service->Save();
    }
    FuzzEnvironment::ResetProgram();
    const QStringList outside = Outside();
    if (outside != g_outside) {
        for (const QString& entry : g_outside)
            if (!outside.contains(entry))
                std::fprintf(stderr, "before: %s\n", qPrintable(entry));
        for (const QString& entry : outside)
            if (!g_outside.contains(entry))
                std::fprintf(stderr, "after:  %s\n", qPrintable(entry));
    }
    FuzzEnvironment::Require(outside == g_outside,
                             "nothing outside the data folder was created, changed or removed");
    return 0;
}
