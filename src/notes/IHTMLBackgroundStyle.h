#pragma once

#include "common/Result.h"

#include <QString>

#include <cstdint>

// One CSS background value: colour, image, repeat, positions and attachment. Colours are
// 32-bit values with red in the low byte, then green, then blue.
class IHTMLBackgroundStyle {
public:
    // Reads a CSS background value; fields without a token keep their values.
    virtual HRESULT Parse(const QString& text) = 0;
    // "colour image repeat vertical horizontal attachment".
    virtual HRESULT GetText(QString* text) = 0;
    // The colour field as a colour value; white when it is neither "#rrggbb" nor a keyword.
    virtual HRESULT GetColor(std::uint32_t* color) = 0;
    virtual HRESULT SetColor(std::uint32_t color) = 0;
    virtual HRESULT GetImage(QString* image) = 0;
    virtual HRESULT SetImage(const QString& image) = 0;
    virtual unsigned long Release() = 0;

protected:
    virtual ~IHTMLBackgroundStyle() = default;
};
