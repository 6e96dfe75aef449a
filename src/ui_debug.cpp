// Contract reports of the library, in the two formats the engine's debug module expects.
#include "ui_debug.h"

#include "qordebug.h"

namespace qorui {

void report_contract(char const *_expression, char const *_message, char const *_file, int _line,
                     char const *_function) {
    if (_message)
        qordebug::assert_func("Expression:   %s\n%s\nFile: %s \nLine: %d\nFunction %s", _expression, _message,
                              _file, _line, _function);
    else
        qordebug::assert_func("Expression:   %s, \nFile: %s \nLine: %d\nFunction %s", _expression, _file, _line,
                              _function);
}

} // namespace qorui
