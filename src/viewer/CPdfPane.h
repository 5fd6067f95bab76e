#pragma once

#include <QPdfDocument>
#include <QPdfSearchModel>
#include <QString>
#include <QWidget>

class QPdfView;
class QPrinter;

// One PDF document shown a page at a time: paging, zoom steps, finding text and printing.
class CPdfPane : public QWidget {
    Q_OBJECT
public:
    explicit CPdfPane(QWidget* parent = nullptr);
    ~CPdfPane() override;

    // Loads the file and shows its first page; answers the document's error (None on success).
    QPdfDocument::Error Load(const QString& path);

    int PageCount() const;
    // Zero-based.
    int CurrentPage() const;
    void GoToPage(int page);
    void PageDown();
    void PageUp();

    qreal ZoomFactor() const;
    void ZoomIn();
    void ZoomOut();

    // Shows the next place after the last one found (from the current page on) that holds the
    // text, wrapping round at the end; answers false when the document does not hold it.
    bool FindNext(const QString& text);

    // Prints the printer's page range (every page when none is set), each page fitted to the
    // paper; answers false when the printer could not be started.
    bool Print(QPrinter* printer);

    QPdfView* View() const { return m_view; }

Q_SIGNALS:
    void PageChanged(int page);

private:
    QPdfDocument m_document;
    QPdfSearchModel m_search;
    QPdfView* m_view;
    // The last place found: page and index of the match on that page.
    int m_foundPage = -1;
    int m_foundIndex = -1;
};
