#pragma once

#include <QMainWindow>
#include <QString>

class CFileDetailsPane;
class CPdfPane;
class QAction;
class QLabel;
class QLineEdit;
class QStackedWidget;

// The viewer's one window: a PDF page view, the details of a document of another kind, or a
// message saying why nothing can be shown.
class CViewerWindow : public QMainWindow {
    Q_OBJECT
public:
    enum class Showing { Nothing, Pdf, Details, Message };

    explicit CViewerWindow(QWidget* parent = nullptr);

    // Shows the file: PDF files page by page, other files by their details; a file that is
    // missing, unreadable or damaged shows a message instead.
    void ShowFile(const QString& path);
    // Shows a line of text in place of a document (while waiting for one, or after a failure).
    void ShowMessage(const QString& text);
    // The title the window shows, before the program's name.
    void SetDocumentTitle(const QString& title);

    Showing CurrentlyShowing() const { return m_showing; }
    QString FilePath() const { return m_path; }
    QString MessageText() const;
    CPdfPane* PdfPane() const { return m_pdf; }
    CFileDetailsPane* DetailsPane() const { return m_details; }

    // Asks how to print and prints the PDF shown; says so when there is nothing to print.
    void PrintWithDialog();

Q_SIGNALS:
    void Activated();
    void Closed();
    void SendToWordProcessorRequested();

protected:
    void changeEvent(QEvent* event) override;
    void closeEvent(QCloseEvent* event) override;

private:
    void UpdateActions();
    void UpdatePageLabel();
    void Find();

    CPdfPane* m_pdf;
    CFileDetailsPane* m_details;
    QLabel* m_message;
    QStackedWidget* m_stack;
    QLabel* m_pageLabel;
    QLineEdit* m_findText;
    QList<QAction*> m_pdfActions;
    QString m_path;
    Showing m_showing = Showing::Nothing;
};
