#pragma once

#include "dataexchange/IProperties.h"

#include <QString>

namespace DataExchange {

// Reads pipe-delimited text (see PipeDelimitedStringReporter) into the target set. A backslash
// followed by anything but a backslash reads as "|". Whatever is pending at the end of the text
// (a name without its value, text after the last "|") is dropped; a later duplicate name
// overwrites the earlier value; an empty name is accepted. Nothing happens without a target.
void ParsePipeDelimitedString(const QString& text, IProperties* target);

} // namespace DataExchange
