#pragma once
// Layout strings describe how the panes of the main window are arranged: nested groups of pane
// numbers, "(...)" side by side, "{...}" one above the other and "[...]" on tabs, for example
// "({0,1},{2,3})". This part is plain C++ so that it can be tested and fuzzed without a display.

#include <string>
#include <string_view>
#include <utility>
#include <vector>

// Kinds of a layout item; a pane item's kind is its pane number (0 or more).
constexpr int kLayoutHorizontal = -1;  // round brackets: members side by side
constexpr int kLayoutVertical = -3;    // curly brackets: members one above the other
constexpr int kLayoutTabular = -5;     // square brackets: members on tabs

// Error codes of the parser.
enum LayoutError {
    kLayoutOk = 0,
    kLayoutUnknownSymbol = 0x800,
    kLayoutSyntaxError = 0x801,
    kLayoutUnexpectedEnd = 0x802,
    kLayoutWrongViewNumber = 0x803,
    kLayoutDuplicateViewNumber = 0x804,
};

// The user text of an error code; `symbol` is the offending character of kLayoutUnknownSymbol.
std::string LayoutErrorMessage(int code, char symbol = '?');

struct CLayoutItem {
    int kind = kLayoutHorizontal;
    int sizeSuffix = -1;  // value of a "<n>" after the item, -1 when absent
    std::vector<CLayoutItem> children;

    bool IsPane() const { return kind >= 0; }
    bool IsSplitter() const { return kind == kLayoutHorizontal || kind == kLayoutVertical; }
    bool IsTabular() const { return kind == kLayoutTabular; }
};

struct CLayoutParseResult {
    CLayoutItem root;
    int error = kLayoutOk;
    std::string message;  // empty when the parse succeeded

    bool Ok() const { return error == kLayoutOk; }
};

// Parses a layout string for `paneCount` registered panes.
CLayoutParseResult ParseLayout(std::string_view text, int paneCount);

// The canonical layout string of a tree: brackets, members separated by "," and nothing else.
// A lone pane is written as a group of one, "(n)", so that the text parses again.
std::string ComposeLayout(const CLayoutItem& item);

// The group items of a tree in pre-order (outermost first, then each group's member groups in
// order, depth first): the numbering under which sizes and selected tabs are stored.
std::vector<const CLayoutItem*> GroupsInPreOrder(const CLayoutItem& root);
std::vector<CLayoutItem*> GroupsInPreOrder(CLayoutItem& root);

// Pane numbers of a tree in string order.
std::vector<int> PanesOf(const CLayoutItem& root);

// A list of predefined layouts, "name|layout|name|layout...", as (name, layout) pairs; a
// trailing name without a layout is dropped.
std::vector<std::pair<std::string, std::string>> SplitPredefinedLayouts(std::string_view text);
