// qorscriptsystem: LuaObject values and tables, running code and files, walking tables, and dump.
#include "qorscriptsystem.h"

#include "qorbase.h"
#include "qordebug.h"
#include "test_common.h"

#include <gtest/gtest.h>
#include <lua.hpp>

#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <set>
#include <sstream>
#include <string>
#include <vector>

using LuaPlus::LuaObject;
using LuaPlus::LuaState;

namespace {

std::string dump_text(LuaObject const &_object, char const *_name, int _indent = 0) {
    std::ostringstream out;
    _object.dump(_name, out, _indent);
    return out.str();
}

// The bytes of a string value, zeros included.
std::string string_of(LuaObject const &_object) {
    lua_State *l = _object.GetState()->GetCState();
    _object.Push();
    size_t length = 0;
    char const *text = lua_tolstring(l, -1, &length);
    std::string const bytes(text ? text : "", length);
    lua_pop(l, 1);
    return bytes;
}

// A state of its own for every test, and captured reports.
class LuaTest : public ::testing::Test {
protected:
    void SetUp() override {
        mp_state = LuaState::Create(true, true);
        ASSERT_NE(mp_state, nullptr);
    }
    void TearDown() override { LuaState::Destroy(mp_state); }

    LuaObject global(char const *_name) { return mp_state->GetGlobals()[_name]; }
    // Runs code that has to succeed.
    void run(char const *_code) { ASSERT_EQ(mp_state->DoString(_code), 0) << mp_state->GetLastError(); }

    LuaState *mp_state = nullptr;
    qortest::CReportCapture m_capture;
};

// ---------------------------------------------------------------------------------------------
// Values and types
// ---------------------------------------------------------------------------------------------

// Types and content; a wrong type gives the neutral value without a report, and table access on
// what is no table (or of no state) gives nil and changes nothing.
TEST_F(LuaTest, ValuesReportTheirTypesAndContent) {
    run("t = {7, 2.75, -2.75, 'text', true, {}, s = '12'}");
    LuaObject t = global("t");
    EXPECT_EQ(t.Type(), LUA_TTABLE);
    EXPECT_TRUE(t[1].IsInteger() && t[2].IsNumber() && !t[2].IsInteger() && t[5].GetBoolean() &&
                t[7].IsNil());
    EXPECT_EQ(t[2].GetFloat(), 2.75f);
    EXPECT_EQ(t[2].GetInteger(), 2); // truncation toward zero
    EXPECT_EQ(t[3].GetInteger(), -2);
    EXPECT_STREQ(t[4].GetString(), "text");

    EXPECT_TRUE(t[1].GetString() == nullptr && !t[1].IsString()); // a number is no string
    EXPECT_TRUE(t["s"].GetNumber() == 0.0 && !t["s"].IsNumber()); // a string is no number
    EXPECT_TRUE(!t[1].GetBoolean() && t[5].GetInteger() == 0 && t.GetString() == nullptr);
    LuaObject n = t[1];
    EXPECT_TRUE(n["x"].IsNil() && n.GetN() == 0 && n.GetTableCount() == 0);
    n.SetString("x", "y").SetInteger(1, 2).Insert(t);
    EXPECT_EQ(n.GetInteger(), 7);
    LuaObject unbound; // nil of no state
    EXPECT_TRUE(unbound["x"].IsNil() && unbound.GetState() == nullptr);
    unbound.SetString("x", "y");
    EXPECT_TRUE(m_capture.reports().empty());
}

TEST_F(LuaTest, CopiesShareTablesAndOutliveTheOriginal) {
    LuaObject original(mp_state);
    original.AssignNewTable();
    LuaObject copy = original;
    copy.SetString("name", "shared");
    EXPECT_STREQ(original["name"].GetString(), "shared");

    LuaObject text;
    text.AssignString(mp_state, "kept");
    LuaObject text_copy(text);
    original.AssignNil();
    text.AssignInteger(mp_state, 5);
    run("collectgarbage('collect')");
    EXPECT_STREQ(copy["name"].GetString(), "shared");
    EXPECT_STREQ(text_copy.GetString(), "kept");
    EXPECT_TRUE(original.IsNil());
}

// ---------------------------------------------------------------------------------------------
// Tables
// ---------------------------------------------------------------------------------------------

// Integer and string keys are distinct; insert appends; the counts follow the keys; next walks
// every pair once.
TEST_F(LuaTest, TablesKeepTheirKeysAndAreWalkedPairByPair) {
    LuaObject t;
    t.AssignNewTable(mp_state);
    LuaObject value;
    for (char const *text : {"a", "b", "c"})
        t.Insert(value.AssignString(mp_state, text));
    EXPECT_EQ(t.GetN(), 3);
    t.SetInteger(1, 10).SetString("1", "one").SetNumber("ratio", 0.25).SetBoolean(2, false);
    LuaObject child;
    child.AssignNewTable(mp_state).SetString("k", "v");
    t.SetObject("child", child);
    mp_state->GetGlobals().SetObject("t", t);
    run("assert(t[1] == 10 and t['1'] == 'one' and t.ratio == 0.25 and t[2] == false and t.child.k == 'v' "
        "and t[3] == 'c')");
    LuaObject key;
    key.AssignString(mp_state, "ratio");
    EXPECT_EQ(t.GetByObject(key).GetNumber(), 0.25);
    EXPECT_EQ(t.GetTableCount(), 6);
    t.SetNil("ratio").SetNil("child").SetNil(3);
    EXPECT_EQ(t.GetN(), 2);
    EXPECT_EQ(t.GetTableCount(), 3);

    std::multiset<std::string> seen;
    key.AssignNil(); // from the start
    while (LuaPlus::LuaPlusH_next(mp_state, t, key, value)) {
        std::string const name = key.IsString() ? key.GetString() : std::to_string(key.GetInteger());
        seen.insert(name + "=" + (value.IsString() ? value.GetString() : std::to_string(value.GetInteger())));
    }
    EXPECT_EQ(seen, (std::multiset<std::string>{"1=10", "2=0", "1=one"}));
    EXPECT_TRUE(key.IsNil());
    EXPECT_FALSE(LuaPlus::LuaPlusH_next(mp_state, t["1"], key, value)); // not a table
}

TEST_F(LuaTest, ObjectsOfAnotherStateAreRefused) {
    LuaState *p_other = LuaState::Create();
    {
        LuaObject foreign;
        foreign.AssignString(p_other, "foreign");
        LuaObject t;
        t.AssignNewTable(mp_state).SetString("k", "kept");
        t.SetObject("k", foreign);
        EXPECT_STREQ(t["k"].GetString(), "kept");
        ASSERT_EQ(m_capture.reports().size(), 1u);
        EXPECT_EQ(m_capture.reports()[0].m_kind, qordebug::REPORT_ASSERT);
    }
    LuaState::Destroy(p_other);
}

// ---------------------------------------------------------------------------------------------
// Running code and files
// ---------------------------------------------------------------------------------------------

TEST_F(LuaTest, DoStringReportsSyntaxAndRuntimeErrors) {
    EXPECT_NE(mp_state->DoString("x = = 1"), 0);
    ASSERT_EQ(m_capture.reports().size(), 1u);
    EXPECT_EQ(m_capture.reports()[0].m_kind, qordebug::REPORT_WARNING);
    EXPECT_NE(m_capture.reports()[0].m_text.find(mp_state->GetLastError()), std::string::npos);
    EXPECT_NE(std::string(mp_state->GetLastError()).find("unexpected symbol near '='"), std::string::npos)
        << mp_state->GetLastError();

    EXPECT_EQ(mp_state->DoString("y = 1; error('boom')"), LUA_ERRRUN);
    EXPECT_NE(std::string(mp_state->GetLastError()).find("boom"), std::string::npos);
    EXPECT_EQ(global("y").GetInteger(), 1); // what ran before the error stays
    EXPECT_EQ(m_capture.reports().size(), 2u);

    EXPECT_EQ(mp_state->DoString("error('quiet one')", true), LUA_ERRRUN);
    EXPECT_NE(std::string(mp_state->GetLastError()).find("quiet one"), std::string::npos);
    EXPECT_EQ(m_capture.reports().size(), 2u);
    EXPECT_EQ(mp_state->DoString("z = string.format('%03d', 7)"), 0); // standard libraries are open
    EXPECT_STREQ(global("z").GetString(), "007");
}

class LuaFileTest : public LuaTest {
protected:
    void SetUp() override {
        LuaTest::SetUp();
        m_dir = qortest::make_temp_dir();
        qorbase::set_category_root(qorbase::FILE_CATEGORY_UI, m_dir.c_str());
    }
    void TearDown() override {
        qorbase::set_category_root(qorbase::FILE_CATEGORY_UI, "");
        LuaTest::TearDown();
    }
    void save(char const *_name, std::string const &_text) {
        GetFileSystem()->save_file(qorbase::FILE_CATEGORY_UI, _name, _text.data(),
                                   static_cast<unsigned>(_text.size()), 0);
    }

    std::string m_dir;
};

// A file of the category runs; a missing one fails, reported unless quiet; an error names the file
// and line.
TEST_F(LuaFileTest, DoFileRunsAFileOfTheCategory) {
    save("layouts/main.lua", "ui_windows_ini = {name = 'desktop', count = 2}\n");
    EXPECT_EQ(mp_state->DoFile(qorbase::FILE_CATEGORY_UI, "layouts/main.lua"), 0) << mp_state->GetLastError();
    EXPECT_STREQ(global("ui_windows_ini")["name"].GetString(), "desktop");
    EXPECT_EQ(mp_state->DoFile(qorbase::FILE_CATEGORY_FONTS, "layouts/main.lua", true), LUA_ERRFILE);
    EXPECT_NE(mp_state->DoFile(qorbase::FILE_CATEGORY_UI, "absent.lua", true), 0);
    EXPECT_TRUE(m_capture.reports().empty());
    EXPECT_NE(mp_state->DoFile(qorbase::FILE_CATEGORY_UI, "absent.lua"), 0);
    ASSERT_EQ(m_capture.warnings().size(), 1u);
    EXPECT_NE(m_capture.warnings()[0].find("absent.lua"), std::string::npos);

    save("broken.lua", "a = 1\nb = nil + 1\n");
    EXPECT_EQ(mp_state->DoFile(qorbase::FILE_CATEGORY_UI, "broken.lua"), LUA_ERRRUN);
    EXPECT_EQ(std::string(mp_state->GetLastError()).rfind("broken.lua:2:", 0), 0u)
        << mp_state->GetLastError();
    EXPECT_EQ(m_capture.warnings().size(), 2u);
}

// ---------------------------------------------------------------------------------------------
// dump
// ---------------------------------------------------------------------------------------------

TEST_F(LuaTest, DumpWritesKeysInStableOrder) {
    run("t = {x = 1.5, 'two', sub = {k = 'v', [3] = 3}, ['not id'] = true, ['end'] = false, [1.5] = 0,"
        " [-1] = -1, _under = 0, [false] = 'f', [10] = 2^53}");
    EXPECT_EQ(dump_text(global("t"), "t"), "t = {\n"
                                           "    [-1] = -1,\n"
                                           "    [1] = \"two\",\n"
                                           "    [10] = 9007199254740992,\n"
                                           "    _under = 0,\n"
                                           "    [\"end\"] = false,\n"
                                           "    [\"not id\"] = true,\n"
                                           "    sub = {\n"
                                           "        [3] = 3,\n"
                                           "        k = \"v\",\n"
                                           "    },\n"
                                           "    x = 1.5,\n"
                                           "    [1.5] = 0,\n"
                                           "    [false] = \"f\",\n"
                                           "}\n");
    run("e = {} n = 0.1 s = 'a' b = true t = {k = {}} third = {1/3, 1e-300, 1e300}");
    EXPECT_EQ(dump_text(global("e"), "e"), "e = {}\n");
    EXPECT_EQ(dump_text(global("n"), "n"), "n = 0.10000000000000001\n");
    EXPECT_EQ(dump_text(global("s"), "s"), "s = \"a\"\n");
    EXPECT_EQ(dump_text(global("b"), "b"), "b = true\n");
    EXPECT_EQ(dump_text(global("absent"), "absent"), "absent = nil\n");
    EXPECT_EQ(dump_text(global("t"), "t", 1), "    t = {\n        k = {},\n    }\n");
    // Numbers read back as they were.
    std::string const numbers = dump_text(global("third"), "back");
    run(numbers.c_str());
    EXPECT_TRUE(global("back")[1].GetNumber() == 1.0 / 3.0 && global("back")[2].GetNumber() == 1e-300);
    EXPECT_EQ(dump_text(global("back"), "third"), dump_text(global("third"), "third"));
}

TEST_F(LuaTest, DumpedStringsSurviveQuotesNewlinesAndBinaryBytes) {
    run("s = 'say \"hi\"\\\\ back\\nnew\\rline\\0nul\\0001digit\\ttab\\127del\\255high\\1'");
    std::string const original = string_of(global("s"));
    ASSERT_EQ(original.size(), 48u) << original;

    std::string const text = dump_text(global("s"), "s");
    EXPECT_EQ(text, "s = \"say \\\"hi\\\"\\\\ back\\nnew\\rline\\000nul\\0001digit\\009tab\\127del\xff"
                    "high\\001\"\n");
    LuaState *p_fresh = LuaState::Create();
    ASSERT_EQ(p_fresh->DoString(text.c_str()), 0) << p_fresh->GetLastError();
    EXPECT_EQ(string_of(p_fresh->GetGlobals()["s"]), original);
    LuaState::Destroy(p_fresh);
}

TEST_F(LuaTest, DumpWritesCyclesFunctionsAndTooDeepTablesAsNil) {
    run("t = {name = 'loop', f = print}; t.self = t; t.child = {parent = t}");
    std::string const text = dump_text(global("t"), "t");
    EXPECT_EQ(text, "t = {\n"
                    "    child = {\n"
                    "        parent = nil --[[ a table that contains itself ]],\n"
                    "    },\n"
                    "    f = nil --[[ function ]],\n"
                    "    name = \"loop\",\n"
                    "    self = nil --[[ a table that contains itself ]],\n"
                    "}\n");
    EXPECT_EQ(mp_state->DoString(text.c_str()), 0) << mp_state->GetLastError();
    // A chain deeper than the writer follows ends in nil, no overflow (for the sanitizer run).
    run("deep = {} local t = deep for i = 1, 5000 do t.next = {} t = t.next end");
    std::string const deep = dump_text(global("deep"), "deep");
    EXPECT_NE(deep.find("nil --[[ a table nested too deep ]]"), std::string::npos);
    EXPECT_EQ(mp_state->DoString(deep.c_str()), 0) << mp_state->GetLastError();
}

} // namespace
