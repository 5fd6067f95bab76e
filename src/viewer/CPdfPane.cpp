#include "viewer/CPdfPane.h"

#include <QPainter>
#include <QPdfPageNavigator>
#include <QPdfView>
#include <QPrinter>
#include <QVBoxLayout>

#include <algorithm>
#include <array>

namespace {

// The zoom steps the buttons walk through.
constexpr std::array kZoomSteps{0.25, 0.5, 0.75, 1.0, 1.25, 1.5, 2.0, 3.0, 4.0};
// Pages are rendered for the printer at no more than this many dots per inch: finer adds
// nothing visible and costs memory by the square.
constexpr qreal kMaxPrintDpi = 300.0;

} // namespace

CPdfPane::CPdfPane(QWidget* parent) : QWidget(parent), m_view(new QPdfView(this)) {
    m_view->setAccessibleName(tr("Document page"));
    m_view->setPageMode(QPdfView::PageMode::SinglePage);
    m_view->setZoomMode(QPdfView::ZoomMode::Custom);
    m_view->setZoomFactor(1.0);
    m_view->setDocument(&m_document);
    m_search.setDocument(&m_document);
    auto* layout = new QVBoxLayout(this);
    layout->setContentsMargins(0, 0, 0, 0);
    layout->addWidget(m_view);
    connect(m_view->pageNavigator(), &QPdfPageNavigator::currentPageChanged, this,
            &CPdfPane::PageChanged);
}

CPdfPane::~CPdfPane() {
    // The view and the search model let go of the document before it goes.
    m_search.setDocument(nullptr);
    m_view->setDocument(nullptr);
}

QPdfDocument::Error CPdfPane::Load(const QString& path) {
    m_search.setSearchString(QString());
    m_foundPage = m_foundIndex = -1;
    const QPdfDocument::Error error = m_document.load(path);
    if (error != QPdfDocument::Error::None)
        m_document.close();
    else
        GoToPage(0);
    return error;
}

int CPdfPane::PageCount() const {
    return m_document.pageCount();
}

int CPdfPane::CurrentPage() const {
    return m_view->pageNavigator()->currentPage();
}

void CPdfPane::GoToPage(int page) {
    if (PageCount() == 0)
        return;
    page = std::clamp(page, 0, PageCount() - 1);
    m_view->pageNavigator()->jump(page, QPointF(), m_view->zoomFactor());
}

void CPdfPane::PageDown() {
    GoToPage(CurrentPage() + 1);
}

void CPdfPane::PageUp() {
    GoToPage(CurrentPage() - 1);
}

qreal CPdfPane::ZoomFactor() const {
    return m_view->zoomFactor();
}

void CPdfPane::ZoomIn() {
    const qreal now = ZoomFactor();
    const auto next = std::find_if(kZoomSteps.begin(), kZoomSteps.end(),
                                   [now](qreal step) { return step > now + 1e-6; });
    if (next != kZoomSteps.end())
        m_view->setZoomFactor(*next);
}

void CPdfPane::ZoomOut() {
    const qreal now = ZoomFactor();
    const auto next = std::find_if(kZoomSteps.rbegin(), kZoomSteps.rend(),
                                   [now](qreal step) { return step < now - 1e-6; });
    if (next != kZoomSteps.rend())
        m_view->setZoomFactor(*next);
}

bool CPdfPane::FindNext(const QString& text) {
    if (text.isEmpty() || PageCount() == 0)
        return false;
    if (text != m_search.searchString()) {
        m_search.setSearchString(text);
        m_foundPage = CurrentPage();
        m_foundIndex = -1;
    }
    // Each page is searched when first asked for; at most one full round.
    const int pages = PageCount();
    for (int step = 0; step <= pages; ++step) {
        const int page = (m_foundPage + step) % pages;
        const QList<QPdfLink> matches = m_search.resultsOnPage(page);
        const int index = step == 0 ? m_foundIndex + 1 : 0;
        if (index < matches.size()) {
            m_foundPage = page;
            m_foundIndex = index;
            const QPdfLink& match = matches.at(index);
            m_view->pageNavigator()->jump(page, match.location(), m_view->zoomFactor());
            return true;
        }
    }
    return false;
}

bool CPdfPane::Print(QPrinter* printer) {
    if (printer == nullptr || PageCount() == 0)
        return false;
    int first = 0;
    int last = PageCount() - 1;
    if (printer->printRange() == QPrinter::PageRange && printer->fromPage() > 0) {
        first = std::min(printer->fromPage() - 1, last);
        last = std::clamp(printer->toPage() - 1, first, last);
    }
    QPainter painter;
    if (!painter.begin(printer))
        return false;
    const QRectF paper = printer->pageLayout().paintRectPixels(printer->resolution());
    const qreal dpi = std::min<qreal>(printer->resolution(), kMaxPrintDpi);
    for (int page = first; page <= last; ++page) {
        if (page != first)
            printer->newPage();
        const QSizeF points = m_document.pagePointSize(page);
        if (points.isEmpty())
            continue;
        const QSizeF fitted = points.scaled(paper.size(), Qt::KeepAspectRatio);
        const QRectF target(QPointF(0, 0), fitted);
        const QImage image = m_document.render(page, (points * dpi / 72.0).toSize());
        painter.drawImage(target, image);
    }
    return painter.end();
}
