#pragma once

#include <QPushButton>

#include <cstdint>

// The colour chooser button: a swatch of the chosen colour and a drop-down arrow; a click opens
// the colour dialog. Colours are 32-bit values, red in the low byte, then green and blue.
class CColorButton : public QPushButton {
    Q_OBJECT
public:
    // The colour value that means "none chosen"; the swatch then shows the default colour.
    static constexpr std::uint32_t kNoColor = 0xFF000000;

    CColorButton(const QString& accessibleName, QWidget* parent = nullptr);

    void SetColor(std::uint32_t color);
    std::uint32_t GetColor() const { return m_color; }
    // What the swatch shows while no colour is chosen: the desktop's workspace grey.
    std::uint32_t DefaultColor() const { return m_defaultColor; }

    // The swatch's rectangle: the button less its frame, edges, arrow and etched line.
    QRect SwatchRect() const;
    // The arrow's rectangle.
    QRect ArrowRect() const;

protected:
    void paintEvent(QPaintEvent* event) override;

private:
    // The button less its frame and edges, shifted when drawn pressed.
    QRect InnerRect() const;
    void ChooseColor();

    std::uint32_t m_color = kNoColor;
    std::uint32_t m_defaultColor;
    // While the dialog runs the button is drawn pressed and focused.
    bool m_dialogOpen = false;
};
