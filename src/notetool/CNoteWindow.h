#pragma once

#include <QMainWindow>

class CNoteEditor;
class QAction;
class QComboBox;
class QFontComboBox;
class QLineEdit;
class QTextCharFormat;

// The note tool's window: the note's title field over its text, with the formatting,
// picture, undo, print and save commands in a toolbar.
class CNoteWindow final : public QMainWindow {
    Q_OBJECT
public:
    explicit CNoteWindow(QWidget* parent = nullptr);

    CNoteEditor* Editor() const { return m_editor; }
    QString NoteTitle() const;
    // Shows the title in the field and the window's title bar.
    void SetNoteTitle(const QString& title);
    // Stops every edit: for a note whose file could not be read.
    void SetReadOnly(const QString& reason);
    void ShowMessage(const QString& message);
    // The format commands show the style at the cursor (after the note was loaded).
    void ShowCurrentFormat();

Q_SIGNALS:
    void Activated();
    void SaveRequested();
    void PrintRequested();
    void TitleEdited();
    // Sent when the window is asked to close; a receiver that clears allowed keeps it open.
    void CloseRequested(bool* allowed);

protected:
    void changeEvent(QEvent* event) override;
    void closeEvent(QCloseEvent* event) override;

private:
    void BuildToolBar();
    void ShowFormat(const QTextCharFormat& format);
    void MergeFormat(const QTextCharFormat& format);
    void ChooseColor();
    void ChoosePicture();
    void ToggleList(int style);

    QLineEdit* m_title = nullptr;
    CNoteEditor* m_editor = nullptr;
    QAction* m_bold = nullptr;
    QAction* m_italic = nullptr;
    QAction* m_underline = nullptr;
    QFontComboBox* m_font = nullptr;
    QComboBox* m_size = nullptr;
};
