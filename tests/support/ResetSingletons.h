#pragma once

// Puts every process-wide singleton of the program back to its first state: the tests do it
// before and after each case, the fuzz targets after each input.
void ResetSingletons();
