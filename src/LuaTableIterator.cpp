#include "LuaTableIterator.h"

namespace qorui {

void read_bool(LuaPlus::LuaObject const &_lo_table, char const *_key, bool &_value) {
    LuaPlus::LuaObject const value = _lo_table.GetByName(_key);
    if (value.IsBoolean()) _value = value.GetBoolean();
}

void read_int(LuaPlus::LuaObject const &_lo_table, char const *_key, int &_value) {
    LuaPlus::LuaObject const value = _lo_table.GetByName(_key);
    if (value.IsNumber()) _value = static_cast<int>(value.GetNumber());
}

void read_integer(LuaPlus::LuaObject const &_lo_table, char const *_key, int &_value) {
    LuaPlus::LuaObject const value = _lo_table.GetByName(_key);
    if (value.IsInteger()) _value = value.GetInteger();
}

void read_float(LuaPlus::LuaObject const &_lo_table, char const *_key, float &_value) {
    LuaPlus::LuaObject const value = _lo_table.GetByName(_key);
    if (value.IsNumber()) _value = value.GetFloat();
}

void read_string(LuaPlus::LuaObject const &_lo_table, char const *_key, string &_value) {
    LuaPlus::LuaObject const value = _lo_table.GetByName(_key);
    if (value.IsString()) _value = value.GetString();
}

void write_pair(LuaPlus::LuaObject &_lo_table, char const *_key, double _first, double _second) {
    LuaPlus::LuaObject pair;
    pair.AssignNewTable(_lo_table.GetState());
    pair.SetNumber(1, _first);
    pair.SetNumber(2, _second);
    _lo_table.SetObject(_key, pair);
}

} // namespace qorui
