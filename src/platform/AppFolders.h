#pragma once

#include <QString>

namespace Platform {

// The per-user application data folder, "$XDG_DATA_HOME/Brindle/Quillmark Ambrel" (without a
// trailing separator). It is not created here.
QString ApplicationDataFolder();

// The folder of the running executable, without a trailing separator.
QString ProgramFolder();

// The per-user folder for the start-up lock and the running-instance socket: $XDG_RUNTIME_DIR
// when it is a private folder of ours, else a 0700 folder under the temporary folder, else one
// in the user's cache folder ($XDG_CACHE_HOME, default ~/.cache). Made on first use. Empty when
// no safe folder can be had (each a link, someone else's, or open to others).
QString RuntimeFolder();

} // namespace Platform
