// The library's loggers against the test host's log manager: prefixes, narrow and wide formatting,
// and the logger that exists already.
#include "ui_logger.h"

#include "test_world.h"

#include <gtest/gtest.h>

using namespace qorui;

TEST(Logger, LinesReachTheEngineBehindTheirPrefix) {
    EXPECT_STREQ("ABCD: ",
                 CLogger("c", "ABCDEFG", false).get_prefix()); // four characters, a colon, blanks to six
    qortest::CWorld world;
    qorhost::CLogManager &log = world.host().log();
    unsigned const first = log.get_next_index();
    unsigned short const wide_format[] = {'%', 'S', '/', '%', 'c', 0};
    CLogger("TestLogger", "T", false).log_warning(wide_format, "\xD0\x96", 'x');
    ILogger *p_existing = log.create_logger("SharedLogger", "S:    ");
    CLogger("SharedLogger", "OTHER", false).log_error(static_cast<char const *>(nullptr)); // nothing
    ASSERT_EQ(first + 1, log.get_next_index());
    EXPECT_NE(std::string::npos, log.get_message_text(first).find("\xD0\x96/x"));
    EXPECT_EQ(p_existing, log.find_logger("SharedLogger")); // an existing logger of the name is used
}
