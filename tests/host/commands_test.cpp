// The host's console commands and variables: registering, replacing and unregistering commands,
// running them (also by a whole line), name completion of both in name order, and the "set"
// command with the numbers a variable's text gives.
#include "commands.h"
#include "host_test_support.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

using namespace qorhost;
using hosttest::CReportCapture;

namespace {

// Every run of a command, as "name(arguments)" with the name it was registered with as its user
// data.
std::vector<std::string> g_runs;

void note_run(char const *_arguments, void *_user) {
    g_runs.push_back(std::string(static_cast<char const *>(_user)) + "(" + _arguments + ")");
}

class CommandsTest : public testing::Test {
protected:
    CommandsTest() : m_commands(&m_vars) { g_runs.clear(); }

    void add(char const *_name) { m_commands.register_command(_name, note_run, const_cast<char *>(_name)); }

    // Every name of a completion from its first to the end, without wrapping.
    std::vector<std::string> commands_from(char const *_prefix) {
        std::vector<std::string> names;
        for (char const *p = m_commands.find_first_command(_prefix); p;
             p = m_commands.find_next_command(p, false))
            names.push_back(p);
        return names;
    }
    std::vector<std::string> vars_from(char const *_prefix) {
        std::vector<std::string> names;
        for (char const *p = m_vars.find_first_var(_prefix); p; p = m_vars.find_next_var(p, false))
            names.push_back(p);
        return names;
    }

    CReportCapture m_reports;
    CVarManager m_vars;
    CCmdManager m_commands;
};

void unregister_self(char const *, void *_user) {
    static_cast<CCmdManager *>(_user)->unregister_command("once");
    g_runs.push_back("once");
}

} // namespace

// ---------------------------------------------------------------------------------------------
// Commands
// ---------------------------------------------------------------------------------------------

TEST_F(CommandsTest, ExecuteRunsTheCommandWithItsArgumentsAndUserData) {
    add("show");
    EXPECT_TRUE(m_commands.execute("show", "fps 1", false));
    EXPECT_TRUE(m_commands.execute("show", nullptr, false));
    EXPECT_EQ((std::vector<std::string>{"show(fps 1)", "show()"}), g_runs);
    EXPECT_TRUE(m_reports.reports().empty());
}

TEST_F(CommandsTest, UnknownCommandIsReportedAndNotRun) {
    add("show");
    EXPECT_FALSE(m_commands.execute("Show", "x", false)); // names are case-sensitive
    EXPECT_FALSE(m_commands.execute(nullptr, "x", false));
    EXPECT_EQ((std::vector<std::string>{"Unknown command 'Show'", "Unknown command ''"}),
              m_reports.warnings());
    EXPECT_TRUE(g_runs.empty());
}

TEST_F(CommandsTest, SecondRegistrationReplacesTheFirstAndUnregisterRemovesIt) {
    m_commands.register_command("show", note_run, const_cast<char *>("first"));
    m_commands.register_command("show", note_run, const_cast<char *>("second"));
    m_commands.execute("show", "", false);
    EXPECT_EQ(std::vector<std::string>{"second()"}, g_runs);

    m_commands.unregister_command("show");
    m_commands.unregister_command("never_there");
    m_commands.unregister_command(nullptr);
    EXPECT_FALSE(m_commands.has_command("show"));
    EXPECT_FALSE(m_commands.execute("show", "", false));
    // A name or a callback that is missing registers nothing.
    m_commands.register_command("", note_run, nullptr);
    m_commands.register_command(nullptr, note_run, nullptr);
    m_commands.register_command("nothing", nullptr, nullptr);
    EXPECT_EQ(std::vector<std::string>{"set"}, commands_from(""));
}

TEST_F(CommandsTest, CommandMayUnregisterItselfWhileItRuns) {
    m_commands.register_command("once", unregister_self, &m_commands);
    EXPECT_TRUE(m_commands.execute("once", "", false));
    EXPECT_FALSE(m_commands.has_command("once"));
    EXPECT_EQ(std::vector<std::string>{"once"}, g_runs);
}

TEST_F(CommandsTest, RunLineSplitsTheNameFromTheArguments) {
    add("show");
    EXPECT_TRUE(m_commands.run_line("show fps  1 "));
    EXPECT_TRUE(m_commands.run_line(" \tshow\t  x"));
    EXPECT_TRUE(m_commands.run_line("show"));
    EXPECT_FALSE(m_commands.run_line("shows x"));
    EXPECT_FALSE(m_commands.run_line(nullptr));
    EXPECT_EQ((std::vector<std::string>{"show(fps  1 )", "show(x)", "show()"}), g_runs);
}

TEST_F(CommandsTest, CompletionGoesThroughTheNamesWithAPrefixInNameOrder) {
    for (char const *name : {"sv_gravity", "show", "quit", "s", "showfps", "Show"})
        add(name);
    EXPECT_EQ((std::vector<std::string>{"s", "set", "show", "showfps", "sv_gravity"}), commands_from("s"));
    EXPECT_EQ((std::vector<std::string>{"show", "showfps"}), commands_from("sho"));
    EXPECT_EQ((std::vector<std::string>{"Show", "quit", "s", "set", "show", "showfps", "sv_gravity"}),
              commands_from(""));
    EXPECT_EQ((std::vector<std::string>{"Show", "quit", "s", "set", "show", "showfps", "sv_gravity"}),
              commands_from(nullptr));
    EXPECT_EQ(nullptr, m_commands.find_first_command("x"));
    EXPECT_EQ(nullptr, m_commands.find_first_command("showfpsx"));
}

TEST_F(CommandsTest, CompletionWrapsToTheFirstNameWhenAsked) {
    for (char const *name : {"show", "showfps", "quit"})
        add(name);
    EXPECT_STREQ("show", m_commands.find_first_command("sh"));
    EXPECT_STREQ("showfps", m_commands.find_next_command("show", true));
    EXPECT_EQ(nullptr, m_commands.find_next_command("showfps", false));
    EXPECT_STREQ("show", m_commands.find_next_command("showfps", true));
    // A name between two others goes on from where it would stand.
    EXPECT_STREQ("showfps", m_commands.find_next_command("showa", false));
    EXPECT_EQ(nullptr, m_commands.find_first_command("x"));
    EXPECT_EQ(nullptr, m_commands.find_next_command("x", true));
}

// ---------------------------------------------------------------------------------------------
// Variables
// ---------------------------------------------------------------------------------------------

TEST_F(CommandsTest, VariableNumbersFollowItsText) {
    struct SCase {
        char const *m_text;
        int m_int;
        float m_float;
    };
    for (SCase const &c :
         {SCase{"1024", 1024, 1024.0f}, SCase{"-3.75", -3, -3.75f}, SCase{"12abc", 12, 12.0f},
          SCase{" 7", 7, 7.0f}, SCase{"abc", 0, 0.0f}, SCase{"", 0, 0.0f}}) {
        m_vars.set_var("v", c.m_text);
        SVariable const *p_var = m_vars.find_var("v");
        ASSERT_NE(nullptr, p_var);
        EXPECT_STREQ("v", p_var->mp_name);
        EXPECT_STREQ(c.m_text, p_var->mp_value);
        EXPECT_EQ(c.m_int, p_var->m_int_value) << c.m_text;
        EXPECT_FLOAT_EQ(c.m_float, p_var->m_float_value) << c.m_text;
    }
}

TEST_F(CommandsTest, VariableRecordKeepsItsAddressWhenChangedOrWhenOthersAreAdded) {
    m_vars.set_var("b", "1");
    SVariable const *p_b = m_vars.find_var("b");
    for (int i = 0; i < 100; ++i)
        m_vars.set_var(("v" + std::to_string(i)).c_str(), "x");
    m_vars.set_var("b", "2");
    EXPECT_EQ(p_b, m_vars.find_var("b"));
    EXPECT_EQ(2, p_b->m_int_value);
    m_vars.set_var("", "1");
    m_vars.set_var(nullptr, "1");
    m_vars.set_var("nothing", nullptr);
    EXPECT_EQ(nullptr, m_vars.find_var(""));
    EXPECT_EQ(nullptr, m_vars.find_var(nullptr));
    EXPECT_EQ(nullptr, m_vars.find_var("B"));
    EXPECT_STREQ("", m_vars.find_var("nothing")->mp_value);
}

TEST_F(CommandsTest, SetCommandCreatesAndChangesVariables) {
    EXPECT_TRUE(m_commands.execute("set", "scr_resx 1280", false));
    EXPECT_TRUE(m_commands.run_line("set  title   Hello world "));
    ASSERT_NE(nullptr, m_vars.find_var("scr_resx"));
    EXPECT_EQ(1280, m_vars.find_var("scr_resx")->m_int_value);
    EXPECT_STREQ("Hello world ", m_vars.find_var("title")->mp_value);
    EXPECT_TRUE(m_commands.execute("set", "scr_resx 800", false));
    EXPECT_EQ(800, m_vars.find_var("scr_resx")->m_int_value);
    EXPECT_TRUE(m_reports.reports().empty());
}

TEST_F(CommandsTest, SetWithoutAValueShowsItsUse) {
    m_commands.execute("set", "", false);
    m_commands.execute("set", "lonely", false);
    m_commands.execute("set", "lonely   ", false);
    EXPECT_EQ(std::vector<std::string>(3, "Use of command 'set':\nset <variable> <value>"),
              m_reports.warnings());
    EXPECT_EQ(nullptr, m_vars.find_var("lonely"));
}

TEST_F(CommandsTest, VariableCompletionGoesThroughTheNamesWithAPrefixInNameOrder) {
    for (char const *name : {"scr_resy", "scr_resx", "sv_cheats", "scr_bpp", "volume"})
        m_vars.set_var(name, "1");
    EXPECT_EQ((std::vector<std::string>{"scr_bpp", "scr_resx", "scr_resy"}), vars_from("scr_"));
    EXPECT_EQ((std::vector<std::string>{"scr_resx", "scr_resy"}), vars_from("scr_res"));
    EXPECT_EQ((std::vector<std::string>{"scr_bpp", "scr_resx", "scr_resy", "sv_cheats", "volume"}),
              vars_from(""));
    EXPECT_EQ(nullptr, m_vars.find_first_var("zz"));
    EXPECT_STREQ("scr_resx", m_vars.find_first_var("scr_res"));
    EXPECT_STREQ("scr_resx", m_vars.find_next_var("scr_resy", true));
    // Commands and variables complete apart.
    EXPECT_STREQ("set", m_commands.find_first_command("s"));
    EXPECT_STREQ("scr_bpp", m_vars.find_first_var("s"));
    EXPECT_STREQ("scr_resx", m_vars.find_next_var("scr_bpp", false));
}
