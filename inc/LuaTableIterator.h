// Walking Lua tables and the fields of layout tables. Each reader takes its key only when it has
// the expected Lua type; otherwise the value stays as it is, with no message.
#pragma once
#include "qor_memory.h"
#include "qorscriptsystem.h"
#include "ui_geometry.h"

namespace qorui {

// Every entry of a table in the table's own order, as _visit(key, value).
template <class TVisit>
void for_each_entry(LuaPlus::LuaObject const &_lo_table, TVisit _visit) {
    LuaPlus::LuaObject key(_lo_table.GetState()), value(_lo_table.GetState());
    while (LuaPlus::LuaPlusH_next(_lo_table.GetState(), _lo_table, key, value))
        _visit(static_cast<LuaPlus::LuaObject const &>(key), static_cast<LuaPlus::LuaObject const &>(value));
}

// Each reader tells whether it took the value.
bool read_bool(LuaPlus::LuaObject const &_lo_table, char const *_key, bool &_value);
// A number, truncated toward zero.
bool read_int(LuaPlus::LuaObject const &_lo_table, char const *_key, int &_value);
// Only a number with no fraction: any other number leaves the value as well.
bool read_integer(LuaPlus::LuaObject const &_lo_table, char const *_key, int &_value);
bool read_float(LuaPlus::LuaObject const &_lo_table, char const *_key, float &_value);
bool read_string(LuaPlus::LuaObject const &_lo_table, char const *_key, string &_value);
// A string that is one of the names of g_alignment_names.
bool read_alignment(LuaPlus::LuaObject const &_lo_table, char const *_key, EAlignment &_value);

// A new table under _key with the two numbers at 1 and 2.
void write_pair(LuaPlus::LuaObject &_lo_table, char const *_key, double _first, double _second);

} // namespace qorui
