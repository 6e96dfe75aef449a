// The developer console: a dialog with a history pane above a one-line command box. What the user
// types goes to the engine's command and variable managers; every line that the engine's log
// manager receives, from any module, shows up in the history, also while the console is hidden.
//
//   IConsole        what the service hands out: show, is_show, clear
//   commands        return runs a line (a variable's name runs "set"), tab completes a name,
//                   up and down recall earlier lines, page up and down scroll the history
//
// The service makes the one console and toggles it by the console key; the window tree owns it.
// It has no creator in the windows factory and persists what a dialog persists.
#pragma once
#include "ui_dialog.h"
#include "ui_interfaces.h"
#include "ui_string.h"

#include <deque>

namespace qorui {

class CEditBox;

// The developer console: a history pane of every log message above a one-line command box.
class CConsole : public IConsole, public CDialog {
public:
    // Lines of the history pane; older lines fall off the front.
    static unsigned int const mn_max_history_strings = 1024;
    // Bound of the recall list: after each command it is cut while it holds this many or more, so
    // that one less stands at rest.
    static unsigned int const mn_max_commands = 1024;

    // A translucent dialog, always on top, at least 128 by 128, with the edit boxes "history"
    // (scrollable, tags shown) and "command" (one line, tags shown as typed), each with a
    // "courier" font of its own.
    CConsole(CDesktop *_p_desktop, char const *_name);
    // The boxes go with the window tree.
    virtual ~CConsole() {}

    QOR_CLASS_ID(CConsole, CDialog, "Console")

    // IConsole: the same object as the window

    // EVENT_SHOW or EVENT_HIDE to the console window.
    void show(bool _show) override;
    bool is_show() override { return !is_hidden(); }
    CConsole *get_console() override { return this; }
    // Empties the command line and the history; the recall list stays.
    void clear() override;

    // The parts, for the owner and for tests

    // The history pane and the command box, children of the console.
    // @{
    CEditBox *get_history() { return mp_history; }
    CEditBox *get_command() { return mp_command; }
    // @}
    // The number of lines kept for recall.
    unsigned int get_commands_count() const { return static_cast<unsigned int>(m_commands.size()); }

protected:
    // Behind the visual window's, also while hidden: every log message not yet shown goes to the
    // history, oldest first.
    virtual void on_event_update(CWndEvent const *_p_event) override;
    // The dialog's only.
    virtual void on_event_show(CWndEvent const *_p_event) override;
    // Behind the dialog's: drops a half-typed line.
    virtual void on_event_hide(CWndEvent const *_p_event) override;
    // Shows the command box's caret and brings the pointer back (enabled and shown).
    virtual void on_event_activate(CWndEvent const *_p_event) override;
    // Hides the command box's caret.
    virtual void on_event_deactivate(CWndEvent const *_p_event) override;
    // Behind the dialog's: the history fills the client area below the caption, the command box
    // stands two pixels below it.
    virtual void on_event_resized(CWndEvent const *_p_event) override;
    // Maximises the console, or restores a maximised one.
    virtual void on_event_double_click(CWndEvent const *_p_event) override;
    // The dialog's only: dragging moves the console.
    virtual void on_event_drag(CWndEvent const *_p_event) override;
    // Adds the wide string of the event to the history as a line, also when the history isn't
    // editable; anybody may send it.
    virtual void on_event_set_text(CWndEvent const *_p_event) override;
    // Tab completes, return runs the line, page up and down scroll the history by a line, up and
    // down recall earlier lines; other keys go on to the command box.
    virtual void on_event_key_down(CWndEvent const *_p_event) override;
    // Characters other than tab go on to the command box.
    virtual void on_event_char(CWndEvent const *_p_event) override;

    // The line becomes the next name (command first, then variable) that starts with the name in
    // front of its first blank, and one blank; false, and the line stays, when there is none.
    bool complete_command(CString &_line);
    // Echoes the line to the log, keeps it for recall and runs it; always true.
    bool process_command(CString const &_line);

    CEditBox *mp_history;                                   // child "history", owned by the window tree
    CEditBox *mp_command;                                   // child "command", owned by the window tree
    std::deque<CString, qor_allocator<CString>> m_commands; // oldest first
    unsigned int mn_curr_command_idx;                       // the entry that the next key up or down recalls
    unsigned int m_next_message; // running index of the first log message not yet shown

private:
    // The keys that the console keeps for itself: tab, return, page up, page down, up, down.
    void complete_line();
    void run_line();
    void scroll_history_up();
    void scroll_history_down();
    void recall_previous() { recall_command(-1); }
    void recall_next() { recall_command(+1); }
    // The entry at the index into the command line; then the index steps by _step, wrapping.
    void recall_command(int _step);
    // A box of the console: attached, with a translucent dark material and a "courier" of its own.
    CEditBox *make_box(char const *_name);
};

} // namespace qorui
