#pragma once

#include <QString>

#include <cstdint>

// What a note file holds: the title and the styles of its header, and the HTML of its body.
// Colours are 32-bit values with red in the low byte.
struct NoteContent {
    QString title;
    // Empty: the header names no font.
    QString fontFamily = QStringLiteral("Times New Roman");
    std::uint32_t fontSize = 12; // points
    std::uint32_t backgroundColor = 0x00FFFFFF;
    // "none", or the picture that fills the page (empty: the header's empty picture).
    QString backgroundImage = QStringLiteral("none");
    QString textColor = QStringLiteral("black");
    std::uint32_t margin = 0; // ems, above and below each paragraph
    QString body;
};
