// The developer console on the test host, driven through the service's listeners as the engine
// drives it: the log in the history, lines run, completed and recalled, the console key, geometry.
#include "ui.h"
#include "ui_console.h"

#include "qor_log.h"
#include "qorbase.h"
#include "test_host.h"
#include "test_support.h"
#include "test_world.h"
#include "ui_desktop.h"
#include "ui_edit_box.h"
#include "ui_value_bar.h"

#include <gtest/gtest.h>

using namespace qorui;

namespace {

typedef std::vector<std::string> lines_t;

unsigned const k_console_key = 0xC0;
unsigned const k_tab = 9, k_return = 13, k_up = 38, k_down = 40;

// What the commands of the test got, in order.
lines_t g_runs;
void note_run(char const *_arguments, void *) {
    g_runs.push_back(_arguments);
}

class ConsoleTest : public ::testing::Test {
protected:
    void SetUp() override {
        qortest::use_host_data_folders();
        use_gdf("[ui]\nconsole_pos = 50, 60\nconsole_size = 300, 200\n[ui_libraries]\n");
        service().init(false);
        for (char const *p_name : {"zq_alpha", "zq_beta"})
            host().commands().register_command(p_name, note_run, nullptr);
        for (char const *p_name : {"zv_gain", "zv_glow"})
            host().vars().set_var(p_name, "1");
        g_runs.clear();
        frame();
    }
    void TearDown() override {
        for (char const *p_name : {"zq_alpha", "zq_beta"})
            host().commands().unregister_command(p_name);
        service().shutdown();
        qorbase::set_gdf_path(nullptr);
    }
    void use_gdf(std::string const &_text) {
        qorbase::set_gdf_path(qortest::write_file(m_dir + "/qor.gdf", _text).c_str());
    }

    qorhost::CHost &host() { return qortest::shared_host(); }
    CUserInterface &service() { return *static_cast<CUserInterface *>(host().ui()); }
    CConsole &console() { return *service().get_console()->get_console(); }

    void frame() {
        service().update(16);
        service().draw();
    }
    void key(unsigned _vk) {
        service().on_key_down(_vk, 0);
        service().on_key_up(_vk);
    }
    void type(std::string const &_text) {
        for (char const c : _text)
            service().on_char(static_cast<unsigned char>(c));
    }
    // A line typed and run.
    void run(std::string const &_line) {
        type(_line);
        key(k_return);
    }
    // The command line; "<none>" while its text has no line.
    std::string line() {
        CString const *p_line = console().get_command()->get_text().get_string(0);
        return p_line ? p_line->get_c() : "<none>";
    }
    CText &history() { return console().get_history()->get_text(); }
    std::string history_line(unsigned _idx) { return history().get_string(_idx)->get_c(); }
    // The history's last line with text: the newest message, the last line being the caret's.
    std::string last_message() {
        CText &text = history();
        for (unsigned i = text.get_num_strings(); i > 0; --i)
            if (!text.get_string(i - 1)->empty()) return text.get_string(i - 1)->get_c();
        return "";
    }

    std::string m_dir = qortest::make_temp_dir();
};

} // namespace

TEST_F(ConsoleTest, TheLogOfEveryModuleShowsInTheHistoryAlsoWhileHidden) {
    ILogger *p_other = host().log().create_logger("OtherModule", "Other: ");
    p_other->write("a line of another module", 0);
    frame();
    EXPECT_EQ("a line of another module", last_message());
    unsigned const lines = history().get_num_strings();
    frame(); // nothing new: nothing shown again
    EXPECT_EQ(lines, history().get_num_strings());
    // Closed with a half-typed line: the line goes; what is logged meanwhile is there on opening.
    type("half typed");
    key(k_console_key);
    EXPECT_EQ("<none>", line());
    p_other->write("first meanwhile", 0);
    p_other->write("second meanwhile", 1);
    frame();
    key(k_console_key);
    unsigned const count = history().get_num_strings();
    ASSERT_GE(count, 3u);
    EXPECT_EQ("first meanwhile", history_line(count - 3));
    EXPECT_EQ("second meanwhile", history_line(count - 2));
    // Neither the console key's characters nor tab reach the line.
    type("a`b~c\td");
    EXPECT_EQ("abcd", line());
}

// What each line does: a command gets the arguments with their blank; a variable's name runs
// "set" with the whole line; an unknown name still goes to the command manager.
TEST_F(ConsoleTest, ALineRunsAsACommandOrSetsAVariable) {
    qortest::CReportCapture capture;
    run("zq_alpha one two");
    run("zq_beta");
    run("zv_gain 7");
    run("no_such 5");
    EXPECT_EQ((lines_t{" one two", ""}), g_runs);
    EXPECT_EQ(7, host().vars().find_var("zv_gain")->m_int_value);
    EXPECT_EQ((lines_t{"Unknown command 'no_such'"}), capture.warnings());
    EXPECT_EQ("<none>", line());
    frame(); // each line comes back to the history through the log
    unsigned const count = history().get_num_strings();
    EXPECT_EQ("zq_alpha one two", history_line(count - 5));
    EXPECT_EQ("no_such 5", last_message());

    // Return on an empty line runs nothing and keeps nothing for recall.
    unsigned const kept = console().get_commands_count();
    key(k_return);
    EXPECT_EQ(kept, console().get_commands_count());
    EXPECT_EQ(2u, g_runs.size());
}

TEST_F(ConsoleTest, TabCompletesCommandsBeforeVariablesAndGoesRound) {
    struct {
        char const *mp_typed; // typed on an empty line, then a tab for each expected line
        lines_t m_after_tabs;
    } const rows[] = {
        {"zq_", {"zq_alpha ", "zq_beta ", "zq_alpha "}},
        {"zq_b more args", {"zq_beta "}},               // the arguments go
        {"zv_g", {"zv_gain ", "zv_glow ", "zv_gain "}}, // no command starts so: variables
        {"zq_beta", {"zq_beta "}},                      // the last name of its own prefix
        {"nothing_like_it", {"nothing_like_it"}},
        {"", {"<none>"}}, // no line at all
    };
    for (auto const &row : rows) {
        SCOPED_TRACE(row.mp_typed);
        key(k_console_key); // closing clears the line
        key(k_console_key);
        type(row.mp_typed);
        for (std::string const &expected : row.m_after_tabs) {
            key(k_tab);
            EXPECT_EQ(expected, line());
            if (expected != "<none>") {
                EXPECT_EQ(static_cast<int>(expected.size()),
                          console().get_command()->get_text().get_caret_char());
            }
        }
    }
}

// The index moves after each recall and wraps at both ends.
TEST_F(ConsoleTest, UpAndDownRecallEarlierLinesAndWrap) {
    key(k_up); // nothing to recall
    EXPECT_EQ("<none>", line());
    for (char const *p_line : {"zq_alpha 1", "zq_alpha 2", "zq_alpha 3"})
        run(p_line);
    // The key, and the last digit of the line it recalls.
    std::pair<unsigned, char> const steps[] = {{k_up, '3'},   {k_up, '2'},   {k_up, '1'},  {k_up, '3'},
                                               {k_down, '2'}, {k_down, '3'}, {k_down, '1'}};
    int n = 0;
    for (auto const &step : steps) {
        key(step.first);
        EXPECT_EQ(std::string("zq_alpha ") + step.second, line()) << "step " << n++;
    }
}

// The recall list stands at one less than its bound; the history keeps its bound of lines, the
// last one the caret's, and older lines fall off the front.
TEST_F(ConsoleTest, BothListsKeepToTheirBounds) {
    for (unsigned i = 0; i < CConsole::mn_max_commands; ++i)
        run("zq_beta " + std::to_string(i));
    EXPECT_EQ(CConsole::mn_max_commands - 1, console().get_commands_count());
    key(k_down);
    EXPECT_EQ("zq_beta 1023", line());
    key(k_down); // wrapped to the oldest kept
    EXPECT_EQ("zq_beta 1", line());

    ILogger *p_other = host().log().create_logger("OtherModule", "Other: ");
    for (unsigned i = 0; i < 1100; ++i)
        p_other->write(("message " + std::to_string(i)).c_str(), 0);
    frame();
    ASSERT_EQ(CConsole::mn_max_history_strings, history().get_num_strings());
    EXPECT_EQ("message 77", history_line(0));
    EXPECT_EQ("message 1099", history_line(1022));
    EXPECT_TRUE(history().get_string(1023)->empty());
}

// A name or arguments too long for the narrow form break its contract, and the line is still
// handled in full: completed (here: nothing to offer) or run.
TEST_F(ConsoleTest, AVeryLongLineIsReportedAndStillHandled) {
    std::string const long_text(300, 'x');
    std::pair<std::string, unsigned> const rows[] = {{long_text, k_tab}, {"zq_alpha " + long_text, k_return}};
    for (auto const &row : rows) {
        SCOPED_TRACE(row.second);
        qortest::CReportCapture capture;
        type(row.first);
        key(row.second);
        ASSERT_FALSE(capture.asserts().empty());
        EXPECT_EQ(0u, capture.asserts()[0].find("Expression:   len < 256, \nFile: "));
        key(k_console_key); // closing clears the line
        key(k_console_key);
    }
    EXPECT_EQ((lines_t{" " + long_text}), g_runs);
}

// The console key hides the console only when it is the active window; otherwise it shows and
// activates it.
TEST_F(ConsoleTest, TheConsoleKeyShowsActivatesAndHides) {
    CDesktop *p_desktop = service().get_desktop();
    CWindowVisual *p_other = new CWindowVisual(p_desktop, "other");
    p_desktop->attach_child(p_other);
    for (int const step : {0, 1, 2}) { // shown and active, hidden, shown with another window active
        SCOPED_TRACE(step);
        if (step == 2) p_desktop->set_active_window(p_other);
        p_desktop->hide_pointer(); // opening brings the pointer back
        key(k_console_key);
        EXPECT_EQ(step == 0, console().is_hidden());
        EXPECT_EQ(step == 0, p_desktop->get_pointer().is_hidden());
        if (step != 0) {
            EXPECT_EQ(&console(), static_cast<CWindow *>(p_desktop->get_active_window()));
        }
    }

    service().shutdown();
    service().init(true); // closed from the start
    EXPECT_TRUE(console().is_hidden());
    EXPECT_NE(&console(), static_cast<CWindow *>(service().get_desktop()->get_active_window()));
}

// The console's geometry comes from the configuration at an import and goes back at shutdown; the
// history and the command line fill it, the command line two pixels below the history.
TEST_F(ConsoleTest, TheGeometryComesFromTheConfigurationAndTheBoxesFillIt) {
    host().commands().run_line("ui_import no_layout_here.lua");
    EXPECT_EQ("50,60 300x200", qortest::place_text(&console()));
    EXPECT_EQ("4,28 292x144", qortest::place_text(console().get_history()));
    EXPECT_EQ("4,174 292x20", qortest::place_text(console().get_command()));
    console().set_size(50, 50); // the console's least size is 128 by 128
    EXPECT_EQ("4,28 120x72", qortest::place_text(console().get_history()));
    EXPECT_EQ("4,102 120x20", qortest::place_text(console().get_command()));

    console().set_pos(70, 80);
    service().shutdown();
    std::vector<float> saved;
    for (char const *p_key : {"console_pos", "console_size"}) {
        vec2_t const value = qorbase::find_config_section("ui")->get_value(p_key, false)->get_vec2(0, 0);
        saved.insert(saved.end(), {value.x, value.y});
    }
    EXPECT_EQ((std::vector<float>{70, 80, 128, 128}), saved);
    service().init(false); // for TearDown
}

// The page keys move the history by one line step of its bar; a double click on the caption
// maximises the console and a second one gives it its place back.
TEST_F(ConsoleTest, PageKeysScrollTheHistoryAndADoubleClickMaximises) {
    ILogger *p_other = host().log().create_logger("OtherModule", "Other: ");
    for (unsigned i = 0; i < 100; ++i)
        p_other->write("a line", 0);
    frame();
    CScrollBar *p_bar = console().get_history()->get_scroll_bar_vert();
    ASSERT_FALSE(p_bar->is_hidden());
    float const end = p_bar->get_position();
    EXPECT_EQ(p_bar->get_max(), end); // new lines scroll to the end
    key(33);
    EXPECT_EQ(end - p_bar->get_small_step(), p_bar->get_position());
    key(34);
    EXPECT_EQ(end, p_bar->get_position());

    service().on_pointer_move(vec2_t{0, 0}); // the pointer is placed at its first movement
    point_t const at = service().get_desktop()->get_pointer_pos();
    service().on_pointer_move(vec2_t{static_cast<float>(60 - at.x), static_cast<float>(15 - at.y)});
    for (bool const maximised : {true, false}) {
        SCOPED_TRACE(maximised);
        for (int click = 0; click < 2; ++click) {
            service().on_button_down(0);
            service().on_button_up(0);
        }
        EXPECT_EQ(maximised, console().is_maximaized());
        host().clock().advance_ms(CDesktop::DOUBLE_CLICK_TIME); // the next click starts anew
    }
    EXPECT_EQ(0, console().get_pos().x);
    EXPECT_EQ(128, console().get_w());
}
