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
    CReportCapture m_reports;
    CVarManager m_vars;
    CCmdManager m_commands;
};

void unregister_self(char const *, void *_user) {
    static_cast<CCmdManager *>(_user)->unregister_command("once");
    g_runs.push_back("once");
}

} // namespace

TEST_F(CommandsTest, CommandsRunByNameOrLineWithArgumentsAndUserDataUntilReplacedOrRemoved) {
    add("show");
    EXPECT_TRUE(m_commands.execute("show", "fps 1", false));
    EXPECT_TRUE(m_commands.execute("show", nullptr, false));
    EXPECT_TRUE(m_commands.run_line(" \tshow\t  fps  1 ")); // the name split from the arguments
    EXPECT_FALSE(m_commands.run_line("shows x"));
    EXPECT_FALSE(m_commands.execute("Show", "x", false)); // names are case-sensitive
    EXPECT_FALSE(m_commands.execute(nullptr, "x", false));
    EXPECT_EQ((std::vector<std::string>{"show(fps 1)", "show()", "show(fps  1 )"}), g_runs);
    EXPECT_EQ(
        (std::vector<std::string>{"Unknown command 'shows'", "Unknown command 'Show'", "Unknown command ''"}),
        m_reports.warnings());

    g_runs.clear();
    m_commands.register_command("show", note_run, const_cast<char *>("second")); // replaces the first
    m_commands.execute("show", "", false);
    m_commands.register_command("once", unregister_self, &m_commands); // may remove itself while it runs
    m_commands.execute("once", "", false);
    EXPECT_EQ((std::vector<std::string>{"second()", "once"}), g_runs);
    m_commands.unregister_command("show");
    m_commands.unregister_command(nullptr);
    // A name or a callback that is missing registers nothing.
    m_commands.register_command("", note_run, nullptr);
    m_commands.register_command("nothing", nullptr, nullptr);
    EXPECT_EQ(std::vector<std::string>{"set"}, commands_from(""));
}

TEST_F(CommandsTest, CompletionGoesThroughTheNamesWithAPrefixInNameOrderAndMayWrap) {
    for (char const *name : {"sv_gravity", "show", "quit", "s", "showfps", "Show"})
        add(name);
    EXPECT_EQ((std::vector<std::string>{"s", "set", "show", "showfps", "sv_gravity"}), commands_from("s"));
    EXPECT_EQ((std::vector<std::string>{"Show", "quit", "s", "set", "show", "showfps", "sv_gravity"}),
              commands_from(nullptr));
    // The last prefix asked for holds; the names wrap to its first when asked.
    EXPECT_STREQ("show", m_commands.find_first_command("sh"));
    EXPECT_EQ(nullptr, m_commands.find_next_command("showfps", false));
    EXPECT_STREQ("show", m_commands.find_next_command("showfps", true));
    EXPECT_STREQ("showfps", m_commands.find_next_command("showa", false)); // on from where it would stand
    EXPECT_EQ(nullptr, m_commands.find_first_command("x"));
    EXPECT_EQ(nullptr, m_commands.find_next_command("x", true)); // nothing of the prefix to wrap to
    // Asked again for the name it gave out last, the first name keeps the prefix that led there:
    // a console that completes a line and asks with the whole name goes round the names of "sh".
    EXPECT_STREQ("show", m_commands.find_first_command("sh"));
    EXPECT_STREQ("show", m_commands.find_first_command("show"));
    EXPECT_STREQ("showfps", m_commands.find_next_command("show", true));
    EXPECT_STREQ("showfps", m_commands.find_first_command("showfps"));
    EXPECT_STREQ("show", m_commands.find_next_command("showfps", true));

    // Variables complete by the same rules.
    for (char const *name : {"scr_resy", "scr_resx", "sv_cheats"})
        m_vars.set_var(name, "1");
    EXPECT_STREQ("scr_resx", m_vars.find_first_var("scr_res"));
    EXPECT_STREQ("scr_resy", m_vars.find_next_var("scr_resx", false));
    EXPECT_STREQ("scr_resx", m_vars.find_next_var("scr_resy", true));
}

TEST_F(CommandsTest, VariableNumbersFollowItsTextAndItsRecordStaysWhereItIs) {
    struct {
        char const *mp_text;
        int m_int;
        float m_float;
    } const rows[] = {{"1024", 1024, 1024.0f}, {"-3.75", -3, -3.75f}, {"12abc", 12, 12.0f},
                      {" 7", 7, 7.0f},         {"abc", 0, 0.0f},      {"", 0, 0.0f}};
    for (auto const &row : rows) {
        m_vars.set_var("v", row.mp_text);
        SVariable const *p_var = m_vars.find_var("v");
        ASSERT_NE(nullptr, p_var);
        EXPECT_STREQ(row.mp_text, p_var->mp_value);
        EXPECT_EQ(row.m_int, p_var->m_int_value) << row.mp_text;
        EXPECT_FLOAT_EQ(row.m_float, p_var->m_float_value) << row.mp_text;
    }
    SVariable const *p_v = m_vars.find_var("v");
    for (int i = 0; i < 100; ++i)
        m_vars.set_var(("v" + std::to_string(i)).c_str(), "x");
    m_vars.set_var("v", "2");
    EXPECT_EQ(p_v, m_vars.find_var("v"));
    m_vars.set_var(nullptr, "1");
    m_vars.set_var("nothing", nullptr);
    EXPECT_EQ(nullptr, m_vars.find_var(nullptr));
    EXPECT_EQ(nullptr, m_vars.find_var("V"));
    EXPECT_STREQ("", m_vars.find_var("nothing")->mp_value);
}

TEST_F(CommandsTest, SetCreatesAndChangesVariablesOrShowsItsUse) {
    EXPECT_TRUE(m_commands.execute("set", "scr_resx 1280", false));
    EXPECT_TRUE(m_commands.run_line("set  title   Hello world "));
    EXPECT_EQ(1280, m_vars.find_var("scr_resx")->m_int_value);
    EXPECT_STREQ("Hello world ", m_vars.find_var("title")->mp_value);
    EXPECT_TRUE(m_reports.reports().empty());
    for (char const *p_arguments : {"", "lonely", "lonely   "})
        m_commands.execute("set", p_arguments, false);
    EXPECT_EQ(std::vector<std::string>(3, "Use of command 'set':\nset <variable> <value>"),
              m_reports.warnings());
    EXPECT_EQ(nullptr, m_vars.find_var("lonely"));
}
