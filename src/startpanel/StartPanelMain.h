#pragma once

// Runs the start panel in the running QApplication: claims the panel's place on the bus, shows
// the window, and ends when the window closes, when the navigator closes it or leaves the bus.
// Answers the program's exit code.
int RunStartPanel();
