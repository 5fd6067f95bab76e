#pragma once

#include <cstddef>
#include <cstdint>
#include <vector>

class NavListItemData;

// What changed in the records since the tree last followed them: the records whose own state
// (title, expansion, open or linked state, kind) changed, or the structure (records added,
// removed or moved, identifiers changed), after which the tree walks every record again.
class NavChangeLog {
public:
    void RecordChanged(NavListItemData* record) {
        if (m_structureChanged)
            return;
        // Past a few hundred records a walk over all of them is no dearer.
        if (m_records.size() >= kMaxRecords) {
            StructureChanged();
            return;
        }
        m_records.push_back(record);
    }
    void StructureChanged() {
        m_structureChanged = true;
        m_records.clear();
    }
    bool IsStructureChanged() const { return m_structureChanged; }
    // Records leave the model only after a change of the structure, so these are alive.
    const std::vector<NavListItemData*>& ChangedRecords() const { return m_records; }
    // The tree followed the changes. Each clearing has its own number, so that a tree can tell
    // whether another one took the changes since it last looked.
    void Clear() {
        m_structureChanged = false;
        m_records.clear();
        ++m_clearing;
    }
    std::uint64_t Clearing() const { return m_clearing; }

private:
    static constexpr std::size_t kMaxRecords = 256;
    bool m_structureChanged = true;
    std::vector<NavListItemData*> m_records;
    std::uint64_t m_clearing = 0;
};
