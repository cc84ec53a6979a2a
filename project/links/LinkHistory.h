#pragma once
// Snapshots of the links after each link operation, for undo and redo. The position designates
// the snapshot that the current links equal.

#include <memory>
#include <vector>

#include "links/LinkList.h"

class CLinkHistory {
  public:
    CLinkHistory() = default;
    // Deep copies; the copy's position designates the corresponding snapshot.
    CLinkHistory(const CLinkHistory& other);
    CLinkHistory& operator=(const CLinkHistory& other);
    CLinkHistory(CLinkHistory&&) noexcept = default;
    CLinkHistory& operator=(CLinkHistory&&) noexcept = default;

    // Drops every snapshot after the position, appends a copy of `links` and moves there.
    void Push(const CLinkList& links);
    bool CanUndo() const { return m_position > 0; }
    bool CanRedo() const { return m_position >= 0 && m_position + 1 < Count(); }
    // Moves one snapshot back (forward) and copies it into `links`; false, with nothing
    // changed, when there is none.
    bool Undo(CLinkList& links);
    bool Redo(CLinkList& links);
    void Clear();

    int Count() const { return static_cast<int>(m_snapshots.size()); }
    // The index of the current snapshot, -1 when the history is empty.
    int Position() const { return m_position; }
    const CLinkList& Snapshot(int index) const { return *m_snapshots[index]; }

  private:
    std::vector<std::unique_ptr<CLinkList>> m_snapshots;
    int m_position = -1;
};
