#pragma once
// The program's molecule selection, kept by the text pane: the document's search, export and
// select-aligned commands read and set it through this interface.

#include <string>
#include <vector>

class IMoleculeSelection {
  public:
    virtual ~IMoleculeSelection() = default;
    // Names of the selected molecules in project order.
    virtual std::vector<std::string> SelectedMolecules() const = 0;
    virtual int SelectedCount() const = 0;
    // Selects exactly the molecules of these names.
    virtual void SelectMolecules(const std::vector<std::string>& names) = 0;
};
