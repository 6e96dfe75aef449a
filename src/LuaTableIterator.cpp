// The readers of typed fields of Lua tables and the writer of pairs, shared by every layout.
#include "LuaTableIterator.h"

namespace qorui {

bool read_bool(LuaPlus::LuaObject const &_lo_table, char const *_key, bool &_value) {
    LuaPlus::LuaObject const value = _lo_table.GetByName(_key);
    if (!value.IsBoolean()) return false;
    _value = value.GetBoolean();
    return true;
}

bool read_int(LuaPlus::LuaObject const &_lo_table, char const *_key, int &_value) {
    LuaPlus::LuaObject const value = _lo_table.GetByName(_key);
    if (!value.IsNumber()) return false;
    _value = static_cast<int>(value.GetNumber());
    return true;
}

bool read_integer(LuaPlus::LuaObject const &_lo_table, char const *_key, int &_value) {
    LuaPlus::LuaObject const value = _lo_table.GetByName(_key);
    if (!value.IsInteger()) return false;
    _value = value.GetInteger();
    return true;
}

bool read_float(LuaPlus::LuaObject const &_lo_table, char const *_key, float &_value) {
    LuaPlus::LuaObject const value = _lo_table.GetByName(_key);
    if (!value.IsNumber()) return false;
    _value = value.GetFloat();
    return true;
}

bool read_string(LuaPlus::LuaObject const &_lo_table, char const *_key, string &_value) {
    LuaPlus::LuaObject const value = _lo_table.GetByName(_key);
    if (!value.IsString()) return false;
    _value = value.GetString();
    return true;
}

bool read_alignment(LuaPlus::LuaObject const &_lo_table, char const *_key, EAlignment &_value) {
    LuaPlus::LuaObject const value = _lo_table.GetByName(_key);
    return value.IsString() && find_alignment(value.GetString(), _value);
}

void write_pair(LuaPlus::LuaObject &_lo_table, char const *_key, double _first, double _second) {
    LuaPlus::LuaObject pair;
    pair.AssignNewTable(_lo_table.GetState());
    pair.SetNumber(1, _first);
    pair.SetNumber(2, _second);
    _lo_table.SetObject(_key, pair);
}

} // namespace qorui
