// The engine's console commands and variables.
#pragma once
#include "qor_interfaces.h"

typedef void (*command_callback_t)(char const *_arguments, void *_user);

// The engine's console commands, by name.
class ICmdManagerBase : public IInterfaceBase {
public:
    // A second registration of a name replaces the first.
    virtual void register_command(char const *_name, command_callback_t _callback, void *_user) = 0;
    virtual void unregister_command(char const *_name) = 0;
    // Runs a command; _arguments is the text behind the name. False when there's no such command.
    virtual bool execute(char const *_name, char const *_arguments, bool _echo) = 0;
    // Name completion, in name order: the first command whose name starts with _prefix, then the
    // one after _name; null when there's none.
    virtual char const *find_first_command(char const *_prefix) = 0;
    virtual char const *find_next_command(char const *_name, bool _wrap) = 0;
};

// A variable record. The integer and float values follow the text when it is a number.
struct SVariable {
    char const *mp_name;
    char const *mp_value;
    int m_int_value;
    float m_float_value;
};

// The engine's console variables, by name, as text with its number values.
class IVarManagerBase : public IInterfaceBase {
public:
    virtual SVariable const *find_var(char const *_name) = 0;
    virtual char const *find_first_var(char const *_prefix) = 0;
    virtual char const *find_next_var(char const *_name, bool _wrap) = 0;
    // Creates or changes a variable.
    virtual void set_var(char const *_name, char const *_value) = 0;
};
