// The developer console.
//
//   construction        the two boxes, materials, fonts, margins and constraints
//   layout              the history above the command line
//   the log             messages of the engine's log manager pulled each frame into the history
//   commands            running a line, completing a name, recalling earlier lines
//   input               the key table and characters
//   showing             hide, activation, double click, and what the service asks through IConsole
#include "ui_console.h"
#include "engine_interfaces.h"
#include "qor_commands.h"
#include "qor_log.h"
#include "ui_debug.h"
#include "ui_desktop.h"
#include "ui_edit_box.h"
#include "ui_font.h"
#include "ui_logger.h"
#include "ui_material.h"

#include <cstring>

namespace qorui {

unsigned int const CConsole::mn_max_history_strings;
unsigned int const CConsole::mn_max_commands;

namespace {

unsigned short const k_blank = ' ';
unsigned short const k_tab = 9;

// One message of the engine's log as the console keeps it until it has shown it.
struct SConsoleMessage {
    CString m_text;
    uint32_t m_index;
};

// Copies the messages that the log manager hands out: their text lives only during the visit.
class CMessageCollector : public ILogMessageVisitor {
public:
    explicit CMessageCollector(qor_vector<SConsoleMessage> &_messages) : m_messages(_messages) {}
    void on_message(SLogMessage const &_message) override {
        m_messages.push_back(SConsoleMessage{CString(_message.mp_text), _message.m_index});
    }

private:
    qor_vector<SConsoleMessage> &m_messages;
};

} // namespace

// ---------------------------------------------------------------------------------------------
// Construction
// ---------------------------------------------------------------------------------------------

// A smaller caption and buttons than a dialog's; the command line shows what is typed as typed,
// the history shows colour tags.
CConsole::CConsole(CDesktop *_p_desktop, char const *_name)
    : CDialog(_p_desktop, _name), mp_history(nullptr), mp_command(nullptr), mn_curr_command_idx(0),
      m_next_message(0) {
    m_caption_h = 20;
    m_button_w = 128;
    m_button_h = 20;
    add_material(MAT_NAME_NORMAL, create_color_material(_p_desktop, rgba_t(100, 100, 100, 150)));
    m_canvas.set_tags_enable(true);

    mp_history = make_box("history");
    mp_history->set_scrollable_v(true);
    mp_history->get_text().set_max_strings(mn_max_history_strings);
    mp_history->get_canvas().set_tags_enable(true);

    mp_command = make_box("command");
    mp_command->get_text().set_multiline(false);
    mp_command->get_canvas().set_tags_enable(false);

    for (CEditBox *p_box : {mp_history, mp_command})
        p_box->set_uniform_margins(4);
    set_constraints(SConstraints{128, 0, 128, 0});
    set_left_margin(4);
    set_right_margin(4);
    set_bottom_margin(8);
    set_top_margin(8);
    // The console is the active window and its boxes never are: every key comes to the console.
    for (CEditBox *p_box : {mp_history, mp_command})
        p_box->set_passive(true);
    set_always_on_top(true);
    send_event(this, EVENT_RESIZED, CWndEvent::DISPATCH_NONE);
}

CEditBox *CConsole::make_box(char const *_name) {
    CEditBox *p_box = new CEditBox(mp_desktop, _name);
    attach_child(p_box);
    p_box->add_material(MAT_NAME_NORMAL, create_color_material(mp_desktop, rgba_t(15, 15, 15, 150)));
    p_box->add_font(FNT_NAME_DEFAULT, get_fonts_factory().create("courier", mp_desktop));
    return p_box;
}

// ---------------------------------------------------------------------------------------------
// Layout
// ---------------------------------------------------------------------------------------------

// The command line stands two pixels below the height that the history really took.
void CConsole::on_event_resized(CWndEvent const *_p_event) {
    CDialog::on_event_resized(_p_event);
    int const top = m_top_margin + m_caption_h;
    int const w = get_w() - m_right_margin - m_left_margin;
    mp_history->set_pos(m_left_margin, top);
    mp_history->set_size(w, get_h() - m_button_h - m_bottom_margin - top);
    int const history_h = mp_history->get_h();
    mp_command->set_pos(m_left_margin, history_h + top + 2);
    mp_command->set_size(w, get_h() - m_bottom_margin - history_h - top);
}

// ---------------------------------------------------------------------------------------------
// The log
// ---------------------------------------------------------------------------------------------

// Updates come also while the console is hidden, so it collects the messages of the meantime. The
// messages are copied out first and shown after the visit: showing them must not run inside the
// log manager. The list keeps its memory between frames: a frame without new messages is one
// call and no allocation.
void CConsole::on_event_update(CWndEvent const *_p_event) {
    CDialog::on_event_update(_p_event);
    static qor_vector<SConsoleMessage> s_messages;
    s_messages.clear();
    ILogManager *p_log = engine_interfaces().get_log_manager(true);
    if (!p_log) return;
    CMessageCollector collector(s_messages);
    p_log->get_messages(collector, m_next_message, -1);
    for (SConsoleMessage const &message : s_messages) {
        CWndEvent event(EVENT_SET_TEXT);
        event << static_cast<wstring const &>(message.m_text);
        send_event(this, &event, CWndEvent::DISPATCH_NONE);
        m_next_message = message.m_index + 1;
    }
}

// Anybody may add a line to the history this way. The line goes in also though the history's
// text isn't the user's to edit, and the box scrolls to the end.
void CConsole::on_event_set_text(CWndEvent const *_p_event) {
    CDialog::on_event_set_text(_p_event);
    _p_event->rewind();
    wstring text;
    *_p_event >> text;
    mp_history->get_text().insert_str(text.c_str(), true);
}

// ---------------------------------------------------------------------------------------------
// Commands
// ---------------------------------------------------------------------------------------------

// The echo comes back into the history through the log like any other line. A line that starts
// with a variable's name runs "set" with the whole line; whether a command exists is the command
// manager's affair.
bool CConsole::process_command(CString const &_line) {
    static unsigned short const s_plain[] = {'%', 's', 0};
    console_logger().log_message(s_plain, _line.c_str());

    m_commands.push_back(_line);
    while (m_commands.size() >= mn_max_commands)
        m_commands.pop_front();
    mn_curr_command_idx = static_cast<unsigned int>(m_commands.size() - 1);

    size_t const blank = _line.find(k_blank);
    string name = CString(_line, blank == wstring::npos ? -1 : static_cast<int>(blank)).get_str_c();
    string arguments = blank == wstring::npos ? string() : CString(_line.substr(blank)).get_str_c();
    IVarManagerBase *p_vars = engine_interfaces().get_var_manager(true);
    if (p_vars && p_vars->find_var(name.c_str())) {
        arguments = name + arguments;
        name = "set";
    }
    if (ICmdManagerBase *p_commands = engine_interfaces().get_cmd_manager(true))
        p_commands->execute(name.c_str(), arguments.c_str(), true);
    return true;
}

// Commands go before variables: a variable is offered only when no command starts with the name.
// A name that is complete already moves on to the next one, so a completed line (which ends in a
// blank) goes on to the next name at the next call.
bool CConsole::complete_command(CString &_line) {
    size_t const blank = _line.find(k_blank);
    string const prefix = CString(_line, blank == wstring::npos ? -1 : static_cast<int>(blank)).get_str_c();
    ICmdManagerBase *p_commands = engine_interfaces().get_cmd_manager(true);
    IVarManagerBase *p_vars = engine_interfaces().get_var_manager(true);
    char const *p_name = p_commands ? p_commands->find_first_command(prefix.c_str()) : nullptr;
    if (p_name) {
        if (prefix == p_name) p_name = p_commands->find_next_command(p_name, true);
    } else if (p_vars && (p_name = p_vars->find_first_var(prefix.c_str()))) {
        if (prefix == p_name) p_name = p_vars->find_next_var(p_name, true);
    }
    if (!p_name) return false;
    _line = CString(p_name);
    _line.push_back(k_blank);
    return true;
}

// The index moves after the recall: the first key up after a command shows that command.
void CConsole::recall_command(int _step) {
    unsigned int const count = static_cast<unsigned int>(m_commands.size());
    if (count == 0) return;
    if (!QOR_CHECK_AS(mn_curr_command_idx < count, "mn_curr_command_idx < m_commands.size()")) return;
    CText &text = mp_command->get_text();
    text.clear();
    text.insert_str(m_commands[mn_curr_command_idx].c_str(), false); // a single line drops the break
    unsigned int const last = count - 1;
    if (_step < 0)
        mn_curr_command_idx = mn_curr_command_idx == 0 ? last : mn_curr_command_idx - 1;
    else
        mn_curr_command_idx = mn_curr_command_idx == last ? 0 : mn_curr_command_idx + 1;
}

// ---------------------------------------------------------------------------------------------
// Input
// ---------------------------------------------------------------------------------------------

// The changed line is news to the text; placing the caret makes the box lay it out.
void CConsole::complete_line() {
    CString *p_line = mp_command->get_text().get_string(0);
    if (!p_line) return;
    complete_command(*p_line);
    mp_command->get_text().set_caret_char(static_cast<int>(p_line->length()));
}

// A copy runs: a command may clear the console and with it the line.
void CConsole::run_line() {
    CString const *p_line = mp_command->get_text().get_string(0);
    if (!p_line || p_line->empty()) return;
    process_command(CString(*p_line));
    mp_command->get_text().clear();
}

// The page keys scroll the history by lines.
void CConsole::scroll_history_up() {
    send_event(mp_history, EVENT_LINE_UP, CWndEvent::DISPATCH_NONE);
}

void CConsole::scroll_history_down() {
    send_event(mp_history, EVENT_LINE_DOWN, CWndEvent::DISPATCH_NONE);
}

// The console's own keys; every other key goes on to the command line, which edits by it.
void CConsole::on_event_key_down(CWndEvent const *_p_event) {
    CDialog::on_event_key_down(_p_event);
    static struct {
        int m_key;
        void (CConsole::*m_action)();
    } const s_keys[] = {
        {9, &CConsole::complete_line},      {13, &CConsole::run_line},
        {33, &CConsole::scroll_history_up}, {34, &CConsole::scroll_history_down},
        {38, &CConsole::recall_previous},   {40, &CConsole::recall_next},
    };
    _p_event->rewind();
    int key = 0;
    *_p_event >> key;
    for (auto const &entry : s_keys) {
        if (entry.m_key != key) continue;
        (this->*entry.m_action)();
        return;
    }
    send_event(mp_command, _p_event, CWndEvent::DISPATCH_NONE);
}

// Tab completes; its character never enters the line.
void CConsole::on_event_char(CWndEvent const *_p_event) {
    CDialog::on_event_char(_p_event);
    _p_event->rewind();
    int code = 0;
    *_p_event >> code;
    if (code != k_tab) send_event(mp_command, _p_event, CWndEvent::DISPATCH_NONE);
}

// ---------------------------------------------------------------------------------------------
// Showing
// ---------------------------------------------------------------------------------------------

void CConsole::on_event_show(CWndEvent const *_p_event) {
    CDialog::on_event_show(_p_event);
}

void CConsole::on_event_drag(CWndEvent const *_p_event) {
    CDialog::on_event_drag(_p_event);
}

// A half-typed line goes when the console closes.
void CConsole::on_event_hide(CWndEvent const *_p_event) {
    CDialog::on_event_hide(_p_event);
    mp_command->get_text().clear();
}

// Activating the console brings the pointer back.
void CConsole::on_event_activate(CWndEvent const *_p_event) {
    CDialog::on_event_activate(_p_event);
    mp_command->show_caret(true);
    if (CDesktop *p_desktop = get_desktop()) {
        CPointer &pointer = p_desktop->get_pointer();
        p_desktop->send_event(&pointer, EVENT_ENABLE, CWndEvent::DISPATCH_NONE);
        p_desktop->send_event(&pointer, EVENT_SHOW, CWndEvent::DISPATCH_NONE);
    }
}

void CConsole::on_event_deactivate(CWndEvent const *_p_event) {
    CDialog::on_event_deactivate(_p_event);
    mp_command->show_caret(false);
}

void CConsole::on_event_double_click(CWndEvent const *_p_event) {
    CDialog::on_event_double_click(_p_event);
    send_event(this, is_maximaized() ? EVENT_SHOW_NORMAL : EVENT_SHOW_MAXIMIZED, CWndEvent::DISPATCH_NONE);
}

void CConsole::show(bool _show) {
    send_event(this, _show ? EVENT_SHOW : EVENT_HIDE, CWndEvent::DISPATCH_NONE);
}

void CConsole::clear() {
    mp_command->get_text().clear();
    mp_history->get_text().clear();
}

} // namespace qorui
