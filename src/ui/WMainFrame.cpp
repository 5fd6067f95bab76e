#include "ui/WMainFrame.h"

#include "app/CCommandRouter.h"
#include "app/CNavigatorCommands.h"
#include "app/SystemIntegration.h"
#include "common/StringTable.h"
#include "libs/lustre/CVisualStyleManager.h"
#include "libs/sheen/ThemeUtilities.h"
#include "libs/sheen/ThemedToolbar.h"
#include "libs/toolwell/IHarborUtils.h"
#include "libs/toolwell/IHelpService.h"
#include "messaging/ActivityCenter.h"
#include "navigator/WNavDS.h"
#include "navigator/WNavigatorTree.h"
#include "settings/NavigatorSettings.h"
#include "ui/AmbrelIcons.h"
#include "ui/CMsgCenterDlgBar.h"
#include "ui/CNavigatorCustomToolbar.h"

#include <QAction>
#include <QApplication>
#include <QCloseEvent>
#include <QEvent>
#include <QMenu>
#include <QPointer>
#include <QToolButton>
#include <QVariantAnimation>

#include <vector>

namespace {

// The utility engine's feature number of the message centre.
constexpr int kMessageCentreFeature = 6;
// The help button runs the same command as "Help Topics".
constexpr int kHelpButton = 57670;

bool MessageCentreAvailable() {
    IHarborUtils* utils = GetHarborUtilsInterface();
    return utils != nullptr && utils->IsFeatureAvailable(kMessageCentreFeature) == 1;
}

// A spacer that takes the toolbar's free width, so the buttons after it sit at its right edge.
void Stretch(QToolBar* toolbar) {
    auto* spacer = new QWidget(toolbar);
    spacer->setSizePolicy(QSizePolicy::Expanding, QSizePolicy::Preferred);
    toolbar->addWidget(spacer);
}

QString Plain(QString text) {
    return text.replace(QStringLiteral("&&"), QStringLiteral("\x01"))
        .remove(u'&')
        .replace(u'\x01', u'&');
}

// Text beside the pictures only while every button's text fits; otherwise pictures alone, with
// the texts left as tooltips and accessible names.
void FitButtonTexts(QToolBar* toolbar, int width) {
    const Qt::ToolButtonStyle before = toolbar->toolButtonStyle();
    toolbar->setToolButtonStyle(Qt::ToolButtonTextBesideIcon);
    const bool fits = toolbar->sizeHint().width() <= width;
    toolbar->setToolButtonStyle(fits ? Qt::ToolButtonTextBesideIcon : Qt::ToolButtonIconOnly);
    if (toolbar->toolButtonStyle() != before)
        toolbar->updateGeometry();
}

} // namespace

WMainFrame::WMainFrame(QWidget* parent) : QMainWindow(parent), m_router(new CCommandRouter(this)) {
    setWindowTitle(LoadString(StringId::ProductName));
    setMinimumSize(kMinimumClientSize);
    // Nothing is docked or moved by the user: the bars keep their order.
    setContextMenuPolicy(Qt::NoContextMenu);

    m_tree = new WNavigatorTree(this);
    m_tree->SetCommandRouter(m_router);
    setCentralWidget(m_tree);
    CNavigatorCommands::Register(*m_router, m_tree);
    CreateToolbars();

    m_bubbleTimer.setSingleShot(true);
    connect(&m_bubbleTimer, &QTimer::timeout, this, &WMainFrame::OnBubbleTimer);
    if (Lustre::CVisualStyleManager* styles = GetVisualStyleManager()) {
        connect(styles, &Lustre::CVisualStyleManager::VisualStyleChanged, this, [this] {
            UpdateThemeUtilities();
            LayOut();
        });
    }
    // The button that offers the buttons a toolbar has no room for.
    for (auto* toolbar : findChildren<QToolBar*>()) {
        if (auto* more = toolbar->findChild<QToolButton*>(QStringLiteral("qt_toolbar_ext_button")))
            more->setAccessibleName(QStringLiteral("More buttons"));
    }
    m_router->UpdateActions();
}

WMainFrame::~WMainFrame() {
    // Dialogs without this window as their parent would otherwise outlive it.
    const ModalDialog::ClosingAll closing;
    // The settings outlive the window.
    if (NavigatorSettings* settings = NavigatorSettings::Instance(); settings->GetFrame() == this)
        settings->SetFrame(nullptr);
}

void WMainFrame::CreateToolbars() {
    m_mainToolbar = new BrindleTheming::ThemedToolbar(this);
    m_mainToolbar->setObjectName(QStringLiteral("MainToolbar"));
    m_mainToolbar->setAccessibleName(QStringLiteral("Main toolbar"));
    AddDropDown(m_mainToolbar, StringId::NewNote,
                {StringId::NewNote, StringId::NewWordProcessorDocument});
    AddButton(m_mainToolbar, StringId::OpenDocument);
    AddDropDown(
        m_mainToolbar, StringId::SnapshotToNewNote,
        {StringId::SnapshotToNewNote, StringId::SnapshotToClipboard, StringId::SnapshotToQm});
    m_mainToolbar->addSeparator();
    AddButton(m_mainToolbar, StringId::Settings);
    QMenu* help = AddDropDown(m_mainToolbar, kHelpButton, {});
    // Which entries the help menu holds depends on what is installed when it opens.
    connect(help, &QMenu::aboutToShow, this, [this, help] { FillHelpMenu(help); });
    FillHelpMenu(help);
    Stretch(m_mainToolbar);
    AddButton(m_mainToolbar, StringId::KeepOnTop);
    addToolBar(Qt::TopToolBarArea, m_mainToolbar);

    addToolBarBreak(Qt::TopToolBarArea);
    using Description = CNavigatorCustomToolbar::ButtonDescription;
    std::vector<Description> custom = {
        {StringId::Show, StringId::Show,
         CNavigatorCustomToolbar::StyleDropDown | CNavigatorCustomToolbar::StyleWholeDropDown, 0},
        {StringId::NewFolder, StringId::NewFolder, CNavigatorCustomToolbar::StyleButton, 0},
    };
    // The activity centre has its button only where it is installed.
    if (IsActivityCenterInstalled()) {
        custom.push_back({StringId::ActivityCenter, StringId::ActivityCenter,
                          CNavigatorCustomToolbar::StyleButton, 0});
    }
    m_customToolbar = new CNavigatorCustomToolbar(20, 20, this);
    m_customToolbar->setObjectName(QStringLiteral("CustomToolbar"));
    m_customToolbar->setAccessibleName(QStringLiteral("Items toolbar"));
    m_customToolbar->AddButtons(custom);
    QMenu* show = m_customToolbar->ButtonAction(StringId::Show)->menu();
    show->setAccessibleName(show->title());
    for (int filter = StringId::FilterNotes; filter <= StringId::FilterOpenedOnly; ++filter)
        show->addAction(m_router->Action(filter));
    m_router->WatchMenu(show);
    m_menus.insert(StringId::Show, show);
    connect(m_customToolbar, &QToolBar::actionTriggered, this, [this](QAction* action) {
        // The drop-down's entries are the router's own and run themselves.
        const int commandId = action->data().toInt();
        if (m_customToolbar->ButtonAction(commandId) == action && action->menu() == nullptr)
            m_router->Execute(commandId);
    });
    addToolBar(Qt::TopToolBarArea, m_customToolbar);

    m_documentToolbar = new BrindleTheming::ThemedToolbar(this);
    m_documentToolbar->setObjectName(QStringLiteral("DocumentToolbar"));
    m_documentToolbar->setAccessibleName(QStringLiteral("Document toolbar"));
    m_documentToolbar->SetBorderEdge(Qt::TopEdge);
    AddButton(m_documentToolbar, StringId::CloseAllNotes);
    AddButton(m_documentToolbar, StringId::CloseAllDocuments);
    Stretch(m_documentToolbar);
    AddDropDown(
        m_documentToolbar, StringId::SendTo,
        {StringId::SendToWordProcessor, StringId::SendToMailRecipient, StringId::SendToBlog});
    AddButton(m_documentToolbar, StringId::Print);
    m_documentToolbar->addSeparator();
    AddButton(m_documentToolbar, StringId::Restore);
    AddButton(m_documentToolbar, StringId::Delete);
    // The first line of the bottom area is the lowest: the message centre goes below.
    CreateMessageCentreBar();
    addToolBar(Qt::BottomToolBarArea, m_documentToolbar);
}

QAction* WMainFrame::ButtonAction(int commandId) {
    QAction* action = commandId == kHelpButton
                          ? m_router->Action(commandId, LoadString(StringId::HelpTopics))
                          : m_router->Action(commandId);
    action->setIcon(AmbrelIcons::CommandImage(commandId));
    return action;
}

void WMainFrame::AddButton(QToolBar* toolbar, int commandId) {
    QAction* action = ButtonAction(commandId);
    toolbar->addAction(action);
    toolbar->widgetForAction(action)->setAccessibleName(Plain(action->text()));
}

QMenu* WMainFrame::AddDropDown(QToolBar* toolbar, int commandId,
                               std::initializer_list<int> entries) {
    QAction* action = ButtonAction(commandId);
    // The menu belongs to the button, not to the shared entry, which other menus show too.
    auto* menu = new QMenu(Plain(action->text()), this);
    menu->setAccessibleName(menu->title());
    for (int entry : entries)
        menu->addAction(m_router->Action(entry));
    m_router->WatchMenu(menu);
    auto* button = new QToolButton(toolbar);
    button->setDefaultAction(action);
    button->setMenu(menu);
    button->setPopupMode(QToolButton::MenuButtonPopup);
    button->setAutoRaise(true);
    button->setIconSize(toolbar->iconSize());
    button->setToolButtonStyle(toolbar->toolButtonStyle());
    button->setAccessibleName(Plain(action->text()));
    connect(toolbar, &QToolBar::toolButtonStyleChanged, button, &QToolButton::setToolButtonStyle);
    connect(toolbar, &QToolBar::iconSizeChanged, button, &QToolButton::setIconSize);
    toolbar->addWidget(button);
    m_menus.insert(commandId, menu);
    return menu;
}

void WMainFrame::FillHelpMenu(QMenu* menu) {
    const bool userGuide = GetHelpService() != nullptr && GetHelpService()->HasUserGuide() != 0;
    const bool messageCentre = MessageCentreAvailable();
    menu->clear();
    menu->addAction(m_router->Action(StringId::HelpTopics));
    if (userGuide)
        menu->addAction(m_router->Action(StringId::UserGuide));
    menu->addSeparator();
    if (messageCentre) {
        menu->addAction(m_router->Action(StringId::MessageArchive, QStringLiteral("Messages")));
        menu->addAction(m_router->Action(StringId::CheckForUpdates));
        menu->addAction(
            m_router->Action(StringId::HideMessageCentre, QStringLiteral("&Show Message Panel")));
        menu->addSeparator();
    }
    menu->addAction(m_router->Action(StringId::StartPanel));
    menu->addAction(m_router->Action(StringId::ActivityCenter));
    menu->addAction(m_router->Action(StringId::TellAFriend));
    menu->addAction(m_router->Action(StringId::Website));
    menu->addSeparator();
    menu->addAction(m_router->Action(StringId::ShowFrame));
    menu->addSeparator();
    menu->addAction(m_router->Action(StringId::About));
    m_router->UpdateActions();
}

void WMainFrame::CreateMessageCentreBar() {
    IHarborUtils* utils = GetHarborUtilsInterface();
    if (!MessageCentreAvailable() || utils->GetMessageCenter() == nullptr)
        return;
    m_messageCentreBar = new CMsgCenterDlgBar(this);
    addToolBar(Qt::BottomToolBarArea, m_messageCentreBar);
    addToolBarBreak(Qt::BottomToolBarArea);
}

QMenu* WMainFrame::DropDownMenu(int commandId) const {
    return m_menus.value(commandId);
}

void WMainFrame::PlaceFrame(const QRect& outer) {
    m_placedSize = outer.size();
    move(outer.topLeft()); // a window's position is that of its frame
    FitToPlacedSize();
}

void WMainFrame::FitToPlacedSize() {
    if (!m_placedSize)
        return;
    const QSize outer = *m_placedSize;
    const QSize decorations = frameGeometry().size() - size();
    if (!decorations.isNull())
        m_placedSize.reset();
    resize(outer - decorations);
}

void WMainFrame::SetTrackPosition(bool track) {
    m_trackPosition = track;
    RecordPosition();
}

void WMainFrame::SetKeepOnTop(bool onTop) {
    if (windowFlags().testFlag(Qt::WindowStaysOnTopHint) == onTop) {
        show();
        return;
    }
    // Changing a window flag hides the window; it is shown again at the same place.
    setWindowFlag(Qt::WindowStaysOnTopHint, onTop);
    show();
}

void WMainFrame::ShowFrame(bool show) {
    if (windowFlags().testFlag(Qt::FramelessWindowHint) == !show)
        return;
    const bool visible = isVisible();
    setWindowFlag(Qt::FramelessWindowHint, !show);
    if (visible)
        this->show();
}

void WMainFrame::ShowMessageCentre(bool show) {
    if (m_messageCentreBar != nullptr && MessageCentreAvailable())
        m_messageCentreBar->setVisible(show);
    LayOut();
}

void WMainFrame::OnIdleWork() {
    m_tree->OnIdle();
    m_router->UpdateActions();
}

void WMainFrame::EditSelectedLabel() {
    m_tree->EditSelectedLabel();
}

void WMainFrame::StartBubbleTimer(int delayMs) {
    m_bubbleTimer.start(delayMs);
}

void WMainFrame::OnBubbleTimer() {
    m_bubbleTimer.stop();
    if (isActiveWindow())
        ShowStartupBubble();
    else
        m_bubblePending = true;
}

void WMainFrame::ShowStartupBubble() {
    m_bubblePending = false;
    QPointer<QWidget> focus = QApplication::focusWidget();
    if (IHarborUtils* utils = GetHarborUtilsInterface())
        utils->SetNavigatorRect(
            NavigatorSettings::Instance()->GetApplicationPosition().ToGeometry());
    // The notification may have taken the activation; the user was working here.
    activateWindow();
    if (focus)
        focus->setFocus();
}

void WMainFrame::changeEvent(QEvent* event) {
    QMainWindow::changeEvent(event);
    if (event->type() == QEvent::ActivationChange && m_bubblePending && isActiveWindow() &&
        !isMinimized())
        ShowStartupBubble();
}

void WMainFrame::closeEvent(QCloseEvent* event) {
    if (m_closeState == CloseState::Closed) {
        QMainWindow::closeEvent(event);
        return;
    }
    // The window goes once it has faded out and the other programs' windows are closed.
    event->ignore();
    if (m_closeState == CloseState::Fading)
        return;
    m_closeState = CloseState::Fading;
    // An open dialog is ended unanswered, and none opens while the other programs' windows
    // are closed: the navigator must be able to end without anyone at the screen.
    m_closingAll.emplace();
    Q_EMIT Closing();
    setEnabled(false);
    auto* fade = new QVariantAnimation(this);
    fade->setDuration(kFadeDuration);
    fade->setStartValue(windowOpacity());
    fade->setEndValue(0.0);
    // Without a window system (offscreen) there is no opacity to set; the fade still takes its
    // time, so the close runs the same way everywhere.
    if (QGuiApplication::platformName() != u"offscreen") {
        connect(fade, &QVariantAnimation::valueChanged, this,
                [this](const QVariant& opacity) { setWindowOpacity(opacity.toReal()); });
    }
    connect(fade, &QVariantAnimation::finished, this, &WMainFrame::FinishClose);
    fade->start(QAbstractAnimation::DeleteWhenStopped);
}

void WMainFrame::FinishClose() {
    hide();
    // The note tool's and the viewer's windows go with the navigator, and the catalog then
    // records nothing as open.
    WNavDS* navigator = WNavDS::Instance();
    navigator->CloseAllWindowsAndWait();
    navigator->CloseAllOpenDocuments();
    navigator->CloseAllOpenNotes();
    // The start panel belongs to the navigator's session and ends with it.
    CloseStartPanel();
    if (IHarborUtils* utils = GetHarborUtilsInterface()) {
        utils->OnNavigatorClosing();
        utils->SetShuttingDown(true);
    }
    m_closeState = CloseState::Closed;
    close();
}

void WMainFrame::moveEvent(QMoveEvent* event) {
    QMainWindow::moveEvent(event);
    FitToPlacedSize();
    RecordPosition();
}

void WMainFrame::resizeEvent(QResizeEvent* event) {
    QMainWindow::resizeEvent(event);
    LayOut();
    FitToPlacedSize();
    RecordPosition();
}

void WMainFrame::LayOut() {
    if (m_mainToolbar == nullptr)
        return;
    for (QToolBar* toolbar :
         {static_cast<QToolBar*>(m_mainToolbar), static_cast<QToolBar*>(m_customToolbar),
          static_cast<QToolBar*>(m_documentToolbar)})
        FitButtonTexts(toolbar, width());
    if (m_messageCentreBar != nullptr)
        m_messageCentreBar->LayOut(m_documentToolbar->width());
}

void WMainFrame::RecordPosition() {
    // A minimised or maximised window keeps the place it will return to.
    if (!m_trackPosition || isMinimized() || isMaximized() || isFullScreen())
        return;
    NavigatorSettings* settings = NavigatorSettings::Instance();
    const WindowRect position = WindowRect::FromGeometry(frameGeometry());
    if (settings->GetApplicationPosition() != position)
        settings->SetApplicationPosition(position);
}
