#pragma once

#include <QString>

// Catalog item identifiers: a GUID in registry form without braces, 36 characters of
// hexadecimal digits in groups of 8-4-4-4-12 (either case).
bool IsItemIdentifier(const QString& text);

// A fresh identifier: upper-case, without braces.
QString NewItemIdentifier();
