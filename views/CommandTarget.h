#pragma once
// Something that answers commands: the active pane, the document, the frame or the application.
// A router asks them in that order both to run a command and to decide its state.

#include <QString>

// The state of one command as a menu item or button shows it.
struct CCommandState {
    bool enabled = true;
    bool checked = false;
    bool visible = true;
    QString text;  // a replacement menu text; empty keeps the table's text
};

class ICommandTarget {
  public:
    virtual ~ICommandTarget() = default;
    // Returns true when this target answers `id`, after filling `state`.
    virtual bool UpdateCommand(int id, CCommandState& state) = 0;
    // Runs a command that UpdateCommand answered and found enabled.
    virtual void RunCommand(int id) = 0;
};
