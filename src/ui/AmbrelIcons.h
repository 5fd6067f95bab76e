#pragma once

#include <QIcon>

// The navigator's pictures. The tree's pictures are the product's own, since their open,
// linked and deleted states matter more than the desktop's look; commands take the desktop's
// icon theme first and fall back on the product's own set.
namespace AmbrelIcons {

// Number of tree pictures: the indexes the item model gives for its records.
constexpr int TreeImageCount = 19;

// The tree's picture for an item model image index; a null icon outside 0 to 18.
QIcon TreeImage(int index);

// The picture of a toolbar button or menu entry by its command id; a null icon for a command
// without one.
QIcon CommandImage(int commandId);

} // namespace AmbrelIcons
