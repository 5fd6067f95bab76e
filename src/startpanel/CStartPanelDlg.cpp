#include "startpanel/CStartPanelDlg.h"

#include "app/SystemIntegration.h"
#include "startpanel/RecentItems.h"
#include "startpanel/StartPanelActions.h"
#include "ui/AmbrelIcons.h"

#include <QCheckBox>
#include <QEvent>
#include <QFileDialog>
#include <QFrame>
#include <QHBoxLayout>
#include <QLabel>
#include <QToolButton>
#include <QVBoxLayout>

#include <functional>

namespace {

constexpr int kNewNote = 32769;
constexpr int kOpenDocument = 32774;
constexpr int kSnapshot = 32771;
// Tree picture indexes of a note and a document.
constexpr int kNoteImage = 14;
constexpr int kDocumentImage = 8;

QToolButton* CommandButton(int commandId, const QString& text, const QString& description,
                           QWidget* parent) {
    auto* button = new QToolButton(parent);
    button->setText(text);
    button->setIcon(AmbrelIcons::CommandImage(commandId));
    button->setIconSize(QSize(48, 48));
    button->setToolButtonStyle(Qt::ToolButtonTextUnderIcon);
    button->setAutoRaise(true);
    button->setMinimumSize(112, 96);
    button->setSizePolicy(QSizePolicy::Expanding, QSizePolicy::Fixed);
    button->setAccessibleName(text);
    button->setAccessibleDescription(description);
    button->setToolTip(description);
    return button;
}

QLabel* Heading(const QString& text, QWidget* parent) {
    auto* label = new QLabel(text, parent);
    QFont font = label->font();
    font.setBold(true);
    label->setFont(font);
    label->setAccessibleName(text);
    return label;
}

} // namespace

CStartPanelDlg::CStartPanelDlg(StartPanelActions& actions, QWidget* parent)
    : QDialog(parent), m_actions(actions) {
    setWindowTitle(QStringLiteral("Ambrel Start Panel"));
    setAccessibleName(windowTitle());
    setWindowIcon(AmbrelIcons::CommandImage(kNewNote));

    auto* layout = new QVBoxLayout(this);
    layout->setContentsMargins(16, 16, 16, 12);
    layout->setSpacing(10);

    layout->addWidget(Heading(QStringLiteral("Start"), this));
    auto* commands = new QHBoxLayout;
    commands->setSpacing(8);
    const struct {
        int id;
        QString text;
        QString description;
        std::function<void()> act;
    } buttons[] = {
        {kNewNote, QStringLiteral("New Note"), QStringLiteral("Create a new note"),
         [this] { m_actions.NewNote(); }},
        {kOpenDocument, QStringLiteral("Open Document"),
         QStringLiteral("Choose a document to link and view"), [this] { ChooseDocument(); }},
        {kSnapshot, QStringLiteral("Snapshot to New Note"),
         QStringLiteral("Take a snapshot of the screen into a new note"),
         [this] { m_actions.SnapshotToNewNote(); }},
    };
    for (const auto& entry : buttons) {
        QToolButton* button = CommandButton(entry.id, entry.text, entry.description, this);
        connect(button, &QToolButton::clicked, this, entry.act);
        commands->addWidget(button);
    }
    layout->addLayout(commands);

    auto* line = new QFrame(this);
    line->setFrameShape(QFrame::HLine);
    line->setFrameShadow(QFrame::Sunken);
    layout->addWidget(line);

    layout->addWidget(Heading(QStringLiteral("Recent Notes and Documents"), this));
    m_recentLayout = new QVBoxLayout;
    m_recentLayout->setSpacing(2);
    layout->addLayout(m_recentLayout);
    m_noRecentItems = new QLabel(QStringLiteral("No notes or documents used yet."), this);
    m_noRecentItems->setAccessibleName(m_noRecentItems->text());
    m_noRecentItems->setEnabled(false);
    layout->addWidget(m_noRecentItems);
    layout->addStretch(1);

    m_launchOnStart =
        new QCheckBox(QStringLiteral("Launch Start Panel when Quillmark Ambrel Launches"), this);
    m_launchOnStart->setAccessibleName(m_launchOnStart->text());
    m_launchOnStart->setChecked(IsStartPanelLaunchOnStart());
    connect(m_launchOnStart, &QCheckBox::toggled, this, &SetStartPanelLaunchOnStart);
    layout->addWidget(m_launchOnStart);

    setMinimumWidth(420);
    RefreshRecentItems();
}

void CStartPanelDlg::RefreshRecentItems() {
    while (QLayoutItem* item = m_recentLayout->takeAt(0)) {
        delete item->widget();
        delete item;
    }
    const QList<RecentItem> items = RecentItems(RecentCount);
    for (const RecentItem& item : items) {
        auto* button = new QToolButton(this);
        const QString title = item.title.isEmpty() ? QStringLiteral("(untitled)") : item.title;
        button->setText(title);
        button->setIcon(AmbrelIcons::TreeImage(item.document ? kDocumentImage : kNoteImage));
        button->setIconSize(QSize(24, 24));
        button->setToolButtonStyle(Qt::ToolButtonTextBesideIcon);
        button->setAutoRaise(true);
        button->setSizePolicy(QSizePolicy::Expanding, QSizePolicy::Fixed);
        button->setAccessibleName(title);
        button->setAccessibleDescription(item.document ? QStringLiteral("Open this document")
                                                       : QStringLiteral("Open this note"));
        button->setToolTip(button->accessibleDescription());
        const QString itemId = item.itemId;
        connect(button, &QToolButton::clicked, this,
                [this, itemId] { m_actions.OpenItem(itemId); });
        m_recentLayout->addWidget(button);
    }
    m_noRecentItems->setVisible(items.isEmpty());
}

void CStartPanelDlg::BringToFront() {
    if (isMinimized() || isHidden())
        showNormal();
    raise();
    activateWindow();
}

void CStartPanelDlg::ApplyWindowCommand(qint64 handle, const QString& command, int showCommand) {
    if (handle != 0)
        return;
    if (command == u"close") {
        // Finishes the dialog even while it is hidden, where a close would not.
        reject();
    } else if (command == u"activate") {
        BringToFront();
    } else if (command == u"focus") {
        activateWindow();
    } else if (command == u"show") {
        switch (showCommand) {
        case 0:
            hide();
            break;
        case 3:
            showMaximized();
            break;
        case 6:
            showMinimized();
            break;
        case 8:
            setAttribute(Qt::WA_ShowWithoutActivating);
            show();
            setAttribute(Qt::WA_ShowWithoutActivating, false);
            break;
        default:
            showNormal();
            break;
        }
    }
}

bool CStartPanelDlg::event(QEvent* event) {
    if (event->type() == QEvent::WindowActivate)
        RefreshRecentItems();
    return QDialog::event(event);
}

void CStartPanelDlg::ChooseDocument() {
    if (m_fileDialog) {
        m_fileDialog->raise();
        return;
    }
    m_fileDialog = new QFileDialog(this, QStringLiteral("Open Document"), QString(),
                                   QStringLiteral("Documents (*.pdf *.doc *.qmd);;All files (*)"));
    m_fileDialog->setFileMode(QFileDialog::ExistingFile);
    m_fileDialog->setAttribute(Qt::WA_DeleteOnClose);
    m_fileDialog->setAccessibleName(QStringLiteral("Open Document"));
    connect(m_fileDialog, &QFileDialog::fileSelected, this,
            [this](const QString& path) { m_actions.OpenDocument(path); });
    m_fileDialog->open();
}
