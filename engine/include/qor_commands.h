// The engine's console commands and variables.
#pragma once
#include "qor_interfaces.h"

// A command: _arguments is the text behind its name, _user the pointer given at registration.
typedef void (*command_callback_t)(char const *_arguments, void *_user);

// The engine's console commands, by name.
class ICmdManagerBase : public IInterfaceBase {
public:
    // A second registration of a name replaces the first.
    virtual void register_command(char const *_name, command_callback_t _callback, void *_user) = 0;
    // Removes the command; an unknown name is ignored.
    virtual void unregister_command(char const *_name) = 0;
    // Runs a command; _arguments is the text behind the name, _echo prints the line first. False
    // when there's no such command.
    virtual bool execute(char const *_name, char const *_arguments, bool _echo) = 0;
    // Name completion, in name order: the first command whose name starts with _prefix, then the
    // one after _name (with _wrap, the first after the last); null when there's none.
    // @{
    virtual char const *find_first_command(char const *_prefix) = 0;
    virtual char const *find_next_command(char const *_name, bool _wrap) = 0;
    // @}
};

// A variable record. The integer and float values follow the text when it is a number.
struct SVariable {
    char const *mp_name;  // the name, as registered
    char const *mp_value; // the value as text
    int m_int_value;      // the number at the start of the text as an integer, else 0
    float m_float_value;  // the number at the start of the text as a float, else 0
};

// The engine's console variables, by name, as text with its number values.
class IVarManagerBase : public IInterfaceBase {
public:
    // The record of the variable, null if there is none. Valid until the variable changes.
    virtual SVariable const *find_var(char const *_name) = 0;
    // Name completion, as find_first_command and find_next_command.
    // @{
    virtual char const *find_first_var(char const *_prefix) = 0;
    virtual char const *find_next_var(char const *_name, bool _wrap) = 0;
    // @}
    // Creates or changes a variable.
    virtual void set_var(char const *_name, char const *_value) = 0;
};
