#pragma once

namespace Platform {

// The busy cursor shown during a long operation. Begin and End nest.
class IWaitCursor {
public:
    virtual ~IWaitCursor() = default;
    virtual void Begin() = 0;
    virtual void End() = 0;
};

// The wait cursor in use; without a user interface it does nothing.
IWaitCursor& WaitCursor();
void SetWaitCursor(IWaitCursor* cursor);

// Shows the wait cursor for the life of the scope.
class WaitCursorScope {
public:
    WaitCursorScope() { WaitCursor().Begin(); }
    ~WaitCursorScope() { WaitCursor().End(); }
    WaitCursorScope(const WaitCursorScope&) = delete;
    WaitCursorScope& operator=(const WaitCursorScope&) = delete;
};

} // namespace Platform
