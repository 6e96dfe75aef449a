// Contract checks of the library. A broken contract is reported through qordebug::assert_func
// with the expression, file, line and function; the caller then steps aside with its neutral
// result:  if (!QOR_CHECK(p_child)) return;
// Internal to the library (its sources and the stream templates of its headers use it); may
// change between versions.
#pragma once

namespace qorui {
// Reports a broken contract through qordebug::assert_func: the expression, the message if not
// null, the file, the line and the function.
void report_contract(char const *_expression, char const *_message, char const *_file, int _line,
                     char const *_function);
} // namespace qorui

// True when _expr holds; otherwise reports it and gives false.
#define QOR_CHECK(_expr)                                                                                     \
    ((_expr) ? true : (::qorui::report_contract(#_expr, nullptr, __FILE__, __LINE__, __func__), false))

// The same, with a message behind the expression in the report.
#define QOR_CHECK_MSG(_expr, _message)                                                                       \
    ((_expr) ? true : (::qorui::report_contract(#_expr, _message, __FILE__, __LINE__, __func__), false))

// For a contract whose C++ needs casts that its reported expression doesn't show.
#define QOR_CHECK_AS(_expr, _text)                                                                           \
    ((_expr) ? true : (::qorui::report_contract(_text, nullptr, __FILE__, __LINE__, __func__), false))
