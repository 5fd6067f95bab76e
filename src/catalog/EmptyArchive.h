#pragma once

#include <QString>

namespace Brindle::Data::XmlAccess {

// Writes the catalog of an empty notebook when nothing exists at path; answers true when a
// file is there afterwards (an existing one is left as it is) and false for any other state
// of the path (a folder, an unreadable file) or a failed write, which leaves nothing behind.
bool CreateEmptyArchive(const QString& path);

} // namespace Brindle::Data::XmlAccess
