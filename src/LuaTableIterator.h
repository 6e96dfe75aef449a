// Walking Lua tables and the fields of layout tables. Each reader takes its key only when it has
// the expected Lua type; otherwise the value stays as it is, with no message.
// Internal to the library.
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

// The one gate of numbers from data: a number of the value, finite and within
// +-k_data_number_limit, in _number. Any other number is bad data: reported by a warning that
// names _key, and false, so the field stays as it is. Not a number: false, with no message.
double const k_data_number_limit = 16777216.0; // 2^24: sums of positions stay far inside int
bool read_number(LuaPlus::LuaObject const &_lo_value, char const *_key, double &_number);

// The gate of names from data (windows, classes, materials, fonts): a string that fits a HUID, in
// _name. A longer one is bad data: reported by a warning, and false. Not a string: false, with no
// message.
bool read_name(LuaPlus::LuaObject const &_lo_value, char const *&_name);

// Each reader tells whether it took the value. Numbers go through read_number.
bool read_bool(LuaPlus::LuaObject const &_lo_table, char const *_key, bool &_value);
// A number, truncated toward zero.
bool read_int(LuaPlus::LuaObject const &_lo_table, char const *_key, int &_value);
// Only a number with no fraction: any other number leaves the value as well.
bool read_integer(LuaPlus::LuaObject const &_lo_table, char const *_key, int &_value);
bool read_float(LuaPlus::LuaObject const &_lo_table, char const *_key, float &_value);
bool read_string(LuaPlus::LuaObject const &_lo_table, char const *_key, string &_value);
// A string that is one of the names of g_alignment_names.
bool read_alignment(LuaPlus::LuaObject const &_lo_table, char const *_key, EAlignment &_value);
// Numbers 1 and 2 of the table under _key, each only when it is a number (to an integer by
// truncation toward zero); false when there is no table under the key.
template <class T>
bool read_pair(LuaPlus::LuaObject const &_lo_table, char const *_key, T &_first, T &_second) {
    LuaPlus::LuaObject const pair = _lo_table.GetByName(_key);
    if (!pair.IsTable()) return false;
    double number;
    if (read_number(pair.GetByIndex(1), _key, number)) _first = static_cast<T>(number);
    if (read_number(pair.GetByIndex(2), _key, number)) _second = static_cast<T>(number);
    return true;
}

// A new table under _key with the two numbers at 1 and 2.
void write_pair(LuaPlus::LuaObject &_lo_table, char const *_key, double _first, double _second);

} // namespace qorui
