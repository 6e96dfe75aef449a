// The library's loggers against the test host's log manager, through the test world: prefixes, levels, narrow
// and wide formatting, and the logger that exists already.
#include "ui_logger.h"

#include "test_world.h"

#include <gtest/gtest.h>

using namespace qorui;

TEST(Logger, LinesReachTheEngineBehindTheirPrefix) {
    EXPECT_STREQ(">:    ", CLogger("b", ">", false).get_prefix()); // four characters, a colon, blanks to six
    EXPECT_STREQ("ABCD: ", CLogger("c", "ABCDEFG", false).get_prefix());
    qortest::CWorld world; // the library talks to the host's log
    qorhost::CLogManager &log = world.host().log();
    CLogger logger("TestLogger", "T", false);
    unsigned const first = log.get_next_index();
    logger.log_message("value %d", 7);
    unsigned short const wide_format[] = {'%', 'S', '/', '%', 'c', 0};
    logger.log_warning(wide_format, "\xD0\x96", 'x');
    logger.log_error(static_cast<char const *>(nullptr)); // nothing
    ASSERT_EQ(first + 2, log.get_next_index());
    EXPECT_NE(std::string::npos, log.get_message_text(first).find("value 7"));
    EXPECT_NE(std::string::npos, log.get_message_text(first + 1).find("\xD0\x96/x"));

    ILogger *p_existing = log.create_logger("SharedLogger", "S:    ");
    CLogger shared("SharedLogger", "OTHER", false); // an existing logger of the name is used
    shared.log_message("hello");
    EXPECT_EQ(p_existing, log.find_logger("SharedLogger"));
}
