// The host's console commands and variables. Names are case-sensitive and kept in name order,
// which is the order of completion: find_first_... gives the first name with a prefix,
// find_next_... the one after a name among the names with that same prefix. Asked for the name
// that it offered last, find_first_... keeps the prefix that led to it, so that a console which
// completes a line and asks again with the whole name goes on through the names of the prefix
// typed first.
#pragma once
#include "qor_commands.h"

#include <map>
#include <memory>
#include <string>

namespace qorhost {

class CVarManager;

// Completion over a sorted map of names.
template <class Map>
class CNameCompletion {
public:
    char const *first(Map const &_names, char const *_prefix);
    char const *next(Map const &_names, char const *_name, bool _wrap);

private:
    char const *offer(char const *_name);

    std::string m_prefix;
    std::string m_offered; // the name given out last, "" after none
};

class CCmdManager : public ICmdManagerBase {
public:
    explicit CCmdManager(CVarManager *_p_vars);

    SInterfaceUID get_uid() const override { return qor_uid::CMD_MANAGER; }
    int get_version() const override { return 1; }

    void register_command(char const *_name, command_callback_t _callback, void *_user) override;
    void unregister_command(char const *_name) override;
    bool execute(char const *_name, char const *_arguments, bool _echo) override;
    char const *find_first_command(char const *_prefix) override;
    char const *find_next_command(char const *_name, bool _wrap) override;

    // "name arguments": the name ends at the first blank; the rest, without leading blanks, are
    // the arguments.
    bool run_line(char const *_line);
    bool has_command(char const *_name) const;

private:
    struct SCommand {
        command_callback_t mp_callback;
        void *mp_user;
    };
    static void cmd_set(char const *_arguments, void *_user);

    std::map<std::string, SCommand> m_commands;
    CNameCompletion<std::map<std::string, SCommand>> m_completion;
    CVarManager *mp_vars;
};

class CVarManager : public IVarManagerBase {
public:
    SInterfaceUID get_uid() const override { return qor_uid::VAR_MANAGER; }
    int get_version() const override { return 1; }

    SVariable const *find_var(char const *_name) override;
    char const *find_first_var(char const *_prefix) override;
    char const *find_next_var(char const *_name, bool _wrap) override;
    // The integer and float values follow the text when it starts with a number, else 0.
    void set_var(char const *_name, char const *_value) override;

private:
    struct SRecord {
        std::string m_name;
        std::string m_value;
        SVariable m_variable;
    };
    std::map<std::string, std::unique_ptr<SRecord>> m_vars; // records keep their addresses
    CNameCompletion<std::map<std::string, std::unique_ptr<SRecord>>> m_completion;
};

} // namespace qorhost
