#include "notetool/CNoteWindow.h"

#include "notetool/CNoteEditor.h"

#include <QAction>
#include <QCloseEvent>
#include <QColorDialog>
#include <QComboBox>
#include <QFileDialog>
#include <QFontComboBox>
#include <QFontDatabase>
#include <QLabel>
#include <QLineEdit>
#include <QStatusBar>
#include <QTextList>
#include <QToolBar>
#include <QVBoxLayout>

#include <array>
#include <utility>

namespace {

QAction* AddCommand(QToolBar* bar, const QString& icon, const QString& text,
                    const QKeySequence& shortcut = {}) {
    QAction* action = bar->addAction(QIcon::fromTheme(icon), text);
    action->setShortcut(shortcut);
    action->setToolTip(shortcut.isEmpty() ? text
                                          : text + QStringLiteral(" (") +
                                                shortcut.toString(QKeySequence::NativeText) + u')');
    return action;
}

} // namespace

CNoteWindow::CNoteWindow(QWidget* parent) : QMainWindow(parent) {
    auto* page = new QWidget(this);
    auto* layout = new QVBoxLayout(page);
    layout->setContentsMargins(4, 4, 4, 4);
    layout->setSpacing(4);
    m_title = new QLineEdit(page);
    m_title->setAccessibleName(tr("Note title"));
    m_title->setPlaceholderText(tr("Title"));
    QFont titleFont = m_title->font();
    titleFont.setBold(true);
    m_title->setFont(titleFont);
    m_editor = new CNoteEditor(page);
    layout->addWidget(m_title);
    layout->addWidget(m_editor, 1);
    setCentralWidget(page);
    BuildToolBar();

    connect(m_title, &QLineEdit::textEdited, this, [this](const QString& title) {
        setWindowTitle(title);
        Q_EMIT TitleEdited();
    });
    connect(m_editor, &QTextEdit::currentCharFormatChanged, this, &CNoteWindow::ShowFormat);
    m_editor->setFocus();
}

void CNoteWindow::BuildToolBar() {
    QToolBar* file = addToolBar(tr("Note"));
    file->setObjectName(QStringLiteral("note"));
    QAction* save =
        AddCommand(file, QStringLiteral("document-save"), tr("Save"), QKeySequence::Save);
    connect(save, &QAction::triggered, this, &CNoteWindow::SaveRequested);
    QAction* print =
        AddCommand(file, QStringLiteral("document-print"), tr("Print"), QKeySequence::Print);
    connect(print, &QAction::triggered, this, &CNoteWindow::PrintRequested);
    file->addSeparator();
    QAction* undo = AddCommand(file, QStringLiteral("edit-undo"), tr("Undo"), QKeySequence::Undo);
    QAction* redo = AddCommand(file, QStringLiteral("edit-redo"), tr("Redo"), QKeySequence::Redo);
    undo->setEnabled(false);
    redo->setEnabled(false);
    connect(undo, &QAction::triggered, m_editor, &QTextEdit::undo);
    connect(redo, &QAction::triggered, m_editor, &QTextEdit::redo);
    connect(m_editor, &QTextEdit::undoAvailable, undo, &QAction::setEnabled);
    connect(m_editor, &QTextEdit::redoAvailable, redo, &QAction::setEnabled);
    file->addSeparator();
    QAction* picture = AddCommand(file, QStringLiteral("insert-image"), tr("Insert picture"));
    connect(picture, &QAction::triggered, this, &CNoteWindow::ChoosePicture);

    addToolBarBreak();
    QToolBar* format = addToolBar(tr("Format"));
    format->setObjectName(QStringLiteral("format"));
    m_font = new QFontComboBox(format);
    m_font->setAccessibleName(tr("Font"));
    m_font->setMaximumWidth(170);
    format->addWidget(m_font);
    connect(m_font, &QFontComboBox::textActivated, this, [this](const QString& family) {
        QTextCharFormat change;
        change.setFontFamilies({family});
        MergeFormat(change);
    });
    m_size = new QComboBox(format);
    m_size->setAccessibleName(tr("Font size"));
    m_size->setEditable(true);
    for (const int size : QFontDatabase::standardSizes())
        m_size->addItem(QString::number(size));
    format->addWidget(m_size);
    connect(m_size, &QComboBox::textActivated, this, [this](const QString& text) {
        const double size = text.toDouble();
        if (size <= 0 || size > 400)
            return;
        QTextCharFormat change;
        change.setFontPointSize(size);
        MergeFormat(change);
    });

    m_bold = AddCommand(format, QStringLiteral("format-text-bold"), tr("Bold"), QKeySequence::Bold);
    m_italic = AddCommand(format, QStringLiteral("format-text-italic"), tr("Italic"),
                          QKeySequence::Italic);
    m_underline = AddCommand(format, QStringLiteral("format-text-underline"), tr("Underline"),
                             QKeySequence::Underline);
    for (QAction* toggle : {m_bold, m_italic, m_underline})
        toggle->setCheckable(true);
    connect(m_bold, &QAction::triggered, this, [this](bool on) {
        QTextCharFormat change;
        change.setFontWeight(on ? QFont::Bold : QFont::Normal);
        MergeFormat(change);
    });
    connect(m_italic, &QAction::triggered, this, [this](bool on) {
        QTextCharFormat change;
        change.setFontItalic(on);
        MergeFormat(change);
    });
    connect(m_underline, &QAction::triggered, this, [this](bool on) {
        QTextCharFormat change;
        change.setFontUnderline(on);
        MergeFormat(change);
    });
    QAction* color = AddCommand(format, QStringLiteral("format-text-color"), tr("Text colour"));
    connect(color, &QAction::triggered, this, &CNoteWindow::ChooseColor);
    format->addSeparator();
    QAction* bullets =
        AddCommand(format, QStringLiteral("format-list-unordered"), tr("Bulleted list"));
    connect(bullets, &QAction::triggered, this, [this] { ToggleList(QTextListFormat::ListDisc); });
    QAction* numbers =
        AddCommand(format, QStringLiteral("format-list-ordered"), tr("Numbered list"));
    connect(numbers, &QAction::triggered, this,
            [this] { ToggleList(QTextListFormat::ListDecimal); });

    // Without the desktop's pictures the styles show as letters in their own style.
    const std::array<std::pair<QAction*, QString>, 6> shortWords{{{m_bold, tr("B")},
                                                                  {m_italic, tr("I")},
                                                                  {m_underline, tr("U")},
                                                                  {color, tr("Colour")},
                                                                  {bullets, tr("\u2022 List")},
                                                                  {numbers, tr("1. List")}}};
    for (const auto& [action, word] : shortWords) {
        if (action->icon().isNull())
            action->setIconText(word);
    }
    for (QToolBar* bar : {file, format}) {
        bar->setMovable(false);
        bar->setAccessibleName(bar->windowTitle());
        const QList<QAction*> commands = bar->actions();
        for (QAction* command : commands) {
            if (QWidget* button = bar->widgetForAction(command); button && !command->isSeparator())
                button->setAccessibleName(command->text());
        }
    }
    const auto styleButton = [format](QAction* action, auto change) {
        if (QWidget* button = format->widgetForAction(action); action->icon().isNull()) {
            QFont font = button->font();
            change(font);
            button->setFont(font);
        }
    };
    styleButton(m_bold, [](QFont& font) { font.setBold(true); });
    styleButton(m_italic, [](QFont& font) { font.setItalic(true); });
    styleButton(m_underline, [](QFont& font) { font.setUnderline(true); });
}

QString CNoteWindow::NoteTitle() const {
    return m_title->text();
}

void CNoteWindow::SetNoteTitle(const QString& title) {
    m_title->setText(title);
    setWindowTitle(title);
}

void CNoteWindow::SetReadOnly(const QString& reason) {
    m_title->setReadOnly(true);
    m_editor->setReadOnly(true);
    for (QToolBar* bar : findChildren<QToolBar*>())
        bar->setEnabled(false);
    statusBar()->showMessage(reason);
}

void CNoteWindow::ShowMessage(const QString& message) {
    statusBar()->showMessage(message);
}

void CNoteWindow::ShowCurrentFormat() {
    ShowFormat(m_editor->currentCharFormat());
}

void CNoteWindow::ShowFormat(const QTextCharFormat& format) {
    m_bold->setChecked(format.fontWeight() >= QFont::Bold);
    m_italic->setChecked(format.fontItalic());
    m_underline->setChecked(format.fontUnderline());
    // The format names only what differs from the note's own font.
    const QFont font = format.font().resolve(m_editor->document()->defaultFont());
    m_font->setCurrentFont(font);
    m_size->setEditText(QString::number(font.pointSizeF()));
}

void CNoteWindow::MergeFormat(const QTextCharFormat& format) {
    QTextCursor cursor = m_editor->textCursor();
    if (!cursor.hasSelection())
        cursor.select(QTextCursor::WordUnderCursor);
    cursor.mergeCharFormat(format);
    m_editor->mergeCurrentCharFormat(format);
    m_editor->setFocus();
}

// The dialogs are the window's children and never run a loop of their own: closing the
// window while one is open ends both.
void CNoteWindow::ChooseColor() {
    auto* dialog = new QColorDialog(m_editor->textColor(), this);
    dialog->setAttribute(Qt::WA_DeleteOnClose);
    dialog->setWindowTitle(tr("Text colour"));
    connect(dialog, &QColorDialog::colorSelected, this, [this](const QColor& color) {
        QTextCharFormat format;
        format.setForeground(color);
        MergeFormat(format);
    });
    dialog->open();
}

void CNoteWindow::ChoosePicture() {
    auto* dialog = new QFileDialog(this, tr("Insert picture"), QString(),
                                   tr("Pictures (*.png *.jpg *.jpeg *.gif *.bmp *.svg)"));
    dialog->setAttribute(Qt::WA_DeleteOnClose);
    dialog->setFileMode(QFileDialog::ExistingFile);
    connect(dialog, &QFileDialog::fileSelected, m_editor, &CNoteEditor::InsertPictureFile);
    dialog->open();
}

void CNoteWindow::ToggleList(int style) {
    QTextCursor cursor = m_editor->textCursor();
    if (QTextList* list = cursor.currentList(); list && list->format().style() == style) {
        // The same command again ends the list for this paragraph.
        QTextBlockFormat block = cursor.blockFormat();
        list->remove(cursor.block());
        block.setIndent(0);
        cursor.setBlockFormat(block);
        return;
    }
    QTextListFormat format;
    format.setStyle(static_cast<QTextListFormat::Style>(style));
    cursor.createList(format);
}

void CNoteWindow::changeEvent(QEvent* event) {
    QMainWindow::changeEvent(event);
    if (event->type() == QEvent::ActivationChange && isActiveWindow())
        Q_EMIT Activated();
}

void CNoteWindow::closeEvent(QCloseEvent* event) {
    bool allowed = true;
    Q_EMIT CloseRequested(&allowed);
    event->setAccepted(allowed);
}
