// The input script: what each line means, and the messages for lines that mean nothing.
#include "input_script.h"

#include <gtest/gtest.h>

using qorhost::CInputScript;

namespace {

std::string error_of(char const *_p_text) {
    CInputScript script;
    std::string error;
    EXPECT_FALSE(script.parse(_p_text, "test.script", error)) << _p_text;
    return error;
}

} // namespace

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

TEST(InputScript, BadLinesNameTheirFileAndLine) {
    EXPECT_EQ("test.script:2: unknown step 'jump'", error_of("move 1 1\njump 3\n"));
    EXPECT_EQ("test.script:1: 'move' takes 2 numbers", error_of("move 1\n"));
    EXPECT_EQ("test.script:1: 'press' takes 0 to 1 numbers", error_of("press 1 2\n"));
    EXPECT_EQ("test.script:1: 'x' is no number", error_of("wheel x\n"));
    EXPECT_EQ("test.script:1: 'wait' takes 1 numbers", error_of("wait\n"));
    EXPECT_EQ("test.script:1: 'ms' is no number", error_of("wait ms\n"));
    EXPECT_EQ("test.script:3: 'screenshot' needs a file", error_of("\n\nscreenshot\n"));
    EXPECT_EQ("test.script:1: 'command' needs a line", error_of("command   \n"));
    EXPECT_EQ("test.script:1: 'type' needs a text", error_of("type\n"));
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
