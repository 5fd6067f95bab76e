#pragma once

class QWidget;

// Shows a window as a show command of the product's programs asks: 0 hides, 3 maximises,
// 6 minimises, 8 shows without activating, and anything else (1 normal, 9 restore) shows the
// window at its normal size.
void ApplyShowCommand(QWidget* window, int showCommand);
