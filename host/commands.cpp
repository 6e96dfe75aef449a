// The host's console commands and variables: registration, running by name or line, completion
// of names in order, and the "set" command.
#include "commands.h"

#include "qordebug.h"

#include <cstdio>
#include <cstdlib>
#include <cstring>

namespace qorhost {

// ---------------------------------------------------------------------------------------------
// Completion
// ---------------------------------------------------------------------------------------------

namespace {
bool starts_with(std::string const &_text, std::string const &_prefix) {
    return _text.compare(0, _prefix.size(), _prefix) == 0;
}
} // namespace

template <class Map>
char const *CNameCompletion<Map>::first(Map const &_names, char const *_prefix) {
    std::string const prefix = _prefix ? _prefix : "";
    bool const continues = !m_offered.empty() && prefix == m_offered && starts_with(m_offered, m_prefix);
    if (!continues) m_prefix = prefix;
    auto found = _names.lower_bound(prefix);
    return offer(found != _names.end() && starts_with(found->first, prefix) ? found->first.c_str() : nullptr);
}

template <class Map>
char const *CNameCompletion<Map>::next(Map const &_names, char const *_name, bool _wrap) {
    auto found = _names.upper_bound(_name ? _name : "");
    if (found != _names.end() && starts_with(found->first, m_prefix)) return offer(found->first.c_str());
    if (!_wrap) return offer(nullptr);
    std::string const prefix = m_prefix;
    m_offered.clear(); // a new round of the same prefix
    return first(_names, prefix.c_str());
}

template <class Map>
char const *CNameCompletion<Map>::offer(char const *_name) {
    m_offered = _name ? _name : "";
    return _name;
}

// ---------------------------------------------------------------------------------------------
// Commands
// ---------------------------------------------------------------------------------------------

CCmdManager::CCmdManager(CVarManager *_p_vars) : mp_vars(_p_vars) { register_command("set", cmd_set, this); }

void CCmdManager::register_command(char const *_name, command_callback_t _callback, void *_user) {
    if (!_name || !*_name || !_callback) return;
    m_commands[_name] = SCommand{_callback, _user};
}

void CCmdManager::unregister_command(char const *_name) {
    if (_name) m_commands.erase(_name);
}

bool CCmdManager::execute(char const *_name, char const *_arguments, bool _echo) {
    auto found = _name ? m_commands.find(_name) : m_commands.end();
    if (found == m_commands.end()) {
        qordebug::warning("Unknown command '%s'", _name ? _name : "");
        return false;
    }
    if (_echo) printf("> %s %s\n", _name, _arguments ? _arguments : "");
    SCommand const command = found->second; // the command may unregister itself
    command.mp_callback(_arguments ? _arguments : "", command.mp_user);
    return true;
}

char const *CCmdManager::find_first_command(char const *_prefix) { return m_completion.first(m_commands, _prefix); }

char const *CCmdManager::find_next_command(char const *_name, bool _wrap) {
    return m_completion.next(m_commands, _name, _wrap);
}

bool CCmdManager::run_line(char const *_line) {
    if (!_line) return false;
    while (*_line == ' ' || *_line == '\t') ++_line;
    char const *end = _line;
    while (*end && *end != ' ' && *end != '\t') ++end;
    std::string const name(_line, end);
    while (*end == ' ' || *end == '\t') ++end;
    return execute(name.c_str(), end, false);
}

bool CCmdManager::has_command(char const *_name) const { return _name && m_commands.count(_name) > 0; }

void CCmdManager::cmd_set(char const *_arguments, void *_user) {
    CCmdManager *p_self = static_cast<CCmdManager *>(_user);
    char name[256] = "";
    int consumed = 0;
    if (sscanf(_arguments, " %255s %n", name, &consumed) < 1 || !_arguments[consumed]) {
        qordebug::warning("Use of command 'set':\nset <variable> <value>");
        return;
    }
    p_self->mp_vars->set_var(name, _arguments + consumed);
}

// ---------------------------------------------------------------------------------------------
// Variables
// ---------------------------------------------------------------------------------------------

SVariable const *CVarManager::find_var(char const *_name) {
    auto found = _name ? m_vars.find(_name) : m_vars.end();
    return found == m_vars.end() ? nullptr : &found->second->m_variable;
}

char const *CVarManager::find_first_var(char const *_prefix) { return m_completion.first(m_vars, _prefix); }

char const *CVarManager::find_next_var(char const *_name, bool _wrap) { return m_completion.next(m_vars, _name, _wrap); }

void CVarManager::set_var(char const *_name, char const *_value) {
    if (!_name || !*_name) return;
    std::unique_ptr<SRecord> &p_record = m_vars[_name];
    if (!p_record) p_record = std::make_unique<SRecord>();
    p_record->m_name = _name;
    p_record->m_value = _value ? _value : "";
    char const *text = p_record->m_value.c_str();
    p_record->m_variable.mp_name = p_record->m_name.c_str();
    p_record->m_variable.mp_value = text;
    p_record->m_variable.m_int_value = static_cast<int>(strtol(text, nullptr, 10));
    p_record->m_variable.m_float_value = strtof(text, nullptr);
}

} // namespace qorhost
