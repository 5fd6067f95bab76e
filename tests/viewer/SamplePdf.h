#pragma once

#include <QPainter>
#include <QPdfWriter>
#include <QString>

// Writes an A4 PDF of `pages` pages, each headed "Page <n>" with a few lines of text; the
// page `wordPage` (zero-based, -1 for none) also holds `word`. Answers whether it was written.
inline bool WriteSamplePdf(const QString& path, int pages, int wordPage = -1,
                           const QString& word = QString()) {
    QPdfWriter writer(path);
    writer.setPageSize(QPageSize(QPageSize::A4));
    writer.setResolution(72);
    QPainter painter;
    if (!painter.begin(&writer))
        return false;
    QFont font(QStringLiteral("DejaVu Sans"));
    font.setPointSize(14);
    painter.setFont(font);
    for (int page = 0; page < pages; ++page) {
        if (page != 0)
            writer.newPage();
        painter.drawText(72, 72, QStringLiteral("Page %1").arg(page + 1));
        for (int line = 0; line < 20; ++line)
            painter.drawText(
                72, 120 + line * 24,
                QStringLiteral("Line %1 of the sample text on this page.").arg(line + 1));
        if (page == wordPage)
            painter.drawText(72, 640, word);
    }
    return painter.end();
}
