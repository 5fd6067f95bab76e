#pragma once

#include <QPoint>

// What the drop target asks of the tree while files or text from outside are dragged over
// it. Points are in the tree viewport's coordinates.
class IDropFeedback {
public:
    virtual ~IDropFeedback() = default;

    // Makes the item under the point the model's drop target (none over empty space), shows
    // the insertion line or the folder highlight, hovers, expands and scrolls as for a drag
    // inside the tree; true when the place takes a drop.
    virtual bool DragOverFromOutside(const QPoint& viewportPoint) = 0;
    // Hides the insertion line and the highlight; the model's drop target stays, because the
    // drop is carried out after this.
    virtual void RemoveInsertionMark() = 0;
    // The outside drag is over (dropped or gone): its marks, hover and scrolling end.
    virtual void EndExternalDrag() = 0;
};
