#pragma once

#include <QString>

// What a new note takes from the navigator's settings: the default font, font size,
// background colour ("r,g,b") and background image (empty: none given, "none": no image).
struct NoteDefaults {
    QString font = QStringLiteral("Times New Roman");
    int fontSize = 12;
    QString backgroundColor = QStringLiteral("255,255,255");
    QString backgroundImage = QStringLiteral("");
};
