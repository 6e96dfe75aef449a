// qorscriptsystem: the engine's Lua binding, a LuaPlus-style object layer over LuaJIT (Lua 5.1).
//
// A LuaObject holds one Lua value of one LuaState (a table is held by reference, so two objects
// may see the same table). Objects are cheap to copy. All objects must be gone before their state
// is destroyed.
#pragma once
#include <ostream>

struct lua_State;

namespace LuaPlus {

class LuaObject;

// One Lua interpreter: made by Create, deleted by Destroy.
class LuaState {
public:
    // A new state with the standard libraries opened. The flags are accepted for compatibility
    // and ignored.
    static LuaState *Create(bool _init_standard_library = true, bool _multithreaded = false);
    // Closes the state; every object of it must be gone. Null is ignored.
    static void Destroy(LuaState *_p_state);

    // Result 0 on success; otherwise the Lua error is reported by qordebug::warning (unless
    // _quiet) and the result is the Lua status code.
    int DoString(char const *_code, bool _quiet = false);
    // Reads the file through IFileSystem::load_file in that category. Result 0 on success,
    // nonzero if the file is missing or the chunk fails (reported unless _quiet).
    int DoFile(int _category, char const *_file_name, bool _quiet = false);
    // The table of globals.
    LuaObject GetGlobals();
    // The error text of the last failed DoString or DoFile.
    char const *GetLastError() const;

    // The underlying Lua state, for the C API.
    lua_State *GetCState() const { return mp_l; }

private:
    LuaState();
    ~LuaState();
    LuaState(LuaState const &) = delete;
    LuaState &operator=(LuaState const &) = delete;

    lua_State *mp_l;
    char m_last_error[512];
};

// One Lua value of one state, or nil of no state.
class LuaObject {
public:
    LuaObject();                            // nil of no state
    explicit LuaObject(LuaState *_p_state); // nil of that state
    // Copies share a table, they don't copy it.
    // @{
    LuaObject(LuaObject const &_o);
    LuaObject &operator=(LuaObject const &_o);
    // @}
    // Drops the reference to the value.
    ~LuaObject();

    // The state of the value; null for nil of no state.
    LuaState *GetState() const { return mp_state; }

    // Makes the object a new empty table, with room for _narr array and _nrec other entries.
    LuaObject &AssignNewTable(LuaState *_p_state, int _narr = 0, int _nrec = 0);
    LuaObject &AssignNewTable(int _narr = 0, int _nrec = 0); // in the object's own state
    // Makes the object a value of that type in the state; each returns the object. AssignNil
    // with null keeps the object's state.
    // @{
    LuaObject &AssignString(LuaState *_p_state, char const *_value);
    LuaObject &AssignInteger(LuaState *_p_state, int _value);
    LuaObject &AssignNumber(LuaState *_p_state, double _value);
    LuaObject &AssignBoolean(LuaState *_p_state, bool _value);
    LuaObject &AssignNil(LuaState *_p_state = nullptr);
    // @}

    // Whether the value has that type. IsInteger: a number with no fraction.
    // @{
    bool IsNil() const;
    bool IsTable() const;
    bool IsString() const;
    bool IsNumber() const;
    bool IsInteger() const;
    bool IsBoolean() const;
    int Type() const; // LUA_T...
    // @}

    // The value. Wrong types give the neutral value (null string, 0, false) and no report. A number
    // converts to an integer by truncation. GetString of a number is null.
    // @{
    char const *GetString() const;
    int GetInteger() const;
    double GetNumber() const;
    float GetFloat() const;
    bool GetBoolean() const;
    // @}

    // A field of the table by name, index or key object; a nil object on a non-table.
    // @{
    LuaObject GetByName(char const *_key) const;
    LuaObject GetByIndex(int _index) const;
    LuaObject GetByObject(LuaObject const &_key) const;
    LuaObject operator[](char const *_key) const { return GetByName(_key); }
    LuaObject operator[](int _index) const { return GetByIndex(_index); }
    // @}
    int GetN() const;          // the length operator #
    int GetTableCount() const; // every key

    // Sets a field of the table by string or integer key and returns the table; a null key, a
    // non-table or a value of another state sets nothing.
    // @{
    LuaObject &SetString(char const *_key, char const *_value);
    LuaObject &SetInteger(char const *_key, int _value);
    LuaObject &SetNumber(char const *_key, double _value);
    LuaObject &SetBoolean(char const *_key, bool _value);
    LuaObject &SetObject(char const *_key, LuaObject const &_value);
    LuaObject &SetNil(char const *_key);
    LuaObject &SetString(int _key, char const *_value);
    LuaObject &SetInteger(int _key, int _value);
    LuaObject &SetNumber(int _key, double _value);
    LuaObject &SetBoolean(int _key, bool _value);
    LuaObject &SetObject(int _key, LuaObject const &_value);
    LuaObject &SetNil(int _key);
    // @}
    // Appends at GetN() + 1.
    LuaObject &Insert(LuaObject const &_value);

    // Writes "name = <value>\n" as a Lua chunk that restores the value when run: tables nested,
    // keys in a stable order (integer keys ascending, then string keys in byte order, then other
    // keys), strings quoted with escapes, numbers exactly. _indent is the starting indentation in
    // levels. Functions, userdata and threads are written as nil with a comment.
    void dump(char const *_name, std::ostream &_out, int _indent = 0) const;

    // Pushes the value on the state's stack (for the binding's own helpers).
    void Push() const;

private:
    friend class LuaState;
    friend bool LuaPlusH_next(LuaState *, LuaObject const &, LuaObject &, LuaObject &);
    void assign_from_stack(LuaState *_p_state); // pops the top value into this object
    void release();

    LuaState *mp_state;
    int m_ref; // registry reference, LUA_NOREF for nil
};

// Walks a table: start with a nil _key; each call moves to the next pair and returns true, or
// returns false at the end. The order is Lua's own.
bool LuaPlusH_next(LuaState *_p_state, LuaObject const &_table, LuaObject &_key, LuaObject &_value);

} // namespace LuaPlus
