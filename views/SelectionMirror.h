#pragma once
// How the two sequence panes repeat each other's selections: each calls these on the other one
// (rows are found by name; a row the other pane lacks is skipped). The receiving pane does not
// repeat a mirrored event back.

#include <string>
#include <vector>

#include "layout/Selection.h"

class ISelectionMirror {
  public:
    virtual ~ISelectionMirror() = default;
    // A mouse selection was completed: take over these entries (already trimmed at gaps);
    // with `scroll`, scroll to their smallest start column minus 5.
    virtual void MirrorSelectionCompleted(const std::vector<ALN_BSEL_ENTRY>& entries,
                                          bool scroll) = 0;
    virtual void MirrorSelectionCleared() = 0;
    // A row's range was set to columns [start, end).
    virtual void MirrorRowRange(const std::string& row, int start, int end) = 0;
    // A row was moved to `index` among the molecule rows.
    virtual void MirrorRowMoved(const std::string& row, int index) = 0;
    // A row was chosen by a click on its name: it becomes the selected current row.
    virtual void MirrorCurrentRow(const std::string& row) = 0;
};
