// The Lua binding over LuaJIT: states, objects held by registry references, and dump.
#include "qorscriptsystem.h"

#include "qorMemoryManager.h"
#include "qorbase.h"
#include "qordebug.h"

#include <lua.hpp>

#include <algorithm>
#include <cmath>
#include <cstdio>
#include <cstring>
#include <string>
#include <vector>

namespace LuaPlus {

// ---------------------------------------------------------------------------------------------
// LuaState
// ---------------------------------------------------------------------------------------------

LuaState::LuaState() : mp_l(luaL_newstate()) {
    m_last_error[0] = '\0';
}

LuaState::~LuaState() {
    if (mp_l) lua_close(mp_l);
}

// The standard libraries are always opened: every script of the engine may use them.
LuaState *LuaState::Create(bool, bool) {
    LuaState *p_state = new LuaState;
    if (!p_state->mp_l) {
        qordebug::error("Cannot create a Lua state");
        delete p_state;
        return nullptr;
    }
    luaL_openlibs(p_state->mp_l);
    return p_state;
}

void LuaState::Destroy(LuaState *_p_state) {
    delete _p_state;
}

namespace {

// After luaL_loadbuffer: runs the loaded chunk, or takes the load error. A failure leaves its
// message in _p_error and is reported unless _quiet.
int run_loaded_chunk(lua_State *_l, int _status, bool _quiet, char *_p_error, size_t _error_size) {
    if (_status == 0) _status = lua_pcall(_l, 0, 0, 0);
    if (_status == 0) return 0;
    char const *message = lua_tostring(_l, -1);
    snprintf(_p_error, _error_size, "%s", message ? message : "(error object is not a string)");
    lua_pop(_l, 1);
    if (!_quiet) qordebug::warning("Lua error: %s", _p_error);
    return _status;
}

} // namespace

int LuaState::DoString(char const *_code, bool _quiet) {
    if (!_code) {
        snprintf(m_last_error, sizeof(m_last_error), "no code");
        return LUA_ERRRUN;
    }
    int const status = luaL_loadbuffer(mp_l, _code, strlen(_code), _code);
    return run_loaded_chunk(mp_l, status, _quiet, m_last_error, sizeof(m_last_error));
}

int LuaState::DoFile(int _category, char const *_file_name, bool _quiet) {
    void *p_content = nullptr;
    unsigned const size = GetFileSystem()->load_file(_category, _file_name, &p_content, _quiet);
    if (!p_content) {
        snprintf(m_last_error, sizeof(m_last_error), "cannot open '%s'", _file_name ? _file_name : "");
        return LUA_ERRFILE;
    }
    std::string const chunk_name = std::string("@") + _file_name;
    int const status = luaL_loadbuffer(mp_l, static_cast<char const *>(p_content), size, chunk_name.c_str());
    MMDeallocate(p_content);
    return run_loaded_chunk(mp_l, status, _quiet, m_last_error, sizeof(m_last_error));
}

LuaObject LuaState::GetGlobals() {
    LuaObject globals(this);
    lua_pushvalue(mp_l, LUA_GLOBALSINDEX);
    globals.assign_from_stack(this);
    return globals;
}

char const *LuaState::GetLastError() const {
    return m_last_error;
}

// ---------------------------------------------------------------------------------------------
// LuaObject: construction and assignment
// ---------------------------------------------------------------------------------------------

LuaObject::LuaObject() : mp_state(nullptr), m_ref(LUA_NOREF) {}

LuaObject::LuaObject(LuaState *_p_state) : mp_state(_p_state), m_ref(LUA_NOREF) {}

LuaObject::LuaObject(LuaObject const &_o) : mp_state(_o.mp_state), m_ref(LUA_NOREF) {
    if (_o.m_ref != LUA_NOREF) {
        _o.Push();
        assign_from_stack(mp_state);
    }
}

LuaObject &LuaObject::operator=(LuaObject const &_o) {
    if (this == &_o) return *this;
    if (_o.m_ref != LUA_NOREF) {
        _o.Push();
        assign_from_stack(_o.mp_state);
    } else {
        release();
        mp_state = _o.mp_state;
    }
    return *this;
}

LuaObject::~LuaObject() {
    release();
}

void LuaObject::release() {
    if (mp_state && m_ref != LUA_NOREF) luaL_unref(mp_state->GetCState(), LUA_REGISTRYINDEX, m_ref);
    m_ref = LUA_NOREF;
}

// Nil is held without a reference.
void LuaObject::assign_from_stack(LuaState *_p_state) {
    lua_State *l = _p_state->GetCState();
    release();
    mp_state = _p_state;
    if (lua_isnil(l, -1)) {
        lua_pop(l, 1);
        return;
    }
    m_ref = luaL_ref(l, LUA_REGISTRYINDEX);
}

void LuaObject::Push() const {
    if (!mp_state) return;
    lua_State *l = mp_state->GetCState();
    if (m_ref == LUA_NOREF)
        lua_pushnil(l);
    else
        lua_rawgeti(l, LUA_REGISTRYINDEX, m_ref);
}

LuaObject &LuaObject::AssignNewTable(LuaState *_p_state, int _narr, int _nrec) {
    if (!_p_state) return *this;
    lua_createtable(_p_state->GetCState(), _narr, _nrec);
    assign_from_stack(_p_state);
    return *this;
}

LuaObject &LuaObject::AssignNewTable(int _narr, int _nrec) {
    return AssignNewTable(mp_state, _narr, _nrec);
}

LuaObject &LuaObject::AssignString(LuaState *_p_state, char const *_value) {
    if (!_p_state) return *this;
    if (_value)
        lua_pushstring(_p_state->GetCState(), _value);
    else
        lua_pushnil(_p_state->GetCState());
    assign_from_stack(_p_state);
    return *this;
}

LuaObject &LuaObject::AssignInteger(LuaState *_p_state, int _value) {
    return AssignNumber(_p_state, _value);
}

LuaObject &LuaObject::AssignNumber(LuaState *_p_state, double _value) {
    if (!_p_state) return *this;
    lua_pushnumber(_p_state->GetCState(), _value);
    assign_from_stack(_p_state);
    return *this;
}

LuaObject &LuaObject::AssignBoolean(LuaState *_p_state, bool _value) {
    if (!_p_state) return *this;
    lua_pushboolean(_p_state->GetCState(), _value);
    assign_from_stack(_p_state);
    return *this;
}

LuaObject &LuaObject::AssignNil(LuaState *_p_state) {
    release();
    if (_p_state) mp_state = _p_state;
    return *this;
}

// ---------------------------------------------------------------------------------------------
// Types and values
// ---------------------------------------------------------------------------------------------

int LuaObject::Type() const {
    if (!mp_state || m_ref == LUA_NOREF) return LUA_TNIL;
    lua_State *l = mp_state->GetCState();
    Push();
    int const type = lua_type(l, -1);
    lua_pop(l, 1);
    return type;
}

bool LuaObject::IsNil() const {
    return Type() == LUA_TNIL;
}
bool LuaObject::IsTable() const {
    return Type() == LUA_TTABLE;
}
bool LuaObject::IsString() const {
    return Type() == LUA_TSTRING;
}
bool LuaObject::IsNumber() const {
    return Type() == LUA_TNUMBER;
}
bool LuaObject::IsBoolean() const {
    return Type() == LUA_TBOOLEAN;
}

bool LuaObject::IsInteger() const {
    if (!IsNumber()) return false;
    double const value = GetNumber();
    return std::isfinite(value) && std::floor(value) == value;
}

// The string stays alive while this object holds it: the registry keeps the value.
char const *LuaObject::GetString() const {
    if (Type() != LUA_TSTRING) return nullptr;
    lua_State *l = mp_state->GetCState();
    Push();
    char const *text = lua_tostring(l, -1);
    lua_pop(l, 1);
    return text;
}

double LuaObject::GetNumber() const {
    if (Type() != LUA_TNUMBER) return 0.0;
    lua_State *l = mp_state->GetCState();
    Push();
    double const value = lua_tonumber(l, -1);
    lua_pop(l, 1);
    return value;
}

int LuaObject::GetInteger() const {
    double const value = GetNumber();
    if (!(value > -2147483648.0 && value < 2147483648.0)) return 0;
    return static_cast<int>(value); // truncation toward zero
}

float LuaObject::GetFloat() const {
    return static_cast<float>(GetNumber());
}

bool LuaObject::GetBoolean() const {
    if (Type() != LUA_TBOOLEAN) return false;
    lua_State *l = mp_state->GetCState();
    Push();
    bool const value = lua_toboolean(l, -1) != 0;
    lua_pop(l, 1);
    return value;
}

// ---------------------------------------------------------------------------------------------
// Tables
// ---------------------------------------------------------------------------------------------
//
// Access is raw: a metamethod that raised an error here would have no protected call to catch it.

namespace {

// A value can go into a table only within its own state; nil of no state goes anywhere.
bool fits_state(LuaObject const &_value, LuaState *_p_state) {
    if (!_value.GetState() || _value.GetState() == _p_state) return true;
    qordebug::assert_func("Expression:   %s\n%s\nFile: %s \nLine: %d\nFunction %s", "same state",
                          "a Lua value can't move to another state", __FILE__, __LINE__, __func__);
    return false;
}

} // namespace

LuaObject LuaObject::GetByName(char const *_key) const {
    LuaObject result(mp_state);
    if (!_key || !IsTable()) return result;
    lua_State *l = mp_state->GetCState();
    Push();
    lua_pushstring(l, _key);
    lua_rawget(l, -2);
    result.assign_from_stack(mp_state);
    lua_pop(l, 1);
    return result;
}

LuaObject LuaObject::GetByIndex(int _index) const {
    LuaObject result(mp_state);
    if (!IsTable()) return result;
    lua_State *l = mp_state->GetCState();
    Push();
    lua_rawgeti(l, -1, _index);
    result.assign_from_stack(mp_state);
    lua_pop(l, 1);
    return result;
}

LuaObject LuaObject::GetByObject(LuaObject const &_key) const {
    LuaObject result(mp_state);
    if (!IsTable() || _key.IsNil() || !fits_state(_key, mp_state)) return result;
    lua_State *l = mp_state->GetCState();
    Push();
    _key.Push();
    lua_rawget(l, -2);
    result.assign_from_stack(mp_state);
    lua_pop(l, 1);
    return result;
}

int LuaObject::GetN() const {
    if (!IsTable()) return 0;
    lua_State *l = mp_state->GetCState();
    Push();
    int const n = static_cast<int>(lua_objlen(l, -1));
    lua_pop(l, 1);
    return n;
}

int LuaObject::GetTableCount() const {
    if (!IsTable()) return 0;
    lua_State *l = mp_state->GetCState();
    Push();
    int count = 0;
    lua_pushnil(l);
    while (lua_next(l, -2)) {
        ++count;
        lua_pop(l, 1);
    }
    lua_pop(l, 1);
    return count;
}

namespace {

// Sets t[key] = value, where push_key and push_value push one value each.
template <class PushKey, class PushValue>
void set_field(LuaObject &_table, PushKey _push_key, PushValue _push_value) {
    if (!_table.IsTable()) return;
    lua_State *l = _table.GetState()->GetCState();
    _table.Push();
    _push_key(l);
    _push_value(l);
    lua_rawset(l, -3);
    lua_pop(l, 1);
}

auto name_key(char const *_key) {
    return [_key](lua_State *_l) { lua_pushstring(_l, _key ? _key : ""); };
}
auto index_key(int _key) {
    return [_key](lua_State *_l) { lua_pushinteger(_l, _key); };
}
auto string_value(char const *_value) {
    return [_value](lua_State *_l) {
        if (_value)
            lua_pushstring(_l, _value);
        else
            lua_pushnil(_l);
    };
}
auto number_value(double _value) {
    return [_value](lua_State *_l) { lua_pushnumber(_l, _value); };
}
auto boolean_value(bool _value) {
    return [_value](lua_State *_l) { lua_pushboolean(_l, _value); };
}
auto object_value(LuaObject const &_value) {
    return [&_value](lua_State *_l) {
        if (_value.GetState())
            _value.Push();
        else
            lua_pushnil(_l);
    };
}
auto nil_value() {
    return [](lua_State *_l) { lua_pushnil(_l); };
}

} // namespace

LuaObject &LuaObject::SetString(char const *_key, char const *_value) {
    if (_key) set_field(*this, name_key(_key), string_value(_value));
    return *this;
}
LuaObject &LuaObject::SetInteger(char const *_key, int _value) {
    if (_key) set_field(*this, name_key(_key), number_value(_value));
    return *this;
}
LuaObject &LuaObject::SetNumber(char const *_key, double _value) {
    if (_key) set_field(*this, name_key(_key), number_value(_value));
    return *this;
}
LuaObject &LuaObject::SetBoolean(char const *_key, bool _value) {
    if (_key) set_field(*this, name_key(_key), boolean_value(_value));
    return *this;
}
LuaObject &LuaObject::SetObject(char const *_key, LuaObject const &_value) {
    if (_key && fits_state(_value, mp_state)) set_field(*this, name_key(_key), object_value(_value));
    return *this;
}
LuaObject &LuaObject::SetNil(char const *_key) {
    if (_key) set_field(*this, name_key(_key), nil_value());
    return *this;
}
LuaObject &LuaObject::SetString(int _key, char const *_value) {
    set_field(*this, index_key(_key), string_value(_value));
    return *this;
}
LuaObject &LuaObject::SetInteger(int _key, int _value) {
    set_field(*this, index_key(_key), number_value(_value));
    return *this;
}
LuaObject &LuaObject::SetNumber(int _key, double _value) {
    set_field(*this, index_key(_key), number_value(_value));
    return *this;
}
LuaObject &LuaObject::SetBoolean(int _key, bool _value) {
    set_field(*this, index_key(_key), boolean_value(_value));
    return *this;
}
LuaObject &LuaObject::SetObject(int _key, LuaObject const &_value) {
    if (fits_state(_value, mp_state)) set_field(*this, index_key(_key), object_value(_value));
    return *this;
}
LuaObject &LuaObject::SetNil(int _key) {
    set_field(*this, index_key(_key), nil_value());
    return *this;
}

LuaObject &LuaObject::Insert(LuaObject const &_value) {
    return SetObject(GetN() + 1, _value);
}

bool LuaPlusH_next(LuaState *_p_state, LuaObject const &_table, LuaObject &_key, LuaObject &_value) {
    if (!_p_state || _table.GetState() != _p_state || !_table.IsTable() || !fits_state(_key, _p_state))
        return false;
    lua_State *l = _p_state->GetCState();
    _table.Push();
    _key.Push();
    if (_key.GetState() == nullptr) lua_pushnil(l);
    if (!lua_next(l, -2)) {
        lua_pop(l, 1);
        _key.AssignNil(_p_state);
        _value.AssignNil(_p_state);
        return false;
    }
    _value.assign_from_stack(_p_state);
    _key.assign_from_stack(_p_state);
    lua_pop(l, 1);
    return true;
}

// ---------------------------------------------------------------------------------------------
// dump
// ---------------------------------------------------------------------------------------------
namespace {

bool is_keyword(std::string const &_name) {
    static char const *const s_keywords[] = {"and", "break",    "do",     "else", "elseif", "end",   "false",
                                             "for", "function", "if",     "in",   "local",  "nil",   "not",
                                             "or",  "repeat",   "return", "then", "true",   "until", "while"};
    for (char const *keyword : s_keywords)
        if (_name == keyword) return true;
    return false;
}

// Lua's own identifier characters, independent of the C locale.
bool is_name_char(char _c, bool _first) {
    return _c == '_' || (_c >= 'a' && _c <= 'z') || (_c >= 'A' && _c <= 'Z') ||
           (!_first && _c >= '0' && _c <= '9');
}

bool is_identifier(std::string const &_name) {
    if (_name.empty()) return false;
    for (size_t i = 0; i < _name.size(); ++i)
        if (!is_name_char(_name[i], i == 0)) return false;
    return !is_keyword(_name);
}

void write_string(std::ostream &_out, char const *_text, size_t _length) {
    _out << '"';
    for (size_t i = 0; i < _length; ++i) {
        unsigned char const c = static_cast<unsigned char>(_text[i]);
        switch (c) {
        case '"':
            _out << "\\\"";
            break;
        case '\\':
            _out << "\\\\";
            break;
        case '\n':
            _out << "\\n";
            break;
        case '\r':
            _out << "\\r";
            break;
        default:
            if (c < 32 || c == 127) {
                char code[8];
                snprintf(code, sizeof(code), "\\%03u", c); // three digits: a digit after it stays text
                _out << code;
            } else {
                _out << static_cast<char>(c);
            }
        }
    }
    _out << '"';
}

void write_number(std::ostream &_out, double _value) {
    char text[40];
    if (std::isnan(_value))
        snprintf(text, sizeof(text), "(0/0)");
    else if (std::isinf(_value))
        snprintf(text, sizeof(text), _value > 0 ? "(1/0)" : "(-1/0)");
    else if (std::floor(_value) == _value && std::fabs(_value) < 1e15)
        snprintf(text, sizeof(text), "%.0f", _value);
    else
        snprintf(text, sizeof(text), "%.17g", _value);
    _out << text;
}

// A key of a table in its sort class: integers first by value, then strings by bytes, then the rest.
struct SKey {
    int m_class; // 0 integer number, 1 string, 2 other number, 3 boolean
    double m_number;
    std::string m_text;
    int m_stack_index; // where the key lies on the stack while the table is written
};

bool key_less(SKey const &_a, SKey const &_b) {
    if (_a.m_class != _b.m_class) return _a.m_class < _b.m_class;
    if (_a.m_class == 1) return _a.m_text < _b.m_text;
    return _a.m_number < _b.m_number;
}

void write_value(lua_State *_l, int _index, std::ostream &_out, int _indent,
                 std::vector<void const *> &_open);

// Tables nested deeper are written as nil: the writer recurses once per level, and Lua's parser
// refuses chunks of about 200 nested levels.
size_t const k_max_depth = 100;

// The table at the top of the stack. _open holds the tables being written around it.
void write_table(lua_State *_l, std::ostream &_out, int _indent, std::vector<void const *> &_open) {
    void const *identity = lua_topointer(_l, -1);
    if (std::find(_open.begin(), _open.end(), identity) != _open.end()) {
        _out << "nil --[[ a table that contains itself ]]";
        return;
    }
    if (_open.size() >= k_max_depth || !lua_checkstack(_l, 4)) {
        _out << "nil --[[ a table nested too deep ]]";
        return;
    }
    _open.push_back(identity);

    // Collect the keys with their sort data; written keys are read back from a fresh lookup.
    int const table = lua_gettop(_l);
    std::vector<SKey> keys;
    lua_pushnil(_l);
    while (lua_next(_l, table)) {
        lua_pop(_l, 1);
        SKey key = {3, 0.0, std::string(), 0};
        int const type = lua_type(_l, -1);
        if (type == LUA_TNUMBER) {
            key.m_number = lua_tonumber(_l, -1);
            key.m_class = std::floor(key.m_number) == key.m_number ? 0 : 2;
        } else if (type == LUA_TSTRING) {
            size_t length = 0;
            char const *text = lua_tolstring(_l, -1, &length);
            key.m_class = 1;
            key.m_text.assign(text, length);
        } else if (type == LUA_TBOOLEAN) {
            key.m_number = lua_toboolean(_l, -1);
        } else {
            continue; // tables, functions and userdata as keys can't be written back
        }
        keys.push_back(key);
    }
    std::sort(keys.begin(), keys.end(), key_less);

    if (keys.empty()) {
        _out << "{}";
        _open.pop_back();
        return;
    }
    std::string const inner(static_cast<size_t>(4 * (_indent + 1)), ' ');
    _out << "{\n";
    for (SKey const &key : keys) {
        _out << inner;
        if (key.m_class == 1 && is_identifier(key.m_text)) {
            _out << key.m_text;
            lua_pushlstring(_l, key.m_text.data(), key.m_text.size());
        } else {
            _out << '[';
            if (key.m_class == 1) {
                write_string(_out, key.m_text.data(), key.m_text.size());
                lua_pushlstring(_l, key.m_text.data(), key.m_text.size());
            } else if (key.m_class == 3) {
                _out << (key.m_number != 0.0 ? "true" : "false");
                lua_pushboolean(_l, key.m_number != 0.0);
            } else {
                write_number(_out, key.m_number);
                lua_pushnumber(_l, key.m_number);
            }
            _out << ']';
        }
        _out << " = ";
        lua_rawget(_l, table);
        write_value(_l, lua_gettop(_l), _out, _indent + 1, _open);
        lua_pop(_l, 1);
        _out << ",\n";
    }
    _out << std::string(static_cast<size_t>(4 * _indent), ' ') << '}';
    _open.pop_back();
}

void write_value(lua_State *_l, int _index, std::ostream &_out, int _indent,
                 std::vector<void const *> &_open) {
    switch (lua_type(_l, _index)) {
    case LUA_TNIL:
        _out << "nil";
        break;
    case LUA_TBOOLEAN:
        _out << (lua_toboolean(_l, _index) ? "true" : "false");
        break;
    case LUA_TNUMBER:
        write_number(_out, lua_tonumber(_l, _index));
        break;
    case LUA_TSTRING: {
        size_t length = 0;
        char const *text = lua_tolstring(_l, _index, &length);
        write_string(_out, text, length);
        break;
    }
    case LUA_TTABLE:
        lua_pushvalue(_l, _index);
        write_table(_l, _out, _indent, _open);
        lua_pop(_l, 1);
        break;
    default:
        _out << "nil --[[ " << lua_typename(_l, lua_type(_l, _index)) << " ]]";
        break;
    }
}

} // namespace

void LuaObject::dump(char const *_name, std::ostream &_out, int _indent) const {
    std::string const indent(static_cast<size_t>(4 * (_indent > 0 ? _indent : 0)), ' ');
    _out << indent << (_name ? _name : "value") << " = ";
    if (!mp_state) {
        _out << "nil\n";
        return;
    }
    lua_State *l = mp_state->GetCState();
    std::vector<void const *> open_tables;
    Push();
    write_value(l, lua_gettop(l), _out, _indent > 0 ? _indent : 0, open_tables);
    lua_pop(l, 1);
    _out << '\n';
}

} // namespace LuaPlus
