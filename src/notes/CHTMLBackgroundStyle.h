#pragma once

#include "notes/IHTMLBackgroundStyle.h"

// The codes that choose the words of the repeat, attachment and position fields; any other
// code gives the last word of its kind ("repeat", "scroll", "left", "top").
namespace BackgroundRepeat {
enum : int { Repeat = 0, NoRepeat = 1, RepeatX = 2, RepeatY = 3 };
}
namespace BackgroundAttachment {
enum : int { Scroll = 0, Fixed = 1 };
}
namespace BackgroundHorizontal {
enum : int { Left = 0, Center = 1, Right = 2 };
}
namespace BackgroundVertical {
enum : int { Top = 0, Center = 1, Bottom = 2 };
}

class CHTMLBackgroundStyle final : public IHTMLBackgroundStyle {
public:
    CHTMLBackgroundStyle(std::uint32_t color, const QString& image, int repeat, int attachment,
                         int horizontal, int vertical);
    ~CHTMLBackgroundStyle() override = default;

    HRESULT Parse(const QString& text) override;
    HRESULT GetText(QString* text) override;
    HRESULT GetColor(std::uint32_t* color) override;
    HRESULT SetColor(std::uint32_t color) override;
    HRESULT GetImage(QString* image) override;
    HRESULT SetImage(const QString& image) override;
    unsigned long Release() override;

    // A CSS colour text as a colour value: "#rrggbb" (blanks around it allowed, any case) or
    // one of the 147 colour keywords; white for anything else.
    static std::uint32_t ReadColor(const QString& text);
    // "#rrggbb" with lower-case digits.
    static QString ColorText(std::uint32_t color);

private:
    QString m_color;
    QString m_image;
    QString m_repeat;
    QString m_horizontal;
    QString m_vertical;
    QString m_attachment;
};
