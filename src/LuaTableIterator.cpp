// The readers of typed fields of Lua tables and the writer of pairs, shared by every layout.
#include "LuaTableIterator.h"
#include "qordebug.h"
#include "ui_huid.h"

#include <cmath>
#include <cstring>

namespace qorui {

bool read_bool(LuaPlus::LuaObject const &_lo_table, char const *_key, bool &_value) {
    LuaPlus::LuaObject const value = _lo_table.GetByName(_key);
    if (!value.IsBoolean()) return false;
    _value = value.GetBoolean();
    return true;
}

bool read_number(LuaPlus::LuaObject const &_lo_value, char const *_key, double &_number) {
    if (!_lo_value.IsNumber()) return false;
    double const number = _lo_value.GetNumber();
    if (!(std::fabs(number) <= k_data_number_limit)) { // NaN fails this too
        qordebug::warning("UI: Number '%s' out of range: %g", _key ? _key : "", number);
        return false;
    }
    _number = number;
    return true;
}

bool read_name(LuaPlus::LuaObject const &_lo_value, char const *&_name) {
    if (!_lo_value.IsString()) return false;
    char const *p_name = _lo_value.GetString();
    if (strlen(p_name) > HUID::k_max_name) {
        qordebug::warning("UI: Name too long: '%.40s...'", p_name);
        return false;
    }
    _name = p_name;
    return true;
}

bool read_int(LuaPlus::LuaObject const &_lo_table, char const *_key, int &_value) {
    double number;
    if (!read_number(_lo_table.GetByName(_key), _key, number)) return false;
    _value = static_cast<int>(number);
    return true;
}

bool read_integer(LuaPlus::LuaObject const &_lo_table, char const *_key, int &_value) {
    double number;
    if (!read_number(_lo_table.GetByName(_key), _key, number) || std::floor(number) != number) return false;
    _value = static_cast<int>(number);
    return true;
}

bool read_float(LuaPlus::LuaObject const &_lo_table, char const *_key, float &_value) {
    double number;
    if (!read_number(_lo_table.GetByName(_key), _key, number)) return false;
    _value = static_cast<float>(number);
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
