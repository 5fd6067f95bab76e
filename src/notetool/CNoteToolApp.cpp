#include "notetool/CNoteToolApp.h"

#include "companion/CompanionBus.h"
#include "libs/toolwell/AmbrelBus.h"
#include "libs/toolwell/Formats.h"
#include "notetool/CNoteEditor.h"
#include "notetool/CNoteWindow.h"
#include "platform/RegularFile.h"

#include "ui/ShowCommand.h"

#include <QCryptographicHash>
#include <QDBusMessage>
#include <QFileInfo>
#include <QPrintDialog>
#include <QPrinter>

#include <ctime>

namespace {

using namespace Qt::StringLiterals;

const QString kObjectPath = u"/NoteTool"_s;
const QString kInterface = u"com.brindle.QuillmarkAmbrel.NoteTool"_s;
constexpr QSize kDefaultSize(525, 400);
constexpr int kHandOverTimeoutMs = 5000;

QString Now() {
    QString text;
    FormatTime(&text, static_cast<std::int64_t>(std::time(nullptr)));
    return text;
}

bool IsTrue(const QString& text) {
    return text.compare("true"_L1, Qt::CaseInsensitive) == 0;
}

} // namespace

CNoteToolApp::CNoteToolApp(CompanionBus* bus, const QString& notePath,
                           const QMap<QString, QString>& properties, QObject* parent)
    : QObject(parent), m_bus(bus), m_file(notePath), m_itemId(properties.value(u"itemid"_s)),
      m_startProperties(properties) {
    m_autoSave.setSingleShot(true);
    m_autoSave.setInterval(kAutoSaveMs);
    connect(&m_autoSave, &QTimer::timeout, this, [this] {
        if (IsChanged())
            Save();
    });
}

CNoteToolApp::~CNoteToolApp() = default;

QString CNoteToolApp::BusName(const QString& notePath) {
    const QFileInfo file(notePath);
    const QString canonical = file.canonicalFilePath();
    const QByteArray digest =
        QCryptographicHash::hash(
            (canonical.isEmpty() ? file.absoluteFilePath() : canonical).toUtf8(),
            QCryptographicHash::Sha1)
            .toHex();
    // A part of a bus name must not begin with a digit.
    return AmbrelBus::ServiceName(u"NoteTool.N"_s + QString::fromLatin1(digest));
}

bool CNoteToolApp::Start() {
    if (m_bus->IsConnected()) {
        // The object first: a second start that finds the name must find the object too.
        m_bus->Connection().registerObject(kObjectPath, this,
                                           QDBusConnection::ExportScriptableSlots);
        if (!m_bus->RegisterName(BusName(m_file.Path()))) {
            m_bus->Connection().unregisterObject(kObjectPath);
            m_bus->Connection().call(QDBusMessage::createMethodCall(BusName(m_file.Path()),
                                                                    kObjectPath, kInterface,
                                                                    u"Activate"_s),
                                     QDBus::Block, kHandOverTimeoutMs);
            return false;
        }
        connect(m_bus, &CompanionBus::HubNotified, this, &CNoteToolApp::OnHubNotified);
        connect(m_bus, &CompanionBus::WindowCommandReceived, this, &CNoteToolApp::OnWindowCommand);
    }

    // A note without a file yet takes the look the navigator gave it.
    ApplyProperties(m_startProperties, false);
    const QString catalogTitle = m_content.title;
    // A note tool killed between writing the note under a temporary name and renaming it left
    // that file beside the note; the note's bus name makes this the only tool saving it.
    Platform::RemoveLeftSaveFiles(m_file.Path());
    m_fileState = m_file.Load(&m_content);
    if (!catalogTitle.isEmpty())
        m_content.title = catalogTitle;

    m_window = std::make_unique<CNoteWindow>();
    m_window->SetNoteTitle(m_content.title);
    m_window->Editor()->ShowNote(m_content, m_file.Path());
    m_window->ShowCurrentFormat();
    if (m_fileState == CNoteFile::State::Unreadable)
        m_window->SetReadOnly(tr("This note's file cannot be read; it is shown read-only and "
                                 "never written over."));
    ApplyProperties(m_startProperties, true);

    connect(m_window.get(), &CNoteWindow::Activated, this, [this] {
        Post(u"EventNotification"_s, {{u"event"_s, u"WindowOnActivate"_s}});
    });
    connect(m_window.get(), &CNoteWindow::SaveRequested, this, &CNoteToolApp::Save);
    connect(m_window.get(), &CNoteWindow::PrintRequested, this, &CNoteToolApp::Print);
    connect(m_window.get(), &CNoteWindow::TitleEdited, this, &CNoteToolApp::OnChanged);
    connect(m_window.get(), &CNoteWindow::CloseRequested, this, &CNoteToolApp::OnCloseRequested);
    connect(m_window->Editor()->document(), &QTextDocument::contentsChanged, this,
            &CNoteToolApp::OnChanged);

    m_window->show();
    Post(u"NoteOpenNotification"_s, {{u"openwindowhandle"_s, QString::number(kWindowNumber)}});
    return true;
}

void CNoteToolApp::ApplyProperties(const QMap<QString, QString>& properties, bool fromNavigator) {
    if (!fromNavigator) {
        // The look of a note whose file does not exist yet; a file's header wins over it.
        if (properties.contains(u"title"_s))
            m_content.title = properties.value(u"title"_s);
        if (properties.contains(u"font"_s))
            m_content.fontFamily = properties.value(u"font"_s);
        bool valid = false;
        const int size = properties.value(u"fontsize"_s).toInt(&valid);
        if (valid && size > 0)
            m_content.fontSize = static_cast<std::uint32_t>(size);
        if (properties.contains(u"backgroundcolor"_s))
            m_content.backgroundColor = ParseColor(properties.value(u"backgroundcolor"_s));
        if (properties.contains(u"backgroundimage"_s))
            m_content.backgroundImage = properties.value(u"backgroundimage"_s);
        return;
    }
    if (properties.contains(u"title"_s) && properties.value(u"title"_s) != m_window->NoteTitle())
        m_window->SetNoteTitle(properties.value(u"title"_s));
    if (properties.contains(u"keepontop"_s)) {
        const bool onTop = IsTrue(properties.value(u"keepontop"_s));
        if (m_window->windowFlags().testFlag(Qt::WindowStaysOnTopHint) != onTop) {
            const bool visible = m_window->isVisible();
            m_window->setWindowFlag(Qt::WindowStaysOnTopHint, onTop);
            if (visible)
                m_window->show();
        }
    }
    QSize size = m_window->isVisible() ? m_window->size() : kDefaultSize;
    if (properties.contains(u"size"_s)) {
        QList<int> numbers;
        if (ParseIntegerList(properties.value(u"size"_s), &numbers) == 2 && numbers[0] > 0 &&
            numbers[1] > 0)
            size = QSize(numbers[0], numbers[1]);
    }
    m_window->resize(size);
    if (properties.value(u"open"_s).compare("false"_L1, Qt::CaseInsensitive) == 0 &&
        m_window->isVisible())
        Close();
}

bool CNoteToolApp::IsChanged() const {
    return m_window && (m_window->Editor()->document()->isModified() ||
                        m_window->NoteTitle() != m_content.title || m_headerChanged);
}

void CNoteToolApp::OnChanged() {
    if (IsChanged() && !m_autoSave.isActive())
        m_autoSave.start();
}

bool CNoteToolApp::Save() {
    if (!m_window)
        return false;
    NoteContent content = m_content;
    content.title = m_window->NoteTitle();
    content.body = m_window->Editor()->BodyHtml();
    if (!m_file.Save(content)) {
        if (m_fileState != CNoteFile::State::Unreadable)
            m_window->ShowMessage(tr("The note could not be saved: %1").arg(m_file.SaveError()));
        return false;
    }
    m_content = content;
    m_fileState = CNoteFile::State::Read;
    m_headerChanged = false;
    m_window->Editor()->document()->setModified(false);
    m_autoSave.stop();
    Post(u"UpdateMetadata"_s, {{u"title"_s, content.title}, {u"dateaccessed"_s, Now()}});
    return true;
}

void CNoteToolApp::OnCloseRequested(bool* allowed) {
    // A note that cannot be written stays open, so that nothing typed is lost.
    if (IsChanged() && m_fileState != CNoteFile::State::Unreadable && !Save()) {
        *allowed = false;
        return;
    }
    m_autoSave.stop();
    const QSize size = m_window->size();
    Post(u"UpdateMetadata"_s,
         {{u"open"_s, u"false"_s},
          {u"size"_s, QString::number(size.width()) + u',' + QString::number(size.height())}});
    // One round trip to the bus: everything posted has left before the program ends.
    if (m_bus->IsConnected())
        m_bus->IsNavigatorRunning();
    m_closed = true;
    Q_EMIT Closed();
}

void CNoteToolApp::Post(const QString& name, QMap<QString, QString> properties) {
    if (m_itemId.isEmpty())
        return;
    properties.insert(u"itemid"_s, m_itemId);
    m_bus->Post(name, properties);
}

void CNoteToolApp::Activate() {
    if (!m_window || m_closed)
        return;
    if (m_window->isMinimized())
        m_window->showNormal();
    m_window->show();
    m_window->raise();
    m_window->activateWindow();
}

void CNoteToolApp::SetTitle(const QString& title) {
    if (!m_window || m_closed || m_fileState == CNoteFile::State::Unreadable)
        return;
    m_window->SetNoteTitle(title);
    OnChanged();
}

void CNoteToolApp::Close() {
    if (m_window && !m_closed)
        m_window->close();
}

void CNoteToolApp::OnHubNotified(const QString& name, const QMap<QString, QString>& properties) {
    if (m_itemId.isEmpty() || m_closed ||
        properties.value(u"itemid"_s).compare(m_itemId, Qt::CaseInsensitive) != 0)
        return;
    if (name == u"ActivateNote") {
        Activate();
    } else if (name == u"PrintNote") {
        Print();
    } else if (name == u"UpdateNoteProperties") {
        NoteContent look = m_content;
        ApplyProperties(properties, false);
        // The navigator's change of the note's look goes into the header at the next save.
        if (m_content.fontFamily != look.fontFamily || m_content.fontSize != look.fontSize ||
            m_content.backgroundColor != look.backgroundColor ||
            m_content.backgroundImage != look.backgroundImage) {
            m_headerChanged = true;
            m_window->Editor()->ApplyLook(m_content);
            OnChanged();
        }
        m_content.title = look.title;
        ApplyProperties(properties, true);
    }
}

void CNoteToolApp::OnWindowCommand(qint64 handle, const QString& command, int showCommand) {
    if (handle != kWindowNumber || !m_window || m_closed)
        return;
    if (command == u"close") {
        Close();
    } else if (command == u"activate") {
        Activate();
    } else if (command == u"focus") {
        m_window->activateWindow();
        m_window->Editor()->setFocus();
    } else if (command == u"show") {
        ApplyShowCommand(m_window.get(), showCommand);
    }
}

void CNoteToolApp::Print() {
    if (!m_window || m_closed)
        return;
    if (!m_printer)
        m_printer = std::make_unique<QPrinter>(QPrinter::HighResolution);
    m_printer->setDocName(m_window->NoteTitle());
    // A child of the window without a loop of its own: closing the window ends it too.
    auto* dialog = new QPrintDialog(m_printer.get(), m_window.get());
    dialog->setAttribute(Qt::WA_DeleteOnClose);
    connect(dialog, qOverload<QPrinter*>(&QPrintDialog::accepted), this,
            [this](QPrinter* printer) { m_window->Editor()->print(printer); });
    dialog->open();
}
