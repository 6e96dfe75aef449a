// The library's loggers against the host's log manager: prefixes, levels, narrow and wide
// formatting, and the logger that exists already.
#include "ui_logger.h"

#include "engine_interfaces.h"
#include "interface_server.h"
#include "log_manager.h"

#include <gtest/gtest.h>

using namespace qorui;

namespace {

class LoggerTest : public ::testing::Test {
protected:
    void SetUp() override {
        m_log.set_quiet(true);
        m_server.register_interface(&m_log);
        engine_interfaces().set_server(&m_server);
    }
    void TearDown() override { engine_interfaces().set_server(nullptr); }

    qorhost::CInterfaceServer m_server;
    qorhost::CLogManager m_log;
};

} // namespace

TEST(Logger, PrefixesAreFourCharactersAColonAndBlanksToSix) {
    EXPECT_STREQ("UI:   ", CLogger("a", "UI", false).get_prefix());
    EXPECT_STREQ(">:    ", CLogger("b", ">", false).get_prefix());
    EXPECT_STREQ("ABCD: ", CLogger("c", "ABCDEFG", false).get_prefix());
}

TEST_F(LoggerTest, LinesReachTheEngineWithTheirLevels) {
    CLogger logger("TestLogger", "T", false);
    unsigned const first = m_log.get_next_index();
    logger.log_message("value %d", 7);
    unsigned short const wide_format[] = {'%', 'S', '/', '%', 'c', 0};
    logger.log_warning(wide_format, "\xD0\x96", 'x');
    logger.log_error(static_cast<char const *>(nullptr)); // nothing
    ASSERT_EQ(first + 2, m_log.get_next_index());
    EXPECT_NE(std::string::npos, m_log.get_message_text(first).find("value 7"));
    EXPECT_NE(std::string::npos, m_log.get_message_text(first + 1).find("\xD0\x96/x"));
}

TEST_F(LoggerTest, AnExistingLoggerOfTheNameIsUsed) {
    ILogger *p_existing = m_log.create_logger("SharedLogger", "S:    ");
    CLogger logger("SharedLogger", "OTHER", false);
    logger.log_message("hello");
    EXPECT_EQ(p_existing, m_log.find_logger("SharedLogger"));
}
