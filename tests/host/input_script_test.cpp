// The input script: what each line means, and the messages for lines that mean nothing or whose
// numbers or files lie outside what a step can take.
#include "input_script.h"

#include <gtest/gtest.h>

using qorhost::CInputScript;

TEST(InputScript, EveryStepParsesWithCommentsAndBlankLines) {
    CInputScript script;
    std::string error;
    ASSERT_TRUE(script.parse("# a replay\n\nmove 1.5 -2\npress\npress 1\nrelease 1 # comment\nwheel -0.5\n"
                             "key_down 0xC0\nkey_down 65 3\nkey_up 0x41\nchar 97\nwait 3\nwait 250ms\n"
                             "screenshot shot.png\ncommand set scr_gamma 2\ntype ui_export a b.lua\n",
                             "test.script", error))
        << error;
    EXPECT_EQ(14u, script.get_steps_count());
}

// A bad line is named by its file and line; the largest numbers a step takes are good.
TEST(InputScript, BadLinesNameTheirFileAndLine) {
    struct {
        char const *mp_text;
        char const *mp_error; // null: the text is good
    } const rows[] = {
        {"move 1 1\njump 3\n", "test.script:2: unknown step 'jump'"},
        {"move 1\n", "test.script:1: 'move' takes 2 numbers"},
        {"press 1 2\n", "test.script:1: 'press' takes 0 to 1 numbers"},
        {"wheel x\n", "test.script:1: 'x' is no number"},
        {"wait\n", "test.script:1: 'wait' takes 1 numbers"},
        {"wait ms\n", "test.script:1: 'ms' is no number"},
        {"\n\nscreenshot\n", "test.script:3: 'screenshot' needs a file"},
        {"command   \n", "test.script:1: 'command' needs a line"},
        {"type\n", "test.script:1: 'type' needs a text"},
        {"wait -1", "test.script:1: '-1' is out of range for 'wait'"},
        {"wait 1e9", "test.script:1: '1e9' is out of range for 'wait'"},
        {"wait 1.5", "test.script:1: '1.5' is out of range for 'wait'"},
        {"wait 100000", nullptr},
        {"wait 86400000ms", nullptr},
        {"wait 90000000ms", "test.script:1: '90000000' is out of range for 'wait'"},
        {"press -1", "test.script:1: '-1' is out of range for 'press'"},
        {"release 16", "test.script:1: '16' is out of range for 'release'"},
        {"char 1e10", "test.script:1: '1e10' is out of range for 'char'"},
        {"char 0xFFFF", nullptr},
        {"key_down 0xC0 0x10000", "test.script:1: '0x10000' is out of range for 'key_down'"},
        {"move nan 0", "test.script:1: 'nan' is out of range for 'move'"},
        {"wheel -inf", "test.script:1: '-inf' is out of range for 'wheel'"},
        {"screenshot ../../x.png", "test.script:1: '../../x.png' lies outside the output folder"},
        {"screenshot shots/../../x.png", "test.script:1: 'shots/../../x.png' lies outside the output folder"},
        {"screenshot /tmp/x.png", "test.script:1: '/tmp/x.png' lies outside the output folder"},
        {"screenshot shots/..x.png", nullptr},
    };
    for (auto const &row : rows) {
        SCOPED_TRACE(row.mp_text);
        CInputScript script;
        std::string error;
        EXPECT_EQ(row.mp_error == nullptr, script.parse(row.mp_text, "test.script", error));
        EXPECT_EQ(row.mp_error ? row.mp_error : "", error);
    }
}

TEST(InputScript, AMissingFileIsReportedAndAFailedLoadKeepsNothing) {
    CInputScript script;
    std::string error;
    EXPECT_FALSE(script.load("/nonexistent/replay.script", error));
    EXPECT_EQ("cannot open the input script '/nonexistent/replay.script'", error);
    ASSERT_TRUE(script.parse("press\n", "a", error));
    EXPECT_FALSE(script.parse("press\nbad\n", "b", error));
    EXPECT_EQ(1u, script.get_steps_count());
}
