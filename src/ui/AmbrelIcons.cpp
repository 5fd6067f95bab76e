#include "ui/AmbrelIcons.h"

#include <QString>

#include <array>

namespace {

// Resource names of the tree pictures, in image index order.
constexpr std::array<const char*, AmbrelIcons::TreeImageCount> kTreeImages = {
    "linked-documents",
    "linked-documents-open",
    "deleted-items",
    "deleted-items-open",
    "folder",
    "folder-open",
    "folder-deleted",
    "folder-deleted-open",
    "document",
    "document-open",
    "document-deleted",
    "document-linked",
    "document-linked-open",
    "document-linked-deleted",
    "note",
    "note-open",
    "note-deleted",
    "notebook",
    "notebook-open",
};

struct CommandImageName {
    int commandId;
    const char* themeName; // freedesktop icon naming; empty when the theme has no fit
    const char* resourceName;
};

constexpr CommandImageName kCommandImages[] = {
    {32769, "document-new", "new-note"},   {32774, "document-open", "open-document"},
    {32771, "camera-photo", "snapshot"},   {32775, "preferences-system", "settings"},
    {57670, "help-contents", "help"},      {32783, "", "keep-on-top"},
    {32825, "", "close-all-notes"},        {32826, "", "close-all-documents"},
    {32834, "", "send-to-word-processor"}, {32829, "document-print", "print"},
    {32830, "edit-undo", "restore"},       {32831, "edit-delete", "delete"},
    {32833, "view-filter", "show"},        {32824, "folder-new", "new-folder"},
    {32784, "", "activity-center"},
};

QIcon ResourceIcon(const char* folder, const char* name) {
    return QIcon(
        QStringLiteral(":/icons/%1/%2.svg").arg(QLatin1String(folder), QLatin1String(name)));
}

} // namespace

namespace AmbrelIcons {

QIcon TreeImage(int index) {
    if (index < 0 || index >= TreeImageCount)
        return {};
    return ResourceIcon("tree", kTreeImages[static_cast<std::size_t>(index)]);
}

QIcon CommandImage(int commandId) {
    for (const CommandImageName& entry : kCommandImages) {
        if (entry.commandId != commandId)
            continue;
        const QIcon fallback = ResourceIcon("commands", entry.resourceName);
        if (*entry.themeName == '\0')
            return fallback;
        return QIcon::fromTheme(QLatin1String(entry.themeName), fallback);
    }
    return {};
}

} // namespace AmbrelIcons
